#include "host/Server.h"

#include <microhttpd.h>

#include <cstring>
#include <exception>
#include <new>
#include <utility>

#include "host/Exchange.h"
#include "host/Failure.h"

namespace host {

namespace {

// A quarter of what a main thread has; 512 of them fit a 32-bit address space.
constexpr std::size_t stackSize = 2 * 1024 * 1024;

// The library closes a connection beyond its limit at once, so its limit stays above ours: a client
// that finds all places taken waits with the system. That is why this server accepts by itself.
constexpr unsigned placesInPassing = 16;

Connection* connectionOf(MHD_Connection* connection) {
    const auto* info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_SOCKET_CONTEXT);
    return static_cast<Connection*>(info->socket_context);
}

const char* headerOf(MHD_Connection* connection, const char* name) {
    return MHD_lookup_connection_value(connection, MHD_HEADER_KIND, name);
}

struct HeaderReader {
    Source& source;
    bool ranOutOfMemory = false;
};

// No exception may pass the HTTP library, which calls this.
MHD_Result takeHeader(void* context, MHD_ValueKind, const char* name, const char* value) {
    auto& reader = *static_cast<HeaderReader*>(context);
    try {
        reader.source.takeHeader(name, value == nullptr ? "" : value);
        return MHD_YES;
    } catch (const std::bad_alloc&) {
        reader.ranOutOfMemory = true;
        return MHD_NO;
    }
}

// The address of this machine that the client has connected to; empty when it is unknown.
std::string localAddressOf(MHD_Connection* connection) {
    const auto* info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CONNECTION_FD);
    return localAddress(info->connect_fd);
}

std::string remoteAddressOf(MHD_Connection* connection) {
    const auto* info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CONNECTION_FD);
    return remoteAddress(info->connect_fd);
}

Source sourceOf(MHD_Connection* connection, const char* method) {
    Source source;
    source.method = method;
    source.localAddress = localAddressOf(connection);
    HeaderReader reader{source};
    MHD_get_connection_values(connection, MHD_HEADER_KIND, takeHeader, &reader);
    if (reader.ranOutOfMemory) {
        throw std::bad_alloc();
    }
    return source;
}

// The body is sent from where it lies: the exchange outlives the response.
MHD_Result send(MHD_Connection* connection, const Exchange& exchange, bool isLast) {
    const ws_Request& answer = exchange.response();
    const std::unique_ptr<MHD_Response, decltype(&MHD_destroy_response)> response(
        MHD_create_response_from_buffer(
            answer.output.size(), const_cast<char*>(answer.output.data()), MHD_RESPMEM_PERSISTENT),
        MHD_destroy_response);
    const auto addHeader = [&](const char* name, const char* value) {
        return MHD_add_response_header(response.get(), name, value) == MHD_YES;
    };
    if (!response) {
        return MHD_NO;
    }
    if (!answer.type.empty() && !addHeader(MHD_HTTP_HEADER_CONTENT_TYPE, answer.type.c_str())) {
        return MHD_NO;
    }
    if (isLast && !addHeader(MHD_HTTP_HEADER_CONNECTION, "close")) {
        return MHD_NO;
    }
    for (const Header& header : exchange.headers()) {
        if (!addHeader(header.name, header.value.c_str())) {
            return MHD_NO;
        }
    }
    return MHD_queue_response(connection, static_cast<unsigned>(answer.code), response.get());
}

}  // namespace

// What the HTTP library calls. It is C: no exception may reach it. MHD_NO drops the connection.
struct Server::Callbacks {
    static void onConnection(void* context, MHD_Connection* connection, void** connectionContext,
                             MHD_ConnectionNotificationCode code) {
        Connections& connections = static_cast<Server*>(context)->connections;
        countConnection(static_cast<Server*>(context)->site.metrics(), code);
        if (code == MHD_CONNECTION_NOTIFY_CLOSED) {
            connections.remove(static_cast<Connection*>(*connectionContext));
            return;
        }
        const auto* info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CONNECTION_FD);
        *connectionContext = connections.add(info->connect_fd);
    }

    static void countConnection(Metrics* metrics, MHD_ConnectionNotificationCode code) {
        if (metrics == nullptr) {
            return;
        }
        if (code == MHD_CONNECTION_NOTIFY_CLOSED) {
            metrics->countClosedConnection();
        } else {
            metrics->countOpenedConnection();
        }
    }

    // The first line of a request is here. The result becomes the request's first state: none.
    static void* onRequestLine(void*, const char*, MHD_Connection* connection) {
        if (Connection* client = connectionOf(connection)) {
            client->waitForClient();
        }
        return nullptr;
    }

    // Leaves the path as it came, so that an escaped slash is not taken for a separator.
    static std::size_t keepEscapes(void*, MHD_Connection*, char* text) { return std::strlen(text); }

    // Called with the head of a request, then with each piece of its body, then at its end.
    static MHD_Result onRequest(void* context, MHD_Connection* connection, const char* path,
                                const char* method, const char*, const char* data,
                                std::size_t* size, void** state) {
        Server& server = *static_cast<Server*>(context);
        const auto exchange = static_cast<Exchange*>(*state);
        try {
            if (exchange == nullptr) {
                return begin(server, connection, path, method, state);
            }
            if (*size == 0) {
                return end(server, connection, *exchange);
            }
            const std::size_t taken = *size;
            *size = 0;
            return exchange->take(data, taken) ? MHD_YES : MHD_NO;
        } catch (const std::exception&) {
            return MHD_NO;
        }
    }

    static MHD_Result begin(Server& server, MHD_Connection* connection, const char* path,
                            const char* method, void** state) {
        Connection* client = connectionOf(connection);
        if (client == nullptr) {
            return MHD_NO;
        }
        client->waitForClient();
        auto* exchange = new Exchange(server.gate, server.settings.maxBody, &server.site);
        *state = exchange;
        exchange->admit(server.policy.judge(sourceOf(connection, method)));
        exchange->begin(server.settings.tls && server.settings.passTransport ? "https" : "http",
                        method, path, headerOf(connection, MHD_HTTP_HEADER_CONTENT_LENGTH));
        if (exchange->isForSite()) {
            exchange->describeToSite(headerOf(connection, MHD_HTTP_HEADER_IF_NONE_MATCH),
                                     isLoopback(remoteAddressOf(connection)));
        }
        // A client that asks before it sends a body can be spared sending it.
        const bool asksFirst = headerOf(connection, MHD_HTTP_HEADER_EXPECT) != nullptr;
        return exchange->isAnswered() && asksFirst ? end(server, connection, *exchange) : MHD_YES;
    }

    static MHD_Result end(Server& server, MHD_Connection* connection, Exchange& exchange) {
        Connection* client = connectionOf(connection);
        client->workForClient();
        exchange.run(server.plugin);
        client->waitForClient();
        return send(connection, exchange, server.gate.isClosed());
    }

    static void onEnd(void*, MHD_Connection* connection, void** state, MHD_RequestTerminationCode) {
        delete static_cast<Exchange*>(*state);
        *state = nullptr;
        if (Connection* client = connectionOf(connection)) {
            client->waitForClient();
        }
    }
};

Server::Server(const Plugin& plugin, ListenSocket& socket, ServerSettings wanted,
               const OriginPolicy& policy, const Site& site)
    : plugin(plugin),
      socket(socket),
      settings(std::move(wanted)),
      policy(policy),
      site(site),
      connections(settings.threads, settings.timeout),
      daemon(startDaemon(), MHD_stop_daemon) {
    if (!daemon) {
        throw Failure(
            settings.tls ? "HTTPS cannot be served with these files. Name a certificate in PEM "
                           "form with --tls-cert and the private key that belongs to it with "
                           "--tls-key."
                         : "The HTTP server cannot start. Free memory or threads of this machine.");
    }
    socket.listen();
    acceptor = std::thread([this] { acceptClients(); });
}

MHD_Daemon* Server::startDaemon() {
    const unsigned flags = MHD_USE_INTERNAL_POLLING_THREAD | MHD_USE_THREAD_PER_CONNECTION |
                           MHD_USE_POLL | MHD_USE_ITC | MHD_USE_NO_LISTEN_SOCKET |
                           (settings.tls ? MHD_USE_TLS : 0);
    MHD_OptionItem tlsOptions[] = {
        {MHD_OPTION_HTTPS_MEM_CERT, 0, const_cast<char*>(settings.tlsCertificate.c_str())},
        {MHD_OPTION_HTTPS_MEM_KEY, 0, const_cast<char*>(settings.tlsKey.c_str())},
        {MHD_OPTION_END, 0, nullptr}};
    return MHD_start_daemon(flags, 0, nullptr, nullptr, Callbacks::onRequest, this,           //
                            MHD_OPTION_CONNECTION_LIMIT, settings.threads + placesInPassing,  //
                            MHD_OPTION_THREAD_STACK_SIZE, stackSize,                          //
                            MHD_OPTION_SIGPIPE_HANDLED_BY_APP, 1,                             //
                            MHD_OPTION_NOTIFY_CONNECTION, Callbacks::onConnection, this,      //
                            MHD_OPTION_URI_LOG_CALLBACK, Callbacks::onRequestLine, this,      //
                            MHD_OPTION_UNESCAPE_CALLBACK, Callbacks::keepEscapes, this,       //
                            MHD_OPTION_NOTIFY_COMPLETED, Callbacks::onEnd, this,              //
                            MHD_OPTION_ARRAY, settings.tls ? tlsOptions : &tlsOptions[2],
                            MHD_OPTION_END);
}

Server::~Server() {
    stopAccepting();
}

void Server::acceptClients() noexcept {
    while (connections.waitForPlace()) {
        sockaddr_storage address;
        socklen_t length;
        const int client = socket.accept(address, length);
        if (client >= 0) {
            MHD_add_connection(daemon.get(), client, reinterpret_cast<sockaddr*>(&address), length);
        }
    }
}

void Server::shutOverdueConnections() noexcept {
    connections.shutOverdue();
}

void Server::stopAccepting() {
    gate.close();
    connections.close();
    socket.stopListening();
    if (acceptor.joinable()) {
        acceptor.join();
    }
}

bool Server::waitForRequests(std::chrono::milliseconds time) {
    return gate.waitUntilEmpty(time);
}

}  // namespace host

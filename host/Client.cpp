#include "host/Client.h"

#include <microhttpd.h>
#include <sys/epoll.h>
#include <sys/select.h>
#include <unistd.h>

#include <cstring>
#include <exception>
#include <memory>
#include <new>
#include <utility>

#include "host/Exchange.h"

namespace host {

namespace {

// Of memory for each connection, which the library clears after each request: the less, the faster
// is that. Half of it is for reading; a request's head may take nearly all.
constexpr std::size_t connectionMemory = 16 * 1024;

const char* headerOf(MHD_Connection* connection, const char* name) {
    return MHD_lookup_connection_value(connection, MHD_HEADER_KIND, name);
}

struct HeaderReader {
    Source& source;
    bool ranOutOfMemory = false;
};

// No exception may pass the HTTP library, which calls this.
MHD_Result takeHeader(void* context, MHD_ValueKind, const char* name, std::size_t nameSize,
                      const char* value, std::size_t valueSize) {
    auto& reader = *static_cast<HeaderReader*>(context);
    try {
        reader.source.takeHeader({name, nameSize}, {value, valueSize});
        return MHD_YES;
    } catch (const std::bad_alloc&) {
        reader.ranOutOfMemory = true;
        return MHD_NO;
    }
}

std::string remoteAddressOf(MHD_Connection* connection) {
    const auto* info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CONNECTION_FD);
    return remoteAddress(info->connect_fd);
}

// The texts are valid as long as the request lasts.
Source sourceOf(MHD_Connection* connection, const char* method, const std::string& localAddress) {
    Source source;
    source.method = method;
    source.localAddress = localAddress;
    HeaderReader reader{source};
    MHD_get_connection_values_n(connection, MHD_HEADER_KIND, takeHeader, &reader);
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
struct Client::Callbacks {
    static void onConnection(void* context, MHD_Connection*, void**,
                             MHD_ConnectionNotificationCode code) {
        auto& client = *static_cast<Client*>(context);
        client.isOpen = code == MHD_CONNECTION_NOTIFY_STARTED;
        if (!client.isOpen) {
            // From here on the number of the socket may be another one's.
            client.service.connections.remove(client.place);
            client.place = nullptr;
        }
    }

    // The first line of a request is here. The result becomes the request's first state: none.
    static void* onRequestLine(void* context, const char*, MHD_Connection*) {
        static_cast<Client*>(context)->place->waitForClient();
        return nullptr;
    }

    // Leaves the path as it came, so that an escaped slash is not taken for a separator.
    static std::size_t keepEscapes(void*, MHD_Connection*, char* text) { return std::strlen(text); }

    // Called with the head of a request, then with each piece of its body, then at its end.
    static MHD_Result onRequest(void* context, MHD_Connection* connection, const char* path,
                                const char* method, const char*, const char* data,
                                std::size_t* size, void** state) {
        Client& client = *static_cast<Client*>(context);
        const auto exchange = static_cast<Exchange*>(*state);
        try {
            if (exchange == nullptr) {
                return begin(client, connection, path, method, state);
            }
            if (*size == 0) {
                return end(client, connection, *exchange);
            }
            const std::size_t taken = *size;
            *size = 0;
            return exchange->take(data, taken) ? MHD_YES : MHD_NO;
        } catch (const std::exception&) {
            return MHD_NO;
        }
    }

    static MHD_Result begin(Client& client, MHD_Connection* connection, const char* path,
                            const char* method, void** state) {
        const Service& service = client.service;
        const ServerSettings& settings = service.settings;
        client.place->waitForClient();
        auto* exchange = new Exchange(service.gate, settings.maxBody, &service.site);
        *state = exchange;
        exchange->admit(service.policy.judge(sourceOf(connection, method, client.localAddress)));
        exchange->begin(settings.tls && settings.passTransport ? "https" : "http", method, path,
                        headerOf(connection, MHD_HTTP_HEADER_CONTENT_LENGTH));
        if (exchange->isForSite()) {
            exchange->describeToSite(headerOf(connection, MHD_HTTP_HEADER_IF_NONE_MATCH),
                                     isLoopback(remoteAddressOf(connection)));
        }
        // A client that asks before it sends a body can be spared sending it.
        const bool asksFirst = headerOf(connection, MHD_HTTP_HEADER_EXPECT) != nullptr;
        return exchange->isAnswered() && asksFirst ? end(client, connection, *exchange) : MHD_YES;
    }

    static MHD_Result end(Client& client, MHD_Connection* connection, Exchange& exchange) {
        client.place->workForClient();
        exchange.run(client.service.plugin);
        client.place->waitForClient();
        return send(connection, exchange, client.service.gate.isClosed());
    }

    static void onEnd(void* context, MHD_Connection*, void** state, MHD_RequestTerminationCode) {
        delete static_cast<Exchange*>(*state);
        *state = nullptr;
        static_cast<Client*>(context)->place->waitForClient();
    }
};

Client::Client(const Service& service, int socket, const sockaddr_storage& address,
               socklen_t length)
    : service(service),
      address(address),
      addressLength(length),
      localAddress(host::localAddress(socket)),
      place(service.connections.add(socket)),
      socket(socket),
      watched(socket),
      awaited(EPOLLIN) {
    if (Metrics* metrics = service.site.metrics()) {
        metrics->countOpenedConnection();
    }
}

Client::~Client() {
    if (daemon != nullptr) {
        MHD_stop_daemon(daemon);
    }
    service.connections.remove(place);
    if (daemon == nullptr) {
        close(socket);
    }
    if (Metrics* metrics = service.site.metrics()) {
        metrics->countClosedConnection();
    }
}

bool Client::canServe(const Service& service) noexcept {
    MHD_Daemon* const probe = startDaemon(service, nullptr, true);
    if (probe != nullptr) {
        MHD_stop_daemon(probe);
    }
    return probe != nullptr;
}

// inSet: with an epoll set of its own for the socket.
MHD_Daemon* Client::startDaemon(const Service& service, Client* client, bool inSet) noexcept {
    const ServerSettings& settings = service.settings;
    const unsigned flags = MHD_USE_TURBO | MHD_USE_NO_LISTEN_SOCKET | (inSet ? MHD_USE_EPOLL : 0) |
                           (settings.tls ? MHD_USE_TLS : 0);
    MHD_OptionItem tlsOptions[] = {
        {MHD_OPTION_HTTPS_MEM_CERT, 0, const_cast<char*>(settings.tlsCertificate.c_str())},
        {MHD_OPTION_HTTPS_MEM_KEY, 0, const_cast<char*>(settings.tlsKey.c_str())},
        {MHD_OPTION_END, 0, nullptr}};
    return MHD_start_daemon(
        flags, 0, nullptr, nullptr, Callbacks::onRequest, client, MHD_OPTION_CONNECTION_LIMIT, 1u,
        MHD_OPTION_CONNECTION_MEMORY_LIMIT, connectionMemory, MHD_OPTION_SIGPIPE_HANDLED_BY_APP, 1,
        MHD_OPTION_NOTIFY_CONNECTION, Callbacks::onConnection, client, MHD_OPTION_URI_LOG_CALLBACK,
        Callbacks::onRequestLine, client, MHD_OPTION_UNESCAPE_CALLBACK, Callbacks::keepEscapes,
        client, MHD_OPTION_NOTIFY_COMPLETED, Callbacks::onEnd, client, MHD_OPTION_ARRAY,
        settings.tls ? tlsOptions : &tlsOptions[2], MHD_OPTION_END);
}

// Hands the socket over to an instance of the library. It takes the socket in at its first run.
// Given an fd_set of what is ready, the library needs no epoll_wait of its own. An fd_set holds
// only descriptors below FD_SETSIZE.
bool Client::begin() noexcept {
    const bool inSet = socket >= FD_SETSIZE;
    daemon = startDaemon(service, this, inSet);
    if (daemon == nullptr) {
        return false;
    }
    if (inSet) {
        watched = MHD_get_daemon_info(daemon, MHD_DAEMON_INFO_EPOLL_FD)->epoll_fd;
    }
    const auto* peer = reinterpret_cast<const sockaddr*>(&address);
    return MHD_add_connection(daemon, socket, peer, addressLength) == MHD_YES;
}

// The library says by a timeout of 0 that it has more to do.
bool Client::serve() noexcept {
    if (place == nullptr || (daemon == nullptr && !begin())) {
        return false;
    }
    MHD_UNSIGNED_LONG_LONG timeout = 0;
    run(awaited);
    while (isOpen && MHD_get_timeout(daemon, &timeout) == MHD_YES && timeout == 0) {
        run(0);
    }
    updateAwaited();
    return isOpen;
}

// ready: what the socket is ready for, events of epoll.
void Client::run(std::uint32_t ready) noexcept {
    if (!watchesSocket()) {
        MHD_run(daemon);
        return;
    }
    fd_set sets[3] = {};
    if ((ready & EPOLLIN) != 0) {
        FD_SET(socket, &sets[0]);
    }
    if ((ready & EPOLLOUT) != 0) {
        FD_SET(socket, &sets[1]);
    }
    MHD_run_from_select(daemon, &sets[0], &sets[1], &sets[2]);
}

void Client::updateAwaited() noexcept {
    if (!isOpen || !watchesSocket()) {
        return;
    }
    fd_set sets[3] = {};
    int most = -1;
    MHD_get_fdset(daemon, &sets[0], &sets[1], &sets[2], &most);
    awaited = FD_ISSET(socket, &sets[0]) ? EPOLLIN : 0u;
    awaited |= FD_ISSET(socket, &sets[1]) ? EPOLLOUT : 0u;
}

}  // namespace host

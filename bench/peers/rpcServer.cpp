// A peer for the benchmark: libjson-rpc-cpp with two threads, without checks and without a driver.
//
// Usage: qitrmc-bench-rpc-server PORT VALUE. Answers getProperty with the value. Prints the same
// line as the host, and runs until its standard input ends.

#include <jsonrpccpp/server.h>
#include <jsonrpccpp/server/connectors/httpserver.h>

#include <cstdio>
#include <cstdlib>

namespace {

class Peer : public jsonrpc::AbstractServer<Peer> {
  public:
    Peer(jsonrpc::AbstractServerConnector& connector, double value)
        : AbstractServer(connector, jsonrpc::JSONRPC_SERVER_V2), value(value) {
        const jsonrpc::Procedure procedure("getProperty", jsonrpc::PARAMS_BY_NAME,
                                           jsonrpc::JSON_OBJECT, "session_id", jsonrpc::JSON_STRING,
                                           "devices", jsonrpc::JSON_ARRAY, "property",
                                           jsonrpc::JSON_STRING, nullptr);
        bindAndAddMethod(procedure, &Peer::getProperty);
    }

  private:
    void getProperty(const Json::Value&, Json::Value& result) { result["value"] = value; }

    const double value;
};

}  // namespace

int main(int count, char** arguments) {
    if (count != 3) {
        std::fprintf(stderr, "usage: %s PORT VALUE\n", arguments[0]);
        return 2;
    }
    jsonrpc::HttpServer connector(std::atoi(arguments[1]), "", "", 2);
    Peer peer(connector, std::atof(arguments[2]));
    if (!peer.StartListening()) {
        std::fprintf(stderr, "cannot listen\n");
        return 1;
    }
    std::printf("Listening on http://127.0.0.1:%s/qitrmc/Call\n", arguments[1]);
    std::fflush(stdout);
    while (std::getchar() != EOF) {
    }
    peer.StopListening();
    return 0;
}

// The reference for the whole service: an HTTP server with the same library as the development
// host, which responds to every POST with one fixed text.
//
// Usage: qitrmc-bench-bare-server TEXT loop|threads. With "loop" two threads serve all connections,
// the library's fastest mode; with "threads" each connection has one. Prints the same line as the
// host, and runs until its standard input ends.

#include <microhttpd.h>

#include <cstdio>
#include <cstring>

namespace {

MHD_Result answer(void* text, MHD_Connection* connection, const char*, const char*, const char*,
                  const char*, std::size_t* bodySize, void** state) {
    static int begun;
    if (*state == nullptr) {
        *state = &begun;
        return MHD_YES;
    }
    if (*bodySize != 0) {
        *bodySize = 0;
        return MHD_YES;
    }
    MHD_Response* response =
        MHD_create_response_from_buffer(std::strlen(static_cast<char*>(text)), text,  //
                                        MHD_RESPMEM_PERSISTENT);
    MHD_add_response_header(response, "Content-Type", "application/json; charset=utf-8");
    const MHD_Result result = MHD_queue_response(connection, MHD_HTTP_OK, response);
    MHD_destroy_response(response);
    return result;
}

MHD_Daemon* startLoop(char* text) {
    return MHD_start_daemon(MHD_USE_EPOLL_INTERNAL_THREAD | MHD_USE_TURBO, 0, nullptr, nullptr,
                            answer, text, MHD_OPTION_THREAD_POOL_SIZE, 2u, MHD_OPTION_END);
}

MHD_Daemon* startThreads(char* text) {
    return MHD_start_daemon(
        MHD_USE_INTERNAL_POLLING_THREAD | MHD_USE_THREAD_PER_CONNECTION | MHD_USE_POLL, 0, nullptr,
        nullptr, answer, text, MHD_OPTION_END);
}

}  // namespace

int main(int count, char** arguments) {
    if (count != 3) {
        std::fprintf(stderr, "usage: %s TEXT loop|threads\n", arguments[0]);
        return 2;
    }
    MHD_Daemon* const daemon = std::strcmp(arguments[2], "loop") == 0 ? startLoop(arguments[1])
                                                                      : startThreads(arguments[1]);
    if (daemon == nullptr) {
        std::fprintf(stderr, "cannot listen\n");
        return 1;
    }
    std::printf("Listening on http://127.0.0.1:%u/qitrmc/Call\n",
                unsigned{MHD_get_daemon_info(daemon, MHD_DAEMON_INFO_BIND_PORT)->port});
    std::fflush(stdout);
    while (std::getchar() != EOF) {
    }
    MHD_stop_daemon(daemon);
    return 0;
}

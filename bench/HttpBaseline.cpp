/**
 * Answers every HTTP request with the content of a file, with the HTTP library of cimhost serve. The speed of cimhost
 * serve is compared with this baseline. Usage: http_baseline FILE. Prints its URL.
 */
#include <microhttpd.h>

#include <csignal>
#include <cstdio>
#include <fstream>
#include <iterator>
#include <string>

namespace {

MHD_Result answer(void* content, MHD_Connection* connection, const char*, const char*, const char*, const char*,
                  size_t* size, void** context) {
    if (*context == nullptr || *size != 0) {  // called for the head or for a part of the body
        *context = content;
        *size = 0;
        return MHD_YES;
    }
    auto& bytes = *static_cast<std::string*>(content);
    MHD_Response* response = MHD_create_response_from_buffer(bytes.size(), bytes.data(), MHD_RESPMEM_PERSISTENT);
    MHD_add_response_header(response, "Content-Type", "application/xml; charset=\"utf-8\"");
    const MHD_Result result = MHD_queue_response(connection, MHD_HTTP_OK, response);
    MHD_destroy_response(response);
    return result;
}

}  // namespace

int main(int count, char** arguments) {
    std::ifstream file(count == 2 ? arguments[1] : "", std::ios::binary);
    std::string content{std::istreambuf_iterator<char>(file), {}};
    sigset_t signals;
    sigemptyset(&signals);
    sigaddset(&signals, SIGTERM);
    pthread_sigmask(SIG_BLOCK, &signals, nullptr);
    MHD_Daemon* daemon = content.empty()
                             ? nullptr
                             : MHD_start_daemon(MHD_USE_INTERNAL_POLLING_THREAD | MHD_USE_THREAD_PER_CONNECTION |
                                                    MHD_USE_ITC | MHD_USE_POLL,
                                                0, nullptr, nullptr, &answer, &content, MHD_OPTION_END);
    if (daemon == nullptr) {
        std::fputs("usage: http_baseline FILE\n", stderr);
        return 2;
    }
    std::printf("http://127.0.0.1:%u\n", MHD_get_daemon_info(daemon, MHD_DAEMON_INFO_BIND_PORT)->port);
    std::fflush(stdout);
    int signal = 0;
    sigwait(&signals, &signal);
    MHD_stop_daemon(daemon);
    return 0;
}

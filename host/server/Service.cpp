#include "server/Service.h"

#include <arpa/inet.h>
#include <sys/socket.h>
#include <systemd/sd-daemon.h>

#include <algorithm>
#include <array>
#include <csignal>
#include <cstdlib>
#include <memory>
#include <system_error>

#include "server/AccessLog.h"
#include "server/Certificates.h"
#include "server/HttpServer.h"
#include "server/Sockets.h"

namespace cimhost::server {
namespace {

sigset_t awaitedSignals() {
    sigset_t signals;
    sigemptyset(&signals);
    for (const int each : {SIGTERM, SIGINT, SIGHUP}) {
        sigaddset(&signals, each);
    }
    return signals;
}

Listener listenerOf(int descriptor, const std::string& name) {
    Listener listener;
    sockaddr_storage storage{};
    socklen_t size = sizeof storage;
    std::array<char, INET6_ADDRSTRLEN> address{};
    if (::getsockname(descriptor, reinterpret_cast<sockaddr*>(&storage), &size) == 0) {
        const auto& four = reinterpret_cast<const sockaddr_in&>(storage);
        const auto& six = reinterpret_cast<const sockaddr_in6&>(storage);
        const bool isSix = storage.ss_family == AF_INET6;
        ::inet_ntop(storage.ss_family, isSix ? static_cast<const void*>(&six.sin6_addr) : &four.sin_addr,
                    address.data(), address.size());
        listener.port = ntohs(isSix ? six.sin6_port : four.sin_port);
    }
    listener.address = address.data();
    listener.tls = name.rfind("tls", 0) == 0;
    listener.descriptor = descriptor;
    return listener;
}

void reload(Certificates* certificates, AccessLog& log) {
    ::sd_notify(0, "RELOADING=1");
    log.reopen();
    try {
        if (certificates != nullptr) {
            certificates->reload();
        }
        log.write("reloaded");
    } catch (const std::exception& error) {
        log.write(std::string("the old certificate remains in use: ") + error.what());
    }
    ::sd_notify(0, "READY=1");
}

/** @return whether all operations have ended */
bool stop(HttpServer& server, const Limits& limits, const AccessLog& log) {
    ::sd_notify(0, "STOPPING=1");
    log.write("stopping");
    const bool isIdle = server.drain(limits.stopTime);
    if (!isIdle) {
        log.write("operations still run after " + std::to_string(limits.stopTime.count()) +
                  " seconds; the server ends without cleaning up the providers");
    }
    return isIdle;
}

}  // namespace

void blockSignals() {
    const sigset_t signals = awaitedSignals();
    ::pthread_sigmask(SIG_BLOCK, &signals, nullptr);
}

std::vector<Listener> activatedListeners() {
    char** names = nullptr;
    const int count = ::sd_listen_fds_with_names(1, &names);
    std::vector<Listener> listeners;
    for (int i = 0; i < count; ++i) {
        listeners.push_back(listenerOf(SD_LISTEN_FDS_START + i, names[i]));
        std::free(names[i]);
    }
    std::free(names);
    return listeners;
}

void serve(const Settings& settings, cimxml::Operations& operations, Authenticator& authenticator,
           const std::function<void(const std::string&)>& announce) {
    checkSettings(settings);
    requireOpenFiles(settings.limits.connections, settings.listeners.size());
    const bool usesTls = std::any_of(settings.listeners.begin(), settings.listeners.end(),
                                     [](const Listener& each) { return each.tls; });
    const auto certificates = usesTls ? std::make_unique<Certificates>(settings.certificate, settings.key) : nullptr;
    AccessLog log(settings.accessLog);
    RequestHandler handler(settings, operations, authenticator, log);
    auto server = std::make_unique<HttpServer>(settings, handler, certificates.get());
    for (const Listener& each : server->listeners()) {
        announce("listening on " + each.url());
    }
    ::sd_notify(0, "READY=1");
    const sigset_t signals = awaitedSignals();
    for (int signal = 0; signal != SIGTERM && signal != SIGINT;) {
        if (::sigwait(&signals, &signal) == 0 && signal == SIGHUP) {
            reload(certificates.get(), log);
        }
    }
    if (!stop(*server, settings.limits, log)) {
        std::_Exit(EXIT_FAILURE);  // running requests use all of these objects
    }
}

}  // namespace cimhost::server

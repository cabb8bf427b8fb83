#pragma once

#include <microhttpd.h>

#include <chrono>
#include <condition_variable>
#include <memory>
#include <mutex>
#include <thread>
#include <vector>

#include "server/Certificates.h"
#include "server/ConnectionTable.h"
#include "server/RequestHandler.h"
#include "server/Settings.h"

namespace cimhost::server {

/**
 * Receives requests over HTTP. Each connection has a thread, so that a slow client, a slow provider and the delay after
 * a failed authentication affect one connection only.
 */
class HttpServer {
public:
    /**
     * Listens on all addresses of the settings.
     * @param itsCertificates null without TLS
     * @throws SettingsError if an address cannot be used
     */
    HttpServer(const Settings& itsSettings, RequestHandler& itsHandler, const Certificates* itsCertificates);

    /** Ends all connections. */
    ~HttpServer();
    HttpServer(const HttpServer&) = delete;
    HttpServer& operator=(const HttpServer&) = delete;

    /** The addresses, with the port that the system has chosen instead of port 0. */
    std::vector<Listener> listeners() const;

    /**
     * Stops accepting connections and requests, and waits for running requests. If they take longer than the time,
     * ends all connections.
     * @return false if operations still run two seconds after that
     */
    bool drain(std::chrono::milliseconds time);

    std::size_t connections() const { return table.size(); }

private:
    struct Endpoint;

    void listen(const Listener& listener);
    void watch();
    bool isIdleWithin(std::chrono::milliseconds time) const;

    const Settings& settings;
    RequestHandler& handler;
    const Certificates* certificates;
    ConnectionTable table;
    std::vector<std::unique_ptr<Endpoint>> endpoints;
    std::mutex mutex;
    std::condition_variable ending;
    bool isEnding = false;
    std::thread watcher;
};

}  // namespace cimhost::server

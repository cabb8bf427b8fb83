#include "server/HttpServer.h"

#include <sys/socket.h>
#include <unistd.h>

#include <atomic>

#include "server/Sockets.h"

namespace cimhost::server {
namespace {

using Response = std::unique_ptr<MHD_Response, decltype(&MHD_destroy_response)>;

/** The text of a response that is sent in blocks. */
struct Stream {
    std::shared_ptr<cimxml::ResponseText> source;
    std::string text;  ///< written but not sent yet
};

ssize_t readStream(void* context, std::uint64_t, char* buffer, std::size_t size) {
    auto& stream = *static_cast<Stream*>(context);
    try {
        stream.source->append(stream.text, size);
    } catch (const std::exception&) {
        return MHD_CONTENT_READER_END_WITH_ERROR;
    }
    if (stream.text.empty()) {
        return MHD_CONTENT_READER_END_OF_STREAM;
    }
    const std::size_t count = stream.text.copy(buffer, size);
    stream.text.erase(0, count);
    return static_cast<ssize_t>(count);
}

Response bufferResponse(const std::string& body) {
    return {MHD_create_response_from_buffer(body.size(), const_cast<char*>(body.data()), MHD_RESPMEM_MUST_COPY),
            &MHD_destroy_response};
}

/**
 * Sends a short text with its length, and a long one in chunks that are written while they are sent. After a chunked
 * response, all later responses of the connection are chunked, since OpenPegasus' client library expects that.
 */
Response textResponse(CimReply reply, Connection& connection) {
    if (reply.isComplete && !connection.usesChunks) {
        return bufferResponse(reply.beginning);
    }
    auto stream = std::make_unique<Stream>(Stream{std::move(reply.text), std::move(reply.beginning)});
    connection.usesChunks = true;
    return {MHD_create_response_from_callback(MHD_SIZE_UNKNOWN, blockSize, &readStream, stream.release(),
                                              [](void* context) { delete static_cast<Stream*>(context); }),
            &MHD_destroy_response};
}

void addCimHeaders(MHD_Response* response, const std::string& prefix) {
    MHD_add_response_header(response, "Content-Type", "application/xml; charset=\"utf-8\"");
    MHD_add_response_header(response, "Cache-Control", "no-cache");
    MHD_add_response_header(response, (prefix + "CIMOperation").c_str(), "MethodResponse");
    if (!prefix.empty()) {
        for (const auto& [name, value] : extensionHeaders(prefix)) {
            MHD_add_response_header(response, name.c_str(), value.c_str());
        }
    }
}

HttpRequest headOf(MHD_Connection* connection, const char* method) {
    HttpRequest request{method, {}};
    MHD_get_connection_values_n(
        connection, MHD_HEADER_KIND,
        [](void* context, MHD_ValueKind, const char* name, size_t nameSize, const char* value, size_t valueSize) {
            static_cast<HttpRequest*>(context)->headers.emplace(
                std::string(name, nameSize), value == nullptr ? std::string{} : std::string(value, valueSize));
            return MHD_YES;
        },
        &request);
    return request;
}

}  // namespace

/** A listening socket with the functions that the HTTP library calls for it. */
struct HttpServer::Endpoint {
    HttpServer& server;
    Listener listener;
    int socket = -1;
    MHD_Daemon* daemon = nullptr;
    bool isQuiet = false;

    Endpoint(HttpServer& itsServer, Listener itsListener) : server(itsServer), listener(std::move(itsListener)) {}

    /** The server for the callbacks of the TLS library, which have no argument for it. At most one server uses TLS. */
    static std::atomic<HttpServer*> tlsServer;

    static int findCertificate(gnutls_session_t session, const gnutls_datum_t*, int, const gnutls_pk_algorithm_t*, int,
                               gnutls_pcert_st** certificates, unsigned* count, gnutls_privkey_t* key) {
        const Certificates::Chain& chain = tlsServer.load()->certificates->current();
        *certificates = const_cast<gnutls_pcert_st*>(chain.certificates.data());
        *count = static_cast<unsigned>(chain.certificates.size());
        *key = chain.key;
        gnutls_handshake_set_hook_function(session, GNUTLS_HANDSHAKE_FINISHED, GNUTLS_HOOK_POST, &noteHandshake);
        return 0;
    }

    static int noteHandshake(gnutls_session_t session, unsigned, unsigned, unsigned isIncoming, const gnutls_datum_t*) {
        if (isIncoming != 0) {
            tlsServer.load()->table.endHandshake(gnutls_transport_get_int(session), session);
        }
        return 0;
    }

    static Connection* connectionOf(MHD_Connection* connection) {
        const MHD_ConnectionInfo* info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_SOCKET_CONTEXT);
        return static_cast<Connection*>(info->socket_context);
    }

    static void notifyConnection(void* self, MHD_Connection* connection, void** context,
                                 MHD_ConnectionNotificationCode code) {
        auto& endpoint = *static_cast<Endpoint*>(self);
        if (code == MHD_CONNECTION_NOTIFY_STARTED) {
            const int socket = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CONNECTION_FD)->connect_fd;
            const sockaddr* client =
                MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CLIENT_ADDRESS)->client_addr;
            *context =
                endpoint.server.table.add(socket, endpoint.listener.tls, {addressText(client), networkOf(client)});
        } else {
            const auto& ended = *static_cast<Connection*>(*context);
            if (ended.hasPartOfHead()) {
                endpoint.server.handler.logIncomplete(ended);
            }
            endpoint.server.table.remove(&ended);
        }
    }

    static void notifyCompleted(void* self, MHD_Connection*, void** context, MHD_RequestTerminationCode code) {
        const std::unique_ptr<Exchange> exchange(static_cast<Exchange*>(*context));
        *context = nullptr;
        if (exchange == nullptr) {  // out of memory in begin()
            return;
        }
        const auto& server = static_cast<Endpoint*>(self)->server;
        Connection& connection = *exchange->connection;
        if (!exchange->isLogged) {
            server.handler.logIncomplete(*exchange);
        }
        if (exchange->isBodyIgnored) {
            discardInput(connection.socket(), server.handler.mostIgnored());
        }
        // After the last request, bytes that still arrive are part of its body, not of another head.
        const bool isLast = exchange->isBodyIgnored || code != MHD_REQUEST_TERMINATED_COMPLETED_OK;
        connection.enter(isLast ? Connection::Phase::refusal : Connection::Phase::idle);
        if (!isLast && server.table.size() == 1) {  // with several connections, the processors have other work
            awaitInputBriefly(connection.socket());
        }
    }

    static MHD_Result handle(void* self, MHD_Connection* connection, const char*, const char* method, const char*,
                             const char* data, size_t* size, void** context) {
        auto& endpoint = *static_cast<Endpoint*>(self);
        try {
            if (*context == nullptr) {
                return endpoint.begin(connection, method, context);
            }
            auto& exchange = *static_cast<Exchange*>(*context);
            if (*size != 0) {
                const bool continues = endpoint.server.handler.receive(exchange, data, *size);
                *size = 0;
                return continues ? MHD_YES : MHD_NO;
            }
            return endpoint.finish(connection, exchange);
        } catch (const std::exception&) {  // out of memory
            return MHD_NO;
        }
    }

    MHD_Result begin(MHD_Connection* connection, const char* method, void** context) const {
        auto exchange = std::make_unique<Exchange>();
        exchange->connection = connectionOf(connection);
        exchange->needsAuthentication = server.settings.authenticates;
        exchange->rules = {!server.settings.authenticates, server.settings.limits.requestBytes};
        *context = exchange.get();
        Exchange& current = *exchange.release();  // notifyCompleted deletes it
        current.connection->enter(Connection::Phase::check);
        if (const auto refused = server.handler.begin(current, headOf(connection, method))) {
            current.connection->enter(Connection::Phase::refusal);
            return send(connection, current, *refused);
        }
        return current.connection->enter(Connection::Phase::body) ? MHD_YES : MHD_NO;
    }

    MHD_Result finish(MHD_Connection* connection, Exchange& exchange) const {
        if (!exchange.connection->enter(Connection::Phase::work)) {
            return MHD_NO;
        }
        Reply reply = server.handler.finish(exchange);
        exchange.connection->enter(Connection::Phase::response);
        if (const auto* refused = std::get_if<HttpResponse>(&reply)) {
            return send(connection, exchange, *refused);
        }
        const Response response = textResponse(std::get<CimReply>(std::move(reply)), *exchange.connection);
        addCimHeaders(response.get(), exchange.extensionPrefix);
        return queue(connection, exchange, response, MHD_HTTP_OK);
    }

    MHD_Result send(MHD_Connection* connection, Exchange& exchange, const HttpResponse& answer) const {
        const Response response = bufferResponse(answer.body);
        for (const auto& [name, value] : answer.headers) {
            MHD_add_response_header(response.get(), name.c_str(), value.c_str());
        }
        return queue(connection, exchange, response, answer.status);
    }

    MHD_Result queue(MHD_Connection* connection, Exchange& exchange, const Response& response, unsigned status) const {
        if (server.handler.isStopping() || exchange.isBodyIgnored) {
            MHD_add_response_header(response.get(), "Connection", "close");
        }
        server.handler.log(exchange, status);
        return MHD_queue_response(connection, status, response.get());
    }

    void start() {
        const unsigned flags = MHD_USE_INTERNAL_POLLING_THREAD | MHD_USE_THREAD_PER_CONNECTION | MHD_USE_ITC |
                               MHD_USE_POLL | (listener.tls ? unsigned{MHD_USE_TLS} : 0U);
        std::vector<MHD_OptionItem> options{
            {MHD_OPTION_LISTEN_SOCKET, socket, nullptr},
            {MHD_OPTION_CONNECTION_LIMIT, static_cast<intptr_t>(server.settings.limits.connections + endingConnections),
             nullptr},
            {MHD_OPTION_CONNECTION_MEMORY_LIMIT, static_cast<intptr_t>(server.settings.limits.headBytes), nullptr},
            {MHD_OPTION_NOTIFY_CONNECTION, reinterpret_cast<intptr_t>(&notifyConnection), this},
            {MHD_OPTION_NOTIFY_COMPLETED, reinterpret_cast<intptr_t>(&notifyCompleted), this},
            {MHD_OPTION_STRICT_FOR_CLIENT, 1, nullptr}};
        if (listener.tls) {
            options.push_back({MHD_OPTION_HTTPS_CERT_CALLBACK, 0, reinterpret_cast<void*>(&findCertificate)});
            options.push_back(
                {MHD_OPTION_HTTPS_PRIORITIES, 0, const_cast<char*>("NORMAL:-VERS-ALL:+VERS-TLS1.3:+VERS-TLS1.2")});
        }
        options.push_back({MHD_OPTION_END, 0, nullptr});
        daemon = MHD_start_daemon(flags, 0, nullptr, nullptr, &handle, this, MHD_OPTION_ARRAY, options.data(),
                                  MHD_OPTION_END);
        if (daemon == nullptr) {
            throw SettingsError(listener.url() + ": the server cannot be started");
        }
    }

    /** Stops accepting connections. A socket of the service manager remains usable for the next process. */
    void quiesce() {
        if (daemon != nullptr && !isQuiet) {
            MHD_quiesce_daemon(daemon);
            if (listener.descriptor < 0) {
                ::shutdown(socket, SHUT_RDWR);
            }
            isQuiet = true;
        }
    }

    ~Endpoint() {
        quiesce();
        if (daemon != nullptr) {
            MHD_stop_daemon(daemon);
        }
        ::close(socket);  // the HTTP library may have used it until now
    }
};

std::atomic<HttpServer*> HttpServer::Endpoint::tlsServer{nullptr};

HttpServer::HttpServer(const Settings& itsSettings, RequestHandler& itsHandler, const Certificates* itsCertificates)
    : settings(itsSettings), handler(itsHandler), certificates(itsCertificates), table(itsSettings.limits) {
    if (certificates != nullptr) {
        Endpoint::tlsServer = this;
    }
    for (const Listener& each : settings.listeners) {
        listen(each);
    }
    watcher = std::thread([this] { watch(); });
}

HttpServer::~HttpServer() {
    {
        const std::lock_guard<std::mutex> lock(mutex);
        isEnding = true;
    }
    ending.notify_all();
    watcher.join();
    for (const auto& each : endpoints) {
        each->quiesce();
    }
    table.endAll();
    endpoints.clear();
}

void HttpServer::listen(const Listener& listener) {
    auto endpoint = std::make_unique<Endpoint>(*this, listener);
    endpoint->socket = listener.descriptor >= 0 ? listener.descriptor : openSocket(listener);
    endpoint->listener.port = portOf(endpoint->socket);
    endpoint->start();
    endpoints.push_back(std::move(endpoint));
}

std::vector<Listener> HttpServer::listeners() const {
    std::vector<Listener> found;
    for (const auto& each : endpoints) {
        found.push_back(each->listener);
    }
    return found;
}

void HttpServer::watch() {
    constexpr std::chrono::milliseconds period{200};
    std::unique_lock<std::mutex> lock(mutex);
    while (!ending.wait_for(lock, period, [&] { return isEnding; })) {
        table.endOverdue(std::chrono::steady_clock::now());
        if (handler.isShortOfResults()) {
            table.endStalledResponse();
        }
        handler.removeExpired();
    }
}

bool HttpServer::drain(std::chrono::milliseconds time) {
    constexpr std::chrono::seconds endingTime{2};
    handler.stop();
    for (const auto& each : endpoints) {
        each->quiesce();
    }
    if (isIdleWithin(time)) {
        return true;
    }
    table.endAll();
    return isIdleWithin(endingTime);
}

bool HttpServer::isIdleWithin(std::chrono::milliseconds time) const {
    constexpr std::chrono::milliseconds period{20};
    const auto end = std::chrono::steady_clock::now() + time;
    while (table.busy() != 0 && std::chrono::steady_clock::now() < end) {
        std::this_thread::sleep_for(period);
    }
    return table.busy() == 0;
}

}  // namespace cimhost::server

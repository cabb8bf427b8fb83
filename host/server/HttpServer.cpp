#include "server/HttpServer.h"

#include <arpa/inet.h>
#include <netdb.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <cerrno>
#include <cstring>

namespace cimhost::server {
namespace {

constexpr std::size_t blockSize = std::size_t{32} << 10U;
constexpr std::size_t headSize = std::size_t{64} << 10U;  ///< of a request, with its target; also the send buffer

/** Connections that the HTTP library may have besides the limit: those that are being ended for new ones. */
constexpr std::size_t endingConnections = 128;

/** The certificates for the callback of the TLS library, which has no argument for them. One server uses TLS. */
std::atomic<const Certificates*> tlsCertificates{nullptr};

int findCertificate(gnutls_session_t, const gnutls_datum_t*, int, const gnutls_pk_algorithm_t*, int,
                    gnutls_pcert_st** certificates, unsigned* count, gnutls_privkey_t* key) {
    const Certificates::Chain& chain = tlsCertificates.load()->current();
    *certificates = const_cast<gnutls_pcert_st*>(chain.certificates.data());
    *count = static_cast<unsigned>(chain.certificates.size());
    *key = chain.key;
    return 0;
}

std::string addressText(const sockaddr* address) {
    std::array<char, NI_MAXHOST> host{};
    std::array<char, NI_MAXSERV> port{};
    const socklen_t size = address->sa_family == AF_INET6 ? sizeof(sockaddr_in6) : sizeof(sockaddr_in);
    if (::getnameinfo(address, size, host.data(), host.size(), port.data(), port.size(),
                      NI_NUMERICHOST | NI_NUMERICSERV) != 0) {
        return "unknown";
    }
    const bool isSix = address->sa_family == AF_INET6;
    return (isSix ? "[" : "") + std::string(host.data()) + (isSix ? "]:" : ":") + port.data();
}

/** Opens a listening socket. */
int openSocket(const Listener& listener) {
    addrinfo hints{};
    hints.ai_flags = AI_PASSIVE | AI_NUMERICHOST | AI_NUMERICSERV;
    hints.ai_socktype = SOCK_STREAM;
    addrinfo* found = nullptr;
    const int result = ::getaddrinfo(listener.address.c_str(), std::to_string(listener.port).c_str(), &hints, &found);
    if (result != 0) {
        throw SettingsError(listener.url() + ": " + ::gai_strerror(result));
    }
    const std::unique_ptr<addrinfo, decltype(&::freeaddrinfo)> address(found, &::freeaddrinfo);
    const int socket = ::socket(found->ai_family, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0);
    const int on = 1;
    ::setsockopt(socket, SOL_SOCKET, SO_REUSEADDR, &on, sizeof on);
    if (found->ai_family == AF_INET6) {
        ::setsockopt(socket, IPPROTO_IPV6, IPV6_V6ONLY, &on, sizeof on);
    }
    if (socket < 0 || ::bind(socket, found->ai_addr, found->ai_addrlen) != 0 || ::listen(socket, SOMAXCONN) != 0) {
        const std::string reason = std::strerror(errno);
        ::close(socket);
        throw SettingsError(listener.url() + ": " + reason);
    }
    return socket;
}

std::uint16_t portOf(int socket) {
    sockaddr_storage address{};
    socklen_t size = sizeof address;
    if (::getsockname(socket, reinterpret_cast<sockaddr*>(&address), &size) != 0) {
        return 0;
    }
    return ntohs(address.ss_family == AF_INET6 ? reinterpret_cast<const sockaddr_in6&>(address).sin6_port
                                               : reinterpret_cast<const sockaddr_in&>(address).sin_port);
}

using Response = std::unique_ptr<MHD_Response, decltype(&MHD_destroy_response)>;

/** The text of a response that is sent in blocks. */
struct Stream {
    std::shared_ptr<cimxml::ResponseText> source;
    std::string block;     ///< not yet sent
    std::size_t sent = 0;  ///< bytes of the block
};

ssize_t readStream(void* context, std::uint64_t, char* buffer, std::size_t size) {
    auto& stream = *static_cast<Stream*>(context);
    try {
        if (stream.sent == stream.block.size()) {
            stream.block.clear();
            stream.sent = 0;
            stream.source->append(stream.block, size);
        }
    } catch (const std::exception&) {
        return MHD_CONTENT_READER_END_WITH_ERROR;
    }
    if (stream.block.empty()) {
        return MHD_CONTENT_READER_END_OF_STREAM;
    }
    const std::size_t count = std::min(size, stream.block.size() - stream.sent);
    std::memcpy(buffer, stream.block.data() + stream.sent, count);
    stream.sent += count;
    return static_cast<ssize_t>(count);
}

Response bufferResponse(const std::string& body) {
    return {MHD_create_response_from_buffer(body.size(), const_cast<char*>(body.data()), MHD_RESPMEM_MUST_COPY),
            &MHD_destroy_response};
}

/** A short text as it is, with its length; a long one in chunks that are written when they are sent. */
Response textResponse(std::shared_ptr<cimxml::ResponseText> text) {
    auto stream = std::make_unique<Stream>(Stream{std::move(text), {}, 0});
    if (!stream->source->append(stream->block, blockSize)) {
        return bufferResponse(stream->block);
    }
    return {MHD_create_response_from_callback(MHD_SIZE_UNKNOWN, blockSize, &readStream, stream.release(),
                                              [](void* context) { delete static_cast<Stream*>(context); }),
            &MHD_destroy_response};
}

void addCimHeaders(MHD_Response* response, const std::string& prefix) {
    MHD_add_response_header(response, "Content-Type", "application/xml; charset=\"utf-8\"");
    MHD_add_response_header(response, "Cache-Control", "no-cache");
    MHD_add_response_header(response, (prefix + "CIMOperation").c_str(), "MethodResponse");
    if (!prefix.empty()) {
        MHD_add_response_header(response, "Ext", "");
        const std::string man = "http://www.dmtf.org/cim/mapping/http/v1.0 ; ns=" + prefix.substr(0, 2);
        MHD_add_response_header(response, "Man", man.c_str());
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

    static Connection* connectionOf(MHD_Connection* connection) {
        const MHD_ConnectionInfo* info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_SOCKET_CONTEXT);
        return static_cast<Connection*>(info->socket_context);
    }

    static void notifyConnection(void* self, MHD_Connection* connection, void** context,
                                 MHD_ConnectionNotificationCode code) {
        auto& endpoint = *static_cast<Endpoint*>(self);
        if (code == MHD_CONNECTION_NOTIFY_STARTED) {
            const int socket = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CONNECTION_FD)->connect_fd;
            *context = endpoint.server.table.add(socket, endpoint.listener.tls);
        } else {
            endpoint.server.table.remove(static_cast<Connection*>(*context));
        }
    }

    static void notifyCompleted(void*, MHD_Connection* connection, void** context, MHD_RequestTerminationCode) {
        delete static_cast<Exchange*>(*context);
        *context = nullptr;
        connectionOf(connection)->enter(Connection::Phase::idle);
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
        exchange->client =
            addressText(MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CLIENT_ADDRESS)->client_addr);
        exchange->needsAuthentication = server.settings.authenticates;
        exchange->rules = {!server.settings.authenticates, server.settings.limits.requestBytes};
        *context = exchange.get();
        Exchange& current = *exchange.release();  // notifyCompleted deletes it
        current.connection->enter(Connection::Phase::work);
        const auto refused = server.handler.begin(current, headOf(connection, method));
        if (refused) {
            return send(connection, current, *refused);
        }
        current.connection->enter(Connection::Phase::body);
        return MHD_YES;
    }

    MHD_Result finish(MHD_Connection* connection, Exchange& exchange) const {
        const Reply reply = server.handler.finish(exchange);
        if (const auto* refused = std::get_if<HttpResponse>(&reply)) {
            return send(connection, exchange, *refused);
        }
        const Response response = textResponse(std::get<std::shared_ptr<cimxml::ResponseText>>(reply));
        addCimHeaders(response.get(), exchange.headers.extensionPrefix);
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
        if (server.handler.isStopping()) {
            MHD_add_response_header(response.get(), "Connection", "close");
        }
        exchange.connection->enter(Connection::Phase::response);
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
            {MHD_OPTION_CONNECTION_MEMORY_LIMIT, static_cast<intptr_t>(headSize), nullptr},
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

    void quiesce() {
        if (daemon != nullptr && !isQuiet) {
            MHD_quiesce_daemon(daemon);
            ::close(socket);
            isQuiet = true;
        }
    }

    ~Endpoint() {
        quiesce();
        if (daemon != nullptr) {
            MHD_stop_daemon(daemon);
        } else {
            ::close(socket);
        }
    }
};

HttpServer::HttpServer(const Settings& itsSettings, RequestHandler& itsHandler, const Certificates* itsCertificates)
    : settings(itsSettings), handler(itsHandler), certificates(itsCertificates), table(itsSettings.limits) {
    if (certificates != nullptr) {
        tlsCertificates = certificates;
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
    table.endAll(true);
    endpoints.clear();
}

void HttpServer::listen(const Listener& listener) {
    auto endpoint = std::unique_ptr<Endpoint>(new Endpoint{*this, listener});
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
        handler.removeExpired();
    }
}

bool HttpServer::drain(std::chrono::milliseconds time) {
    constexpr std::chrono::milliseconds period{20};
    handler.stop();
    for (const auto& each : endpoints) {
        each->quiesce();
    }
    const auto end = std::chrono::steady_clock::now() + time;
    while (table.busy() != 0 && std::chrono::steady_clock::now() < end) {
        std::this_thread::sleep_for(period);
    }
    return table.busy() == 0;
}

}  // namespace cimhost::server

#pragma once

#include <atomic>
#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <variant>

#include "cimxml/Operations.h"
#include "cimxml/ResponseText.h"
#include "server/AccessLog.h"
#include "server/Authentication.h"
#include "server/ConnectionTable.h"
#include "server/HeaderCheck.h"
#include "server/PasswordQueue.h"
#include "server/Quota.h"
#include "server/Settings.h"

namespace cimhost::server {

constexpr std::size_t blockSize = std::size_t{32} << 10U;  ///< bytes of a response that are written together

/** One HTTP request and its response, from the head of the request to the end of the response. */
struct Exchange {
    HeaderRules rules{};
    Connection* connection = nullptr;
    bool needsAuthentication = true;
    CimHeaders headers{};           ///< of a request that has passed the checks
    std::string extensionPrefix{};  ///< of the CIM headers of an M-POST request, else empty
    cimxml::Caller caller{};
    std::optional<std::uint64_t> length{};  ///< of the body, if Content-Length is present
    std::string body{};
    bool isBodyIgnored = false;             ///< whether the response is sent before the complete body is received
    std::optional<HttpResponse> refused{};  ///< response to a body that is too large; sent after the body
    std::size_t ignored = 0;                ///< bytes of a body that is too large, after the limit
    Quota::Share unfinished{};              ///< the results of a list that the client has not received completely
    bool isLogged = false;
    AccessRecord record{};
    std::chrono::steady_clock::time_point start = std::chrono::steady_clock::now();
};

/** A CIM response whose text is written while it is sent, except for its beginning. */
struct CimReply {
    std::shared_ptr<cimxml::ResponseText> text{};
    std::string beginning{};
    bool isComplete = false;  ///< whether the beginning is the complete text
};

/** A CIM response, or an HTTP response without one. */
using Reply = std::variant<HttpResponse, CimReply>;

/** Checks, authenticates and performs requests. Called concurrently. */
class RequestHandler {
public:
    RequestHandler(const Settings& itsSettings, cimxml::Operations& itsOperations, Authenticator& itsAuthenticator,
                   const AccessLog& itsLog);

    /** Checks the head of a request and its password. @return the response, or none if the body must be received */
    std::optional<HttpResponse> begin(Exchange& exchange, const HttpRequest& request);

    /** Appends a part of the body. @return false if the body is so large that the connection must end */
    bool receive(Exchange& exchange, const char* data, std::size_t size) const;

    /** Performs the complete request. */
    Reply finish(Exchange& exchange);

    /** Largest number of bytes that are received and ignored. */
    std::size_t mostIgnored() const;

    /** Writes the access log line. */
    void log(Exchange& exchange, unsigned httpStatus) const;

    /** Writes the line of a request that ended before its response: the client or a time limit ended it. */
    void logIncomplete(Exchange& exchange) const;
    void logIncomplete(const Connection& connection) const;

    /** Whether a request waits until clients have received other responses. */
    bool isShortOfResults() const { return results.isAwaited(); }

    /** Ends open enumerations whose timeout has passed. */
    void removeExpired() { operations.removeExpired(cimxml::OpenEnumerations::Clock::now()); }

    /** Answers new requests with 503 from now on. */
    void stop() { stopping = true; }
    bool isStopping() const { return stopping; }

private:
    std::optional<HttpResponse> check(Exchange& exchange, const HttpRequest& request);
    std::optional<HttpResponse> authenticate(Exchange& exchange, const HttpRequest& request);
    std::optional<Right> verified(Exchange& exchange, const std::string& authorization);
    Reply answer(Exchange& exchange);
    Reply performWhenFree(Exchange& exchange);
    cimxml::Message read(Exchange& exchange) const;
    Reply perform(Exchange& exchange, const cimxml::Message& message, Quota::Share& share);
    cimxml::ResponseText respond(Exchange& exchange, const cimxml::Message& message);

    const Settings& settings;
    cimxml::Operations& operations;
    Authenticator& authenticator;
    PasswordQueue passwords;  ///< for calls to the authenticator
    const AccessLog& accessLog;
    Quota requests;  ///< running requests that do not return lists
    Quota lists;     ///< running requests that return lists
    Quota results;   ///< results in unfinished responses
    std::atomic<bool> stopping{false};
};

}  // namespace cimhost::server

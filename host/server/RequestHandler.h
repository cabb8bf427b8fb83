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

/** One HTTP request and its response, from its head to the end of its response. */
struct Exchange {
    HeaderRules rules{};
    Connection* connection = nullptr;
    bool needsAuthentication = true;
    CimHeaders headers{};           ///< of a request that has passed the checks
    std::string extensionPrefix{};  ///< of the headers of an M-POST request, else empty
    cimxml::Caller caller{};
    std::optional<std::uint64_t> length{};  ///< of the body, if a header has it
    std::string body{};
    bool isBodyIgnored = false;             ///< whether the response is sent before the body has arrived
    std::optional<HttpResponse> refused{};  ///< the response to a body that is too large, once its rest has arrived
    std::size_t ignored = 0;                ///< bytes of the rest
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

    /** Decides on the head of a request. @return the response that ends it, or none to receive its body */
    std::optional<HttpResponse> begin(Exchange& exchange, const HttpRequest& request);

    /** Appends a part of the body. @return false if the client sends so much that the connection must end */
    bool receive(Exchange& exchange, const char* data, std::size_t size) const;

    /** Performs the complete request. */
    Reply finish(Exchange& exchange);

    /** Largest number of bytes that are received although they are ignored. */
    std::size_t mostIgnored() const;

    /** Writes the access log line. */
    void log(Exchange& exchange, unsigned httpStatus) const;

    /** Writes the line of a request that has ended before its response: because of the client, or of its duration. */
    void logIncomplete(Exchange& exchange) const;
    void logIncomplete(const Connection& connection) const;

    /** Whether a response waits until clients have received others. */
    bool isShortOfResults() const { return results.isAwaited(); }

    /** Ends open enumerations whose timeout has passed. */
    void removeExpired() { operations.removeExpired(cimxml::OpenEnumerations::Clock::now()); }

    /** From now on, requests are answered with 503. */
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
    PasswordQueue passwords;  ///< for calls of the authenticator
    const AccessLog& accessLog;
    Quota requests;  ///< running, except for lists
    Quota lists;     ///< running
    Quota results;   ///< of unfinished responses
    std::atomic<bool> stopping{false};
};

}  // namespace cimhost::server

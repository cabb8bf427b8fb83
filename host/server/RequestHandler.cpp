#include "server/RequestHandler.h"

#include "cimxml/Errors.h"

namespace cimhost::server {
namespace {

constexpr std::chrono::seconds authorizationLifetime{60};
constexpr std::size_t shortBody = std::size_t{16} << 10U;  ///< largest body that is parsed before the request waits
constexpr unsigned badRequest = 400;
constexpr unsigned timeout = 408;
constexpr std::size_t refusedBodyFactor =
    4;  ///< multiple of the largest permitted request that is received and ignored

HttpResponse unauthorized() {
    HttpResponse response = refusal(401, "Send the name and password of a user who may use this server.");
    response.headers.emplace("WWW-Authenticate", "Basic realm=\"cimhost\", charset=\"UTF-8\"");
    return response;
}

HttpResponse unavailable(const std::string& why) {
    HttpResponse response = refusal(503, why);
    response.headers.emplace("Retry-After", "5");
    return response;
}

}  // namespace

RequestHandler::RequestHandler(const Settings& itsSettings, cimxml::Operations& itsOperations,
                               Authenticator& itsAuthenticator, const AccessLog& itsLog)
    : settings(itsSettings),
      operations(itsOperations),
      authenticator(itsAuthenticator),
      accessLog(itsLog),
      requests(itsSettings.limits.runningRequests),
      lists(itsSettings.limits.runningLists),
      results(itsSettings.limits.responseResults) {}

std::optional<HttpResponse> RequestHandler::begin(Exchange& exchange, const HttpRequest& request) {
    exchange.extensionPrefix = extensionPrefixOf(request);
    const auto method = headerIn(request.headers, exchange.extensionPrefix + "CIMMethod");
    exchange.record.operation = percentDecoded(method.value_or("")).value_or("");
    auto refused = check(exchange, request);
    exchange.isBodyIgnored = refused && mayHaveBody(request.headers);
    exchange.length = lengthIn(request.headers);
    return refused ? std::optional(withExtension(*refused, exchange.extensionPrefix)) : std::nullopt;
}

std::optional<HttpResponse> RequestHandler::check(Exchange& exchange, const HttpRequest& request) {
    if (stopping) {
        return unavailable("The server is stopping.");
    }
    auto checked = checkHeaders(request, exchange.rules);
    if (auto* response = std::get_if<HttpResponse>(&checked)) {
        return std::move(*response);
    }
    exchange.headers = std::get<CimHeaders>(std::move(checked));
    return exchange.needsAuthentication ? authenticate(exchange, request) : std::nullopt;
}

std::optional<HttpResponse> RequestHandler::authenticate(Exchange& exchange, const HttpRequest& request) {
    const auto authorization = headerIn(request.headers, "Authorization");
    const auto credentials = authorization ? credentialsFrom(*authorization) : std::nullopt;
    if (!credentials) {
        return unauthorized();
    }
    exchange.record.user = credentials->user;
    const auto right = verified(exchange, *authorization);
    if (!right) {
        return unavailable("The server has too many passwords to check.");
    }
    if (*right == Right::none) {
        exchange.connection->enter(Connection::Phase::refusal);
        exchange.connection->waitUntil(exchange.start + settings.limits.failureDelay);
        return unauthorized();
    }
    exchange.connection->trust();
    exchange.caller = {credentials->user, *right == Right::write};
    return std::nullopt;
}

/**
 * Checks a password once per connection and minute, since PAM modules are slow.
 * @return nullopt if other checks took too long, or the connection was ended before its turn
 */
std::optional<Right> RequestHandler::verified(Exchange& exchange, const std::string& authorization) {
    const Credentials credentials = *credentialsFrom(authorization);
    const auto now = std::chrono::steady_clock::now();
    Connection& connection = *exchange.connection;
    const bool isKnown = connection.authorization == authorization && now < connection.authorizedUntil;
    if (!isKnown) {
        const PasswordQueue::Slot slot(passwords, connection, now + settings.limits.queueTime);
        if (!slot || connection.isEnding()) {
            return std::nullopt;
        }
        if (!authenticator.accepts(credentials, connection.client().host())) {
            return Right::none;
        }
        connection.authorization = authorization;
        connection.authorizedUntil = now + authorizationLifetime;
    }
    return rightOf(credentials.user, settings.access);
}

bool RequestHandler::receive(Exchange& exchange, const char* data, std::size_t size) const {
    if (!exchange.refused && exchange.body.size() + size > settings.limits.requestBytes) {
        exchange.refused = tooLarge(settings.limits.requestBytes);
        exchange.body = {};
    }
    if (!exchange.refused) {
        exchange.body.append(data, size);
        return true;
    }
    exchange.ignored += size;
    return exchange.ignored <= mostIgnored();
}

std::size_t RequestHandler::mostIgnored() const {
    return refusedBodyFactor * settings.limits.requestBytes;
}

Reply RequestHandler::finish(Exchange& exchange) {
    Reply reply = answer(exchange);
    if (auto* refused = std::get_if<HttpResponse>(&reply)) {
        return withExtension(std::move(*refused), exchange.extensionPrefix);
    }
    return reply;
}

Reply RequestHandler::answer(Exchange& exchange) {
    if (exchange.refused) {
        return *exchange.refused;
    }
    if (exchange.length.value_or(exchange.body.size()) != exchange.body.size()) {
        // The HTTP library ignores a Content-Length in a continued header line.
        exchange.isBodyIgnored = true;
        return refusal(400, "The body does not have the length that Content-Length says.");
    }
    exchange.connection->trust();
    try {
        return performWhenFree(exchange);
    } catch (const cimxml::RequestRefused& refused) {
        return refusal(refused.httpStatus, refused.what(), refused.cimError);
    }
}

cimxml::Message RequestHandler::read(Exchange& exchange) const {
    cimxml::XmlLimits limits;
    limits.depth = settings.limits.xmlDepth;
    limits.elements = settings.limits.xmlElements;
    cimxml::Message message = cimxml::readMessage(exchange.body, limits);
    exchange.body = {};
    return message;
}

/**
 * Lists have a separate quota, so that short requests do not wait for lists. A list keeps its share while it waits
 * until other clients have received their results. A short message is parsed before it waits for its share; a long one,
 * which needs more memory than its body, is parsed afterwards.
 */
Reply RequestHandler::performWhenFree(Exchange& exchange) {
    std::optional<cimxml::Message> message;
    if (exchange.body.size() <= shortBody) {
        message = read(exchange);
    }
    const auto latest = std::chrono::steady_clock::now() + settings.limits.queueTime;
    const bool returnsList = cimxml::Operations::returnsList(exchange.headers.method);
    Quota::Share share;
    if (!share.take(returnsList ? lists : requests, latest)) {
        return unavailable("The server has too many requests.");
    }
    if (returnsList && !exchange.unfinished.take(results, latest)) {
        return unavailable("Other clients have not received their results yet.");
    }
    return perform(exchange, message ? *message : read(exchange), share);
}

/** Releases the share before it writes the response, so that another request can run meanwhile. */
Reply RequestHandler::perform(Exchange& exchange, const cimxml::Message& message, Quota::Share& share) {
    if (auto disagreement = checkAgreement(exchange.headers, message)) {
        return *disagreement;
    }
    exchange.record.className = cimxml::Operations::subjectOf(message);
    const auto text = std::make_shared<cimxml::ResponseText>(respond(exchange, message));
    exchange.record.objects = text->count();
    exchange.unfinished.resize(text->count());
    share.resize(0);
    CimReply reply{text};
    reply.isComplete = !text->append(reply.beginning, blockSize);
    if (reply.isComplete) {
        exchange.unfinished.resize(0);
    }
    return reply;
}

cimxml::ResponseText RequestHandler::respond(Exchange& exchange, const cimxml::Message& message) {
    const auto failed = [&](const cimxml::CimError& error) {
        exchange.record.cimStatus = error.code;
        return cimxml::ResponseText(message, error);
    };
    try {
        return {message, operations.perform(message, exchange.caller)};
    } catch (const cimxml::RequestRefused&) {
        throw;
    } catch (const cimxml::CimError& error) {
        return failed(error);
    } catch (const std::exception& error) {
        return failed({CMPI_RC_ERR_FAILED, error.what()});
    }
}

void RequestHandler::log(Exchange& exchange, unsigned httpStatus) const {
    exchange.isLogged = true;
    exchange.record.client = exchange.connection->client().address;
    exchange.record.httpStatus = httpStatus;
    exchange.record.duration =
        std::chrono::duration_cast<std::chrono::microseconds>(std::chrono::steady_clock::now() - exchange.start);
    accessLog.write(exchange.record);
}

void RequestHandler::logIncomplete(Exchange& exchange) const {
    const bool hasTimedOut = exchange.connection->hasTimedOut();
    log(exchange, hasTimedOut ? timeout : exchange.refused ? exchange.refused->status : badRequest);
}

void RequestHandler::logIncomplete(const Connection& connection) const {
    AccessRecord record;
    record.client = connection.client().address;
    record.httpStatus = connection.hasTimedOut() ? timeout : badRequest;
    accessLog.write(record);
}

}  // namespace cimhost::server

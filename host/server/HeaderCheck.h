#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <variant>

#include "cimxml/Message.h"
#include "server/HttpRequest.h"

namespace cimhost::server {

/** The headers of a CIM operation request that has passed the check. */
struct CimHeaders {
    std::string method{};  ///< CIMMethod
    std::string object{};  ///< CIMObject, decoded
};

/** The conditions that depend on the listener. */
struct HeaderRules {
    bool requiresLocalHost = false;  ///< the header Host must name this machine's loopback interface
    std::size_t largestBody = 0;
};

/** Checks the head of a request. @return the headers of the operation, or the response that ends the request */
std::variant<CimHeaders, HttpResponse> checkHeaders(const HttpRequest& request, const HeaderRules& rules);

/** The value of Content-Length, the largest number if it is too large for one; none if the header is absent. */
std::optional<std::uint64_t> lengthIn(const Headers& headers);

/** Whether a body follows a head, or may follow it because its length is ambiguous. */
bool mayHaveBody(const Headers& headers);

/** The prefix of the headers of an extension for CIM operations, "NN-", in an M-POST request; empty if there is none.
 */
std::string extensionPrefixOf(const HttpRequest& request);

/** The headers with which a response confirms an extension. */
Headers extensionHeaders(const std::string& prefix);

/** Makes a refusal that of a request with an extension. @param prefix empty: without an extension */
HttpResponse withExtension(HttpResponse response, const std::string& prefix);

/** Whether a body agrees with the headers. @return the response that refuses it, or none */
std::optional<HttpResponse> checkAgreement(const CimHeaders& headers, const cimxml::Message& message);

/** A response to a request that is refused. @param cimError value of the header CIMError; empty: none */
HttpResponse refusal(unsigned status, const std::string& why, const std::string& cimError = {});

/** The response to a request with a larger body than permitted. */
HttpResponse tooLarge(std::size_t largest);

/** Decodes %XX; none if a percent sign has no two hexadecimal digits after it. */
std::optional<std::string> percentDecoded(const std::string& encoded);

}  // namespace cimhost::server

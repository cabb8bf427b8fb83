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
    bool requiresLocalHost = false;  ///< the header Host must be localhost or a loopback address
    std::size_t largestBody = 0;
};

/** Checks the head of a request. @return the headers of the operation, or the response to other requests */
std::variant<CimHeaders, HttpResponse> checkHeaders(const HttpRequest& request, const HeaderRules& rules);

/** The value of Content-Length, at most the largest 64-bit number; none if the header is absent or repeated. */
std::optional<std::uint64_t> lengthIn(const Headers& headers);

/** Whether a body follows a head, or could follow it because the head is malformed. */
bool mayHaveBody(const Headers& headers);

/** The prefix "NN-" of the CIM headers in an M-POST request; empty if the request declares none. */
std::string extensionPrefixOf(const HttpRequest& request);

/** The headers with which the response to an M-POST request confirms the extension. */
Headers extensionHeaders(const std::string& prefix);

/** Makes a refusal the response to an M-POST request. @param prefix empty: returns the response unchanged */
HttpResponse withExtension(HttpResponse response, const std::string& prefix);

/** Checks that a message agrees with the headers. @return the response that refuses the message, or none */
std::optional<HttpResponse> checkAgreement(const CimHeaders& headers, const cimxml::Message& message);

/** The response that refuses a request. @param cimError value of the header CIMError; empty: no such header */
HttpResponse refusal(unsigned status, const std::string& why, const std::string& cimError = {});

/** The response to a request whose body is larger than permitted. */
HttpResponse tooLarge(std::size_t largest);

/** Decodes %XX. Returns none if a percent sign is not followed by two hexadecimal digits. */
std::optional<std::string> percentDecoded(const std::string& encoded);

}  // namespace cimhost::server

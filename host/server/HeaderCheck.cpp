#include "server/HeaderCheck.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <limits>

namespace cimhost::server {
namespace {

constexpr auto mapping = "http://www.dmtf.org/cim/mapping/http/v1.0";
constexpr auto permittedMethods = "POST, M-POST, OPTIONS";

std::string trimmed(std::string_view string) {
    const std::size_t first = string.find_first_not_of(" \t\"");
    return first == std::string_view::npos
               ? std::string{}
               : std::string(string.substr(first, string.find_last_not_of(" \t\"") + 1 - first));
}

/** The value of a parameter such as charset in "application/xml; charset=utf-8"; empty if there is none. */
std::string parameterOf(std::string_view value, std::string_view name) {
    for (std::size_t at = value.find(';'); at != std::string_view::npos; at = value.find(';', at + 1)) {
        const std::string_view part = value.substr(at + 1, value.find(';', at + 1) - at - 1);
        const std::size_t equals = part.find('=');
        if (equals != std::string_view::npos && cim::sameName(trimmed(part.substr(0, equals)), name)) {
            return trimmed(part.substr(equals + 1));
        }
    }
    return {};
}

HttpResponse optionsResponse() {
    HttpResponse response;
    response.headers = {{"Allow", permittedMethods},
                        {"Opt", std::string(mapping) + " ; ns=77"},
                        {"77-CIMProtocolVersion", "1.0"},
                        {"CIMProtocolVersion", "1.0"},
                        {"CIMSupportedFunctionalGroups",
                         "basic-read, basic-write, instance-manipulation, association-traversal, pulled-read"}};
    return response;
}

bool isLocalHost(std::string host) {
    const std::size_t colon = host.rfind(':');
    if (colon != std::string::npos && host.find(']', colon) == std::string::npos) {
        host.resize(colon);
    }
    const bool isAddress = host.rfind("127.", 0) == 0 && host.find_first_not_of("0123456789.") == std::string::npos;
    return cim::sameName(host, "localhost") || isAddress || host == "[::1]";
}

bool isUtf8Xml(const std::string& type) {
    const std::string kind = trimmed(type.substr(0, type.find(';')));
    const std::string charset = parameterOf(type, "charset");
    return (cim::sameName(kind, "application/xml") || cim::sameName(kind, "text/xml")) &&
           (charset.empty() || cim::sameName(charset, "utf-8") || cim::sameName(charset, "us-ascii"));
}

bool isName(const std::string& name) {
    constexpr std::string_view others = "!#$%&'*+-.^_`|~";
    return !name.empty() && std::all_of(name.begin(), name.end(), [&](char each) {
        return std::isalnum(static_cast<unsigned char>(each)) != 0 || others.find(each) != std::string_view::npos;
    });
}

/** Refuses a head from which a proxy could derive another length of the body (request smuggling). */
std::optional<HttpResponse> checkFraming(const Headers& headers) {
    const auto isWrong = [](const auto& each) {
        return !isName(each.first) || each.second.find('\r') != std::string::npos ||
               each.second.find('\n') != std::string::npos;
    };
    if (headers.count("Host") > 1 || std::any_of(headers.begin(), headers.end(), isWrong)) {
        return refusal(400, "A header is malformed, or the header Host is repeated.");
    }
    const std::size_t lengths = headers.count("Content-Length");
    if (lengths + headers.count("Transfer-Encoding") > 1) {
        return refusal(400, "The length of the body is ambiguous.");
    }
    const std::string length = headerIn(headers, "Content-Length").value_or("");
    if (lengths != 0 && (length.empty() || length.find_first_not_of("0123456789") != std::string::npos)) {
        return refusal(400, "Content-Length is not a number.");
    }
    const auto encoding = headerIn(headers, "Transfer-Encoding");
    if (encoding && !cim::sameName(*encoding, "chunked")) {
        return refusal(400, "The only supported transfer encoding is chunked.");
    }
    return std::nullopt;
}

std::optional<HttpResponse> checkBody(const Headers& headers, std::size_t largest) {
    if (lengthIn(headers).value_or(0) > largest) {
        return tooLarge(largest);
    }
    const auto encoding = headerIn(headers, "Content-Encoding");
    const auto type = headerIn(headers, "Content-Type");
    const bool isEncoded =
        headers.count("Content-Encoding") != 0 && !(encoding && cim::sameName(*encoding, "identity"));
    if (!type || !isUtf8Xml(*type) || isEncoded) {
        return refusal(415, "Send application/xml or text/xml in UTF-8.");
    }
    return std::nullopt;
}

std::optional<HttpResponse> checkExpectation(const Headers& headers) {
    if (headers.count("Expect") != 0 && !cim::sameName(headerIn(headers, "Expect").value_or(""), "100-continue")) {
        return refusal(417, "The only expectation that the server meets is 100-continue.");
    }
    return std::nullopt;
}

std::optional<HttpResponse> checkProtocol(const Headers& headers, const std::string& prefix) {
    if (headers.count(prefix + "CIMBatch") != 0) {
        return refusal(501, "Several operations in one message are not supported.", "multiple-requests-unsupported");
    }
    if (headers.count(prefix + "CIMExport") != 0) {
        return refusal(501, "Export messages are not supported.", "unsupported-operation");
    }
    const bool hasOperation = headers.count(prefix + "CIMOperation") != 0;
    if (!cim::sameName(headerIn(headers, prefix + "CIMOperation").value_or(""), "MethodCall")) {
        return refusal(400, "The header CIMOperation must be MethodCall.", hasOperation ? "unsupported-operation" : "");
    }
    const auto version = headerIn(headers, prefix + "CIMProtocolVersion");
    const bool hasVersion = headers.count(prefix + "CIMProtocolVersion") != 0;
    const bool isVersion1 = version && version->size() > 2 && version->rfind("1.", 0) == 0 &&
                            version->find_first_not_of("0123456789", 2) == std::string::npos;
    if (hasVersion && !isVersion1) {
        return refusal(400, "The header CIMProtocolVersion must be 1.0.", "unsupported-protocol-version");
    }
    return std::nullopt;
}

std::variant<CimHeaders, HttpResponse> cimHeaders(const Headers& headers, const std::string& prefix) {
    CimHeaders found;
    for (const auto& [name, target] : {std::pair{"CIMMethod", &found.method}, std::pair{"CIMObject", &found.object}}) {
        const auto value = headerIn(headers, prefix + name);
        const auto decoded = value ? percentDecoded(*value) : std::nullopt;
        if (!decoded) {
            return refusal(400, std::string("The header ") + name + " is missing or wrong.", "header-mismatch");
        }
        *target = *decoded;
    }
    return found;
}

}  // namespace

HttpResponse refusal(unsigned status, const std::string& why, const std::string& cimError) {
    HttpResponse response{status, {{"Content-Type", "text/plain; charset=utf-8"}}, why + "\n"};
    if (!cimError.empty()) {
        response.headers.emplace("CIMError", cimError);
    }
    return response;
}

HttpResponse tooLarge(std::size_t largest) {
    return refusal(413, "The request is larger than " + std::to_string(largest) + " bytes.");
}

std::optional<std::string> percentDecoded(const std::string& encoded) {
    std::string decoded;
    for (std::size_t at = 0; at < encoded.size(); ++at) {
        if (encoded[at] != '%') {
            decoded += encoded[at];
            continue;
        }
        unsigned byte = 0;
        const char* const first = encoded.data() + at + 1;
        if (at + 2 >= encoded.size() || std::from_chars(first, first + 2, byte, 16).ptr != first + 2) {
            return std::nullopt;
        }
        decoded += static_cast<char>(byte);
        at += 2;
    }
    return decoded;
}

std::string extensionPrefixOf(const HttpRequest& request) {
    const std::string man = headerIn(request.headers, "Man").value_or("");
    const std::string space = parameterOf(man, "ns");
    const bool isCim = request.method == "M-POST" && trimmed(man.substr(0, man.find(';'))) == mapping;
    const bool isNumber = space.size() == 2 && space.find_first_not_of("0123456789") == std::string::npos;
    return isCim && isNumber ? space + "-" : std::string{};
}

Headers extensionHeaders(const std::string& prefix) {
    // The HTTP library does not send a header without characters.
    return {{"Ext", " "}, {"Man", std::string(mapping) + " ; ns=" + prefix.substr(0, 2)}};
}

HttpResponse withExtension(HttpResponse response, const std::string& prefix) {
    if (prefix.empty()) {
        return response;
    }
    const Headers additional = extensionHeaders(prefix);
    response.headers.insert(additional.begin(), additional.end());
    if (const auto error = headerIn(response.headers, "CIMError")) {
        response.headers.erase("CIMError");
        response.headers.emplace(prefix + "CIMError", *error);
    }
    return response;
}

std::optional<std::uint64_t> lengthIn(const Headers& headers) {
    const auto length = headerIn(headers, "Content-Length");
    if (!length) {
        return std::nullopt;
    }
    std::uint64_t bytes = 0;
    const auto result = std::from_chars(length->data(), length->data() + length->size(), bytes);
    return result.ec == std::errc{} ? bytes : std::numeric_limits<std::uint64_t>::max();
}

bool mayHaveBody(const Headers& headers) {
    return checkFraming(headers) || headers.count("Transfer-Encoding") != 0 || lengthIn(headers).value_or(0) != 0;
}

std::variant<CimHeaders, HttpResponse> checkHeaders(const HttpRequest& request, const HeaderRules& rules) {
    const Headers& headers = request.headers;
    if (auto wrong = checkFraming(headers)) {
        return *wrong;
    }
    if (rules.requiresLocalHost && !isLocalHost(headerIn(headers, "Host").value_or(""))) {
        return refusal(403, "This server answers requests to localhost only.");
    }
    if (headers.count("Origin") != 0) {  // Browsers send it, CIM clients do not.
        return refusal(403, "This server does not answer requests of web pages.");
    }
    if (request.method == "OPTIONS") {
        return optionsResponse();
    }
    if (request.method != "POST" && request.method != "M-POST") {
        HttpResponse response = refusal(405, "Send POST or M-POST.");
        response.headers.emplace("Allow", permittedMethods);
        return response;
    }
    const std::string prefix = extensionPrefixOf(request);
    if (prefix.empty() && request.method == "M-POST") {
        return refusal(510, std::string("M-POST needs the header Man with ") + mapping + ".");
    }
    if (auto wrong = checkExpectation(headers)) {
        return *wrong;
    }
    if (auto wrong = checkProtocol(headers, prefix)) {
        return *wrong;
    }
    if (auto wrong = checkBody(headers, rules.largestBody)) {
        return *wrong;
    }
    return cimHeaders(headers, prefix);
}

std::optional<HttpResponse> checkAgreement(const CimHeaders& headers, const cimxml::Message& message) {
    if (!cim::sameName(headers.method, message.method)) {
        return refusal(400, "The header CIMMethod differs from the body.", "header-mismatch");
    }
    std::string object = headers.object;
    const std::size_t keys = object.find('.', object.find(':'));
    if (!message.isIntrinsic && keys != std::string::npos) {
        object.resize(keys);
    }
    object.erase(0, object.find_first_not_of('/'));
    if (!cim::sameName(object, message.object)) {
        return refusal(400, "The header CIMObject differs from the body.", "header-mismatch");
    }
    return std::nullopt;
}

}  // namespace cimhost::server

#include <array>
#include <optional>
#include <sstream>
#include <string>

#include "Bytes.h"
#include "HeaderModel.h"
#include "Target.h"
#include "cim/Names.h"
#include "server/Authentication.h"
#include "server/HeaderCheck.h"

// The head of an HTTP request. An input that begins with a byte outside of ASCII chooses values from the model's table,
// and the response must match the model. The input "pairs of Host" represents all pairs of a value of Host and a value
// of another header. Any other input is a head, with a line for the method and one per header: a refusal has a status,
// and an accepted request has all necessary headers.

namespace {

using namespace cimhost::server;
using fuzz::Bytes;
using fuzz::headerRows;
using fuzz::ModelRequest;
using fuzz::Refusal;
using fuzz::require;
using fuzz::requireSame;

constexpr std::array methods{"POST", "M-POST", "OPTIONS", "GET", "post"};
constexpr std::array prefixes{"", "73-", "74-"};

HttpRequest requestFrom(std::string_view text) {
    std::istringstream lines{std::string(text)};
    HttpRequest request;
    std::getline(lines, request.method);
    for (std::string line; std::getline(lines, line);) {
        const std::size_t colon = line.find(": ");
        if (colon != std::string::npos) {
            request.headers.emplace(line.substr(0, colon), line.substr(colon + 2));
        }
    }
    return request;
}

bool beginsWithOneOf(const std::string& value, std::initializer_list<std::string_view> beginnings) {
    const std::size_t first = value.find_first_not_of(" \t\"");
    for (const std::string_view each : beginnings) {
        if (first != std::string::npos && cim::sameName(value.substr(first, each.size()), each)) {
            return true;
        }
    }
    return false;
}

void requireComplete(const HttpRequest& request, const CimHeaders& accepted, bool requiresLocalHost) {
    const Headers& headers = request.headers;
    require(request.method == "POST" || request.method == "M-POST", "only two methods send operations");
    const std::string prefix = extensionPrefixOf(request);
    require(prefix.empty() == (request.method == "POST"), "M-POST has a prefix");
    require(headers.count("Origin") == 0, "web pages are refused");
    require(headers.count("Content-Length") <= 1, "the length is unambiguous");
    require(headers.count("Content-Length") == 0 || headers.count("Transfer-Encoding") == 0, "the body has one length");
    require(
        !requiresLocalHost || beginsWithOneOf(headerIn(headers, "Host").value_or(""), {"localhost", "127.", "[::1]"}),
        "the host is this machine");
    require(beginsWithOneOf(headerIn(headers, "Content-Type").value_or(""), {"text/xml", "application/xml"}),
            "the content is XML");
    const auto operation = headerIn(headers, prefix + "CIMOperation");
    require(operation && cim::sameName(*operation, "MethodCall"), "the operation is a method call");
    requireSame(accepted.object, *percentDecoded(*headerIn(headers, prefix + "CIMObject")), "decoded object");
}

void requireRefusal(const HttpResponse& response) {
    require(response.status == 200 || (response.status >= 400 && response.status < 600), "a response has a status");
    require((response.status == 405 || response.status == 200) == (response.headers.count("Allow") == 1),
            "a response with status 200 or 405 lists the methods");
    for (const auto& [name, value] : response.headers) {
        require(value.find_first_of("\r\n") == std::string::npos, "a client cannot add headers to the response");
    }
}

std::string described(const ModelRequest& model) {
    std::string head = model.method + "\n";
    for (const auto& [name, value] : model.request().headers) {
        head.append(name).append(": ").append(value).append("\n");
    }
    return head;
}

/** The reason for a refusal. In the response to a request with an extension, its header has the extension's prefix. */
Refusal refusalIn(const HttpResponse& response, const std::string& prefix) {
    require(prefix.empty() || response.headers.count("CIMError") == 0, "all headers have the prefix");
    return {response.status, headerIn(response.headers, prefix + "CIMError").value_or("")};
}

void requireModelsResponse(const ModelRequest& model) {
    const HttpRequest request = model.request();
    const auto refusals = model.refusals();
    const auto checked = checkHeaders(request, {model.requiresLocalHost, fuzz::largestBody});
    if (const auto* accepted = std::get_if<CimHeaders>(&checked)) {
        require(refusals.empty(), "a wrong header is refused\n" + described(model));
        requireSame(accepted->method, model.valueOf("CIMMethod").decoded, "decoded method");
        requireSame(accepted->object, model.valueOf("CIMObject").decoded, "decoded object");
        return;
    }
    const std::string prefix = extensionPrefixOf(request);
    const HttpResponse response = withExtension(std::get<HttpResponse>(checked), prefix);
    requireRefusal(response);
    const Refusal refusal = refusalIn(response, prefix);
    require(refusals.count(refusal) == 1,
            std::to_string(refusal.status) + " " + refusal.cimError + " has a reason\n" + described(model));
}

/** Chooses values, at least half of which are accepted on average. */
ModelRequest modelFrom(Bytes bytes) {
    ModelRequest model;
    const unsigned choice = bytes.byte();
    model.requiresLocalHost = (choice & 1U) == 0;
    model.method = (choice & 2U) == 0 ? methods[choice >> 2U & 1U] : bytes.pick(methods);
    model.prefix = (choice & 8U) == 0 ? prefixes[model.isExtended() ? 1 : 0] : bytes.pick(prefixes);
    for (std::size_t row = 0; row < model.values.size(); ++row) {
        const std::size_t value = bytes.byte();
        model.values[row] = value < 0x80 ? 0 : value % headerRows()[row].values.size();
    }
    return model;
}

/**
 * Checks every combination of values of one header and one other header. All remaining headers keep their first value.
 */
void requirePairs(ModelRequest model, std::size_t one) {
    const auto& rows = headerRows();
    for (std::size_t& chosen = model.values[one]; chosen < rows[one].values.size(); ++chosen) {
        for (std::size_t other = 0; other < rows.size(); ++other) {
            if (other != one) {
                for (std::size_t& value = model.values[other]; value < rows[other].values.size(); ++value) {
                    requireModelsResponse(model);
                }
                model.values[other] = 0;
            }
        }
    }
}

/** The header that an input names after "pairs of "; none for other inputs. */
std::optional<std::size_t> headerWhosePairs(std::string_view input) {
    for (std::size_t row = 0; row < headerRows().size(); ++row) {
        if (input == "pairs of " + headerRows()[row].name) {
            return row;
        }
    }
    return std::nullopt;
}

void requireRight(const HttpRequest& request, bool requiresLocalHost) {
    const auto checked = checkHeaders(request, {requiresLocalHost, fuzz::largestBody});
    if (const auto* accepted = std::get_if<CimHeaders>(&checked)) {
        requireComplete(request, *accepted, requiresLocalHost);
    } else {
        requireRefusal(withExtension(std::get<HttpResponse>(checked), extensionPrefixOf(request)));
    }
    const auto authorization = headerIn(request.headers, "Authorization");
    const auto credentials = authorization ? credentialsFrom(*authorization) : std::nullopt;
    require(!credentials || (!credentials->user.empty() && credentials->user.find(':') == std::string::npos),
            "a user has a name");
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    if (const auto header = headerWhosePairs(fuzz::inputOf(data, size))) {
        requirePairs({"POST", ""}, *header);
        requirePairs({"M-POST", "73-"}, *header);
    } else if (size > 0 && data[0] >= 0x80) {
        requireModelsResponse(modelFrom({data, size}));
    } else {
        requireRight(requestFrom(fuzz::inputOf(data, size)), size % 2 == 0);
    }
    return 0;
}

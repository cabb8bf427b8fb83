#include <sstream>
#include <string>

#include "Target.h"
#include "cim/Names.h"
#include "server/Authentication.h"
#include "server/HeaderCheck.h"

// The head of an HTTP request, a line for the method and one for each header: what is accepted has all that it must
// have, and what is refused has a status.

namespace {

using namespace cimhost::server;
using fuzz::require;
using fuzz::requireSame;

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

void requireComplete(const HttpRequest& request, const CimHeaders& accepted) {
    const Headers& headers = request.headers;
    require(request.method == "POST" || request.method == "M-POST", "only two methods send operations");
    const std::string prefix = extensionPrefixOf(request);
    require(prefix.empty() == (request.method == "POST"), "M-POST has a prefix");
    require(headers.count("Origin") == 0, "web pages are refused");
    require(headers.count("Content-Length") <= 1, "the length is unambiguous");
    require(headers.count("Content-Length") == 0 || headers.count("Transfer-Encoding") == 0, "the body has one length");
    const auto operation = headerIn(headers, prefix + "CIMOperation");
    require(operation && cim::sameName(*operation, "MethodCall"), "the operation is a method call");
    requireSame(accepted.object, *percentDecoded(*headerIn(headers, prefix + "CIMObject")), "decoded object");
}

void requireRefusal(const HttpResponse& response) {
    require(response.status == 200 || (response.status >= 400 && response.status < 600), "a response has a status");
    require(response.status != 405 || response.headers.count("Allow") == 1, "other methods are listed");
    for (const auto& [name, value] : response.headers) {
        require(value.find_first_of("\r\n") == std::string::npos, "a client cannot add headers to the response");
    }
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const HttpRequest request = requestFrom(fuzz::inputOf(data, size));
    const bool isLocal = size % 2 == 0;
    const auto checked = checkHeaders(request, {isLocal, 1000});
    if (const auto* accepted = std::get_if<CimHeaders>(&checked)) {
        requireComplete(request, *accepted);
    } else {
        requireRefusal(withExtension(std::get<HttpResponse>(checked), extensionPrefixOf(request)));
    }
    const auto authorization = headerIn(request.headers, "Authorization");
    const auto credentials = authorization ? credentialsFrom(*authorization) : std::nullopt;
    require(!credentials || (!credentials->user.empty() && credentials->user.find(':') == std::string::npos),
            "a user has a name");
    return 0;
}

#include <algorithm>

#include "cimxml/Errors.h"
#include "cimxml/Operations.h"
#include "cimxml/XmlWriter.h"

namespace cimhost::cimxml {
namespace {

// CIM status codes of the pull operations; CMPI does not name them.
constexpr int invalidEnumerationContext = 21;
constexpr int invalidOperationTimeout = 22;
constexpr int filteredEnumerationNotSupported = 25;
constexpr int continuationOnErrorNotSupported = 26;
constexpr int serverLimitsExceeded = 27;

void appendParameter(std::string& xml, std::string_view name, std::string_view type, std::string_view value) {
    const Element parameter(xml, "PARAMVALUE", [&] {
        appendAttribute(xml, "NAME", name);
        appendAttribute(xml, "PARAMTYPE", type);
    });
    const Element element(xml, "VALUE");
    appendEscaped(xml, value);
}

CimError unknownContext() {
    return {invalidEnumerationContext, "The enumeration is not open; it has ended, was closed or has timed out."};
}

void refuseUnsupported(const OperationArguments& arguments) {
    if (arguments.has("FilterQuery") || arguments.has("FilterQueryLanguage")) {
        throw CimError(filteredEnumerationNotSupported, "Filter queries are not supported.");
    }
    if (arguments.flag("ContinueOnError", false)) {
        throw CimError(continuationOnErrorNotSupported, "ContinueOnError is not supported.");
    }
}

}  // namespace

OperationResult Operations::open(const Call& call, ResultCursor cursor) {
    const EnumerationLimits& limits = options.limits;
    const auto asked = call.arguments.number("OperationTimeout");
    const std::chrono::seconds timeout =
        asked ? std::chrono::seconds(*asked) : std::min(limits.timeout, limits.longestTimeout);
    if (timeout > limits.longestTimeout || timeout.count() == 0) {  // 0 requests an enumeration without timeout
        throw CimError(invalidOperationTimeout, "OperationTimeout must be from 1 to " +
                                                    std::to_string(limits.longestTimeout.count()) + " seconds.");
    }
    return part(call, {std::move(cursor), call.arguments.nameSpace(), call.caller.principal, timeout}, "",
                call.arguments.number("MaxObjectCount").value_or(0));
}

OperationResult Operations::part(const Call& call, OpenEnumeration enumeration, const std::string& identifier,
                                 std::uint32_t most) {
    ResultCursor part{{}, enumeration.cursor.form, enumeration.cursor.parts};
    ResultCursor& from = enumeration.cursor;
    const std::size_t count = std::min<std::size_t>({from.left(), most, options.limits.mostObjects});
    const auto take = [&](auto& target, auto& source) {
        const auto first = source.begin() + static_cast<std::ptrdiff_t>(from.next);
        std::move(first, first + static_cast<std::ptrdiff_t>(count), std::back_inserter(target));
    };
    if (from.holdsPaths()) {
        take(part.results.paths, from.results.paths);
    } else {
        take(part.results.instances, from.results.instances);
    }
    from.next += count;
    OperationResult result = streamed(call, std::move(part));
    const bool isAtEnd = from.left() == 0;
    const std::string context = isAtEnd ? "" : keep(std::move(enumeration), identifier, result);
    appendParameter(result.parameters, "EnumerationContext", "string", context);
    appendParameter(result.parameters, "EndOfSequence", "boolean", isAtEnd ? "TRUE" : "FALSE");
    return result;
}

/** Keeps an enumeration. Its timeout starts when the result has been sent. @return its identifier */
std::string Operations::keep(OpenEnumeration enumeration, const std::string& identifier, OperationResult& result) {
    const auto context = enumerations.keep(std::move(enumeration), identifier, OpenEnumerations::Clock::now());
    if (!context) {
        throw CimError(serverLimitsExceeded,
                       "Too many enumerations are open, or they have too many results; try again later.");
    }
    result.sending = std::shared_ptr<void>(nullptr, [this, started = *context](std::nullptr_t) {
        enumerations.startTimeout(started, OpenEnumerations::Clock::now());
    });
    return *context;
}

OperationResult Operations::pull(const Call& call) {
    const std::string identifier = call.arguments.requiredString("EnumerationContext");
    const auto most = call.arguments.number("MaxObjectCount");
    if (!most) {
        throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, "Parameter MaxObjectCount is missing.");
    }
    const auto now = OpenEnumerations::Clock::now();
    std::optional<OpenEnumeration> found =
        enumerations.take(identifier, call.arguments.nameSpace(), call.caller.principal, now);
    if (!found) {
        throw unknownContext();
    }
    if (found->cursor.form != call.form) {
        enumerations.keep(std::move(*found), identifier, now);
        enumerations.startTimeout(identifier, now);
        throw CimError(invalidEnumerationContext, "This enumeration has results of the other kind.");
    }
    return part(call, std::move(*found), identifier, *most);
}

OperationResult Operations::closeEnumeration(const Call& call) {
    if (!enumerations.take(call.arguments.requiredString("EnumerationContext"), call.arguments.nameSpace(),
                           call.caller.principal, OpenEnumerations::Clock::now())) {
        throw unknownContext();
    }
    return {};
}

OperationResult Operations::openEnumeration(const Call& call) {
    refuseUnsupported(call.arguments);
    return open(call, enumeration(call));
}

OperationResult Operations::openTraversal(const Call& call) {
    refuseUnsupported(call.arguments);
    return open(call, traversal(call, call.arguments.path("InstanceName")));
}

}  // namespace cimhost::cimxml

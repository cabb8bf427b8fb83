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
    if (timeout > limits.longestTimeout || timeout.count() == 0) {  // 0 asks for an enumeration that never times out
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
    std::optional<std::string> context = "";
    const bool isAtEnd = from.left() == 0;
    if (!isAtEnd) {
        context = enumerations.keep(std::move(enumeration), identifier, OpenEnumerations::Clock::now());
    }
    if (!context) {
        throw CimError(serverLimitsExceeded, "Too many enumerations are open; try again later.");
    }
    appendParameter(result.parameters, "EnumerationContext", "string", *context);
    appendParameter(result.parameters, "EndOfSequence", "boolean", isAtEnd ? "TRUE" : "FALSE");
    return result;
}

OperationResult Operations::pull(const Call& call, bool paths) {
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
    if (found->cursor.holdsPaths() != paths) {
        enumerations.keep(std::move(*found), identifier, now);
        throw CimError(invalidEnumerationContext, "This enumeration has results of the other kind.");
    }
    return part(call, std::move(*found), identifier, *most);
}

OperationResult Operations::pullInstancesWithPath(const Call& call) {
    return pull(call, false);
}

OperationResult Operations::pullInstancePaths(const Call& call) {
    return pull(call, true);
}

OperationResult Operations::closeEnumeration(const Call& call) {
    if (!enumerations.take(call.arguments.requiredString("EnumerationContext"), call.arguments.nameSpace(),
                           call.caller.principal, OpenEnumerations::Clock::now())) {
        throw unknownContext();
    }
    return {};
}

OperationResult Operations::openEnumerateInstances(const Call& call) {
    refuseUnsupported(call.arguments);
    const InstanceParts parts = partsOf(call, !call.arguments.flag("DeepInheritance", true));
    return open(call, {performEnumeration(call, Operation::enumerateInstances), ObjectForm::instanceWithPath, parts});
}

OperationResult Operations::openEnumerateInstancePaths(const Call& call) {
    refuseUnsupported(call.arguments);
    return open(call, {performEnumeration(call, Operation::enumerateInstanceNames), ObjectForm::instancePath});
}

OperationResult Operations::openAssociatorInstances(const Call& call) {
    refuseUnsupported(call.arguments);
    return open(call, {performAssociation(call, Operation::associators, call.arguments.path("InstanceName")),
                       ObjectForm::instanceWithPath, partsOf(call, false)});
}

OperationResult Operations::openAssociatorInstancePaths(const Call& call) {
    refuseUnsupported(call.arguments);
    return open(call, {performAssociation(call, Operation::associatorNames, call.arguments.path("InstanceName")),
                       ObjectForm::instancePath});
}

OperationResult Operations::openReferenceInstances(const Call& call) {
    refuseUnsupported(call.arguments);
    return open(call, {performAssociation(call, Operation::references, call.arguments.path("InstanceName")),
                       ObjectForm::instanceWithPath, partsOf(call, false)});
}

OperationResult Operations::openReferenceInstancePaths(const Call& call) {
    refuseUnsupported(call.arguments);
    return open(call, {performAssociation(call, Operation::referenceNames, call.arguments.path("InstanceName")),
                       ObjectForm::instancePath});
}

}  // namespace cimhost::cimxml

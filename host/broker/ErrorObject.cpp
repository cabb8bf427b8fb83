#include "broker/Encapsulation.h"
#include "broker/FunctionTables.h"

namespace cimhost {
namespace {

template <auto member>
auto getPlain(const CMPIError* error, CMPIStatus* rc) {
    using Plain = std::decay_t<decltype(std::declval<ErrorInfo>().*member)>;
    return guarded<Plain>(rc, ErrorInfo{}.*member, [&] { return content(error).*member; });
}

template <auto member>
CMPIStatus setPlain(CMPIError* error, const std::decay_t<decltype(std::declval<ErrorInfo>().*member)> value) {
    return guarded([&] { content(error).*member = value; });
}

template <std::optional<std::string> ErrorInfo::*member>
CMPIString* getString(const CMPIError* error, CMPIStatus* rc) {
    return guarded<CMPIString*>(rc, nullptr, [&]() -> CMPIString* {
        const auto& object = self(error);
        const std::optional<std::string>& value = (*object.content).*member;
        return value ? arenaFor(object).make<CMPIString>(*value) : nullptr;
    });
}

template <std::optional<std::string> ErrorInfo::*member>
CMPIStatus setString(CMPIError* error, const char* value) {
    return guarded([&] { content(error).*member = optionalString(value); });
}

using Strings = std::optional<std::vector<std::string>>;

template <Strings ErrorInfo::*member>
CMPIArray* getStrings(const CMPIError* error, CMPIStatus* rc) {
    return guarded<CMPIArray*>(rc, nullptr, [&]() -> CMPIArray* {
        const auto& object = self(error);
        const Strings& strings = (*object.content).*member;
        if (!strings) {
            return nullptr;
        }
        return arenaFor(object).make<CMPIArray>({CMPI_string, {strings->begin(), strings->end()}});
    });
}

/** Converts an array of strings. Null elements become empty strings. */
Strings stringsFrom(const CMPIArray* array) {
    if (array == nullptr) {
        return std::nullopt;
    }
    const ArrayContent& from = argument(array);
    if (from.type != CMPI_string) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    std::vector<std::string> strings;
    for (const Scalar& element : from.elements) {
        const auto* string = std::get_if<std::string>(&element);
        strings.push_back(string == nullptr ? std::string{} : *string);
    }
    return strings;
}

template <Strings ErrorInfo::*member, class Array>
CMPIStatus setStrings(CMPIError* error, Array* array) {
    return guarded([&] { content(error).*member = stringsFrom(array); });
}

}  // namespace

const CMPIErrorFT errorTable{tableVersion,
                             releaseObject<CMPIError>,
                             cloneObject<CMPIError>,
                             getPlain<&ErrorInfo::type>,
                             getString<&ErrorInfo::otherType>,
                             getString<&ErrorInfo::owningEntity>,
                             getString<&ErrorInfo::messageId>,
                             getString<&ErrorInfo::message>,
                             getPlain<&ErrorInfo::severity>,
                             getPlain<&ErrorInfo::probableCause>,
                             getString<&ErrorInfo::probableCauseDescription>,
                             getStrings<&ErrorInfo::recommendedActions>,
                             getString<&ErrorInfo::source>,
                             getPlain<&ErrorInfo::sourceFormat>,
                             getString<&ErrorInfo::otherSourceFormat>,
                             getPlain<&ErrorInfo::statusCode>,
                             getString<&ErrorInfo::statusCodeDescription>,
                             getStrings<&ErrorInfo::messageArguments>,
                             setPlain<&ErrorInfo::type>,
                             setString<&ErrorInfo::otherType>,
                             setString<&ErrorInfo::probableCauseDescription>,
                             setStrings<&ErrorInfo::recommendedActions, const CMPIArray>,
                             setString<&ErrorInfo::source>,
                             setPlain<&ErrorInfo::sourceFormat>,
                             setString<&ErrorInfo::otherSourceFormat>,
                             setString<&ErrorInfo::statusCodeDescription>,
                             setStrings<&ErrorInfo::messageArguments, CMPIArray>};

}  // namespace cimhost

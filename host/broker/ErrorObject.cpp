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
CMPIString* getText(const CMPIError* error, CMPIStatus* rc) {
    return guarded<CMPIString*>(rc, nullptr, [&]() -> CMPIString* {
        const auto& object = self(error);
        const std::optional<std::string>& text = (*object.content).*member;
        return text ? arenaFor(object).make<CMPIString>(*text) : nullptr;
    });
}

template <std::optional<std::string> ErrorInfo::*member>
CMPIStatus setText(CMPIError* error, const char* text) {
    return guarded([&] { content(error).*member = text == nullptr ? std::nullopt : std::optional<std::string>(text); });
}

using Texts = std::optional<std::vector<std::string>>;

template <Texts ErrorInfo::*member>
CMPIArray* getTexts(const CMPIError* error, CMPIStatus* rc) {
    return guarded<CMPIArray*>(rc, nullptr, [&]() -> CMPIArray* {
        const auto& object = self(error);
        const Texts& texts = (*object.content).*member;
        if (!texts) {
            return nullptr;
        }
        return arenaFor(object).make<CMPIArray>({CMPI_string, {texts->begin(), texts->end()}});
    });
}

/** Null elements become empty texts. */
Texts textsFrom(const CMPIArray* array) {
    if (array == nullptr) {
        return std::nullopt;
    }
    const ArrayContent& from = argument(array);
    if (from.type != CMPI_string) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    std::vector<std::string> texts;
    for (const Scalar& element : from.elements) {
        const auto* text = std::get_if<std::string>(&element);
        texts.push_back(text == nullptr ? std::string{} : *text);
    }
    return texts;
}

CMPIStatus setRecommendedActions(CMPIError* error, const CMPIArray* actions) {
    return guarded([&] { content(error).recommendedActions = textsFrom(actions); });
}

CMPIStatus setMessageArguments(CMPIError* error, CMPIArray* arguments) {
    return guarded([&] { content(error).messageArguments = textsFrom(arguments); });
}

}  // namespace

const CMPIErrorFT errorTable{tableVersion,
                             releaseObject<CMPIError>,
                             cloneObject<CMPIError>,
                             getPlain<&ErrorInfo::type>,
                             getText<&ErrorInfo::otherType>,
                             getText<&ErrorInfo::owningEntity>,
                             getText<&ErrorInfo::messageId>,
                             getText<&ErrorInfo::message>,
                             getPlain<&ErrorInfo::severity>,
                             getPlain<&ErrorInfo::probableCause>,
                             getText<&ErrorInfo::probableCauseDescription>,
                             getTexts<&ErrorInfo::recommendedActions>,
                             getText<&ErrorInfo::source>,
                             getPlain<&ErrorInfo::sourceFormat>,
                             getText<&ErrorInfo::otherSourceFormat>,
                             getPlain<&ErrorInfo::statusCode>,
                             getText<&ErrorInfo::statusCodeDescription>,
                             getTexts<&ErrorInfo::messageArguments>,
                             setPlain<&ErrorInfo::type>,
                             setText<&ErrorInfo::otherType>,
                             setText<&ErrorInfo::probableCauseDescription>,
                             setRecommendedActions,
                             setText<&ErrorInfo::source>,
                             setPlain<&ErrorInfo::sourceFormat>,
                             setText<&ErrorInfo::otherSourceFormat>,
                             setText<&ErrorInfo::statusCodeDescription>,
                             setMessageArguments};

}  // namespace cimhost

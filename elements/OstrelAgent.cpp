#include "OstrelAgent.h"

#include <algorithm>
#include <array>

#include "KO/Exceptions.h"
#include "KO/File.h"
#include "KO/PlatformUtilities.h"
#include "KO/Product.h"
#include "KO/Strings.h"
#include "Trace.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerOstrelAgent = LoggerNames::loggerName(LoggerNames::shortened);

namespace {

const TraceSource traceSource{loggerOstrelAgent, "OstrelAgent.cpp"};

constexpr const char* agentCaption = "VEL Ostrel";

/** The marker file's name. Only the existence of the file matters, not its content. */
constexpr const wchar_t* markerFileName = L"version.lv1";
constexpr const wchar_t* markedSuffix = L" Tarvik Agent";

std::string displayName() {
    std::wstring name = Product::getName();
    if (File::exists(make_wstring(PlatformUtilities::getKelsaDirectory()) + markerFileName)) {
        name += markedSuffix;
    }
    return make_string(name);
}

/** The getter of the value that a filter of a type is compared with. */
struct ComparedValue {
    OstrelAgent::FilterType type;
    std::string (OstrelAgent::*get)() const;
};

constexpr std::array<ComparedValue, 5> comparedValues{{
    {OstrelAgent::FILTER_NAME, &OstrelAgent::getName},
    {OstrelAgent::FILTER_IDENTIFYING_NUMBER, &OstrelAgent::getIdentifyingNumber},
    {OstrelAgent::FILTER_PRODUCT_NAME, &OstrelAgent::getProductName},
    {OstrelAgent::FILTER_VENDOR, &OstrelAgent::getVendor},
    {OstrelAgent::FILTER_VERSION, &OstrelAgent::getVersion},
}};

}  // namespace

OstrelAgent::OstrelAgent() {
    const Traced traced(at(traceSource));
}

OstrelAgent::operator bool() const {
    const Traced traced(at(traceSource));
    return !_Done;
}

void OstrelAgent::operator++() {
    const Traced traced(at(traceSource));
    _Done = true;
}

void OstrelAgent::setFilter(FilterType type, std::string value) const {
    const Traced traced(at(traceSource, Level::error), label::filterTypeBare, type, label::keyValue, value);
    const auto ofType = [&](const ComparedValue& compared) { return compared.type == type; };
    const auto compared = std::find_if(comparedValues.begin(), comparedValues.end(), ofType);
    if (compared != comparedValues.end() && (this->*compared->get)() != value) {
        fail<InstrumentationException>(at(traceSource), "Could not find specified Agent.");
    }
}

std::string OstrelAgent::getName() const {
    const Traced traced(at(traceSource));
    return displayName();
}

std::string OstrelAgent::getProductName() const {
    const Traced traced(at(traceSource));
    return displayName();
}

std::string OstrelAgent::getVersion() const {
    const Traced traced(at(traceSource));
    return make_string(Product::getVersion());
}

std::string OstrelAgent::getBuildNumber() const {
    const Traced traced(at(traceSource));
    return make_string(Product::getBuildNumber());
}

std::string OstrelAgent::getIdentifyingNumber() const {
    const Traced traced(at(traceSource));
    return make_string(Product::getIdentifyingNumber());
}

std::string OstrelAgent::getVendor() const {
    const Traced traced(at(traceSource));
    return make_string(Product::getVendor());
}

std::string OstrelAgent::getCaption() const {
    const Traced traced(at(traceSource));
    return agentCaption;
}

std::string OstrelAgent::getDescription() const {
    const Traced traced(at(traceSource));
    return agentCaption;
}

std::string OstrelAgent::getStatus() const {
    const Traced traced(at(traceSource));
    return "OK";
}

}  // namespace KO::LeaseWarrantyProvider

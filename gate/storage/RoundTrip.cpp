#include "RoundTrip.h"

#include <algorithm>
#include <string_view>

#include "KO/Settings.h"
#include "cim/DateTime.h"

namespace gate {

namespace {

bool hasWhiteSpace(std::string_view value) {
    return value.find_first_of("\t\n\v\f\r") != std::string_view::npos;
}

bool hasOuterBlank(std::string_view value) {
    return !value.empty() && (value.front() == ' ' || value.back() == ' ');
}

/** A kind of strings that a record file loses. */
struct Rule {
    bool (*isLost)(std::string_view value);
    bool alsoIdentifiers;
    const char* reason;
};

constexpr Rule rules[] = {
    {[](std::string_view value) { return value.find('_') != std::string_view::npos; }, true,
     "an underscore is read back as a blank"},
    {hasWhiteSpace, true, "a tab or line break corrupts the data file's records"},
    {hasOuterBlank, true, "object managers remove blanks at its ends"},
    {[](std::string_view value) { return value.find("  ") != std::string_view::npos; }, true,
     "adjacent blanks may become one on the way to and from clients"},
    {[](std::string_view value) { return value == "*"; }, false, "\"*\" represents an empty value"},
    {[](std::string_view value) { return value.size() == 1; }, false, "a value of one character is lost"},
};

const char* lossOf(const DataFile& file, const Property& property, const std::string& value) {
    if (property.type == CMPI_dateTime) {
        return value == cim::noDate || isRepresentable(file, value) ? nullptr : "it is not a valid datetime";
    }
    if (property.type != CMPI_string || !file.hasRecords) {
        return nullptr;
    }
    for (const Rule& rule : rules) {
        if ((rule.alsoIdentifiers || !property.isKey) && rule.isLost(value)) {
            return rule.reason;
        }
    }
    return nullptr;
}

bool refusesLossyValues() {
    // Older agents have no such setting, which means true.
    return &KO::Settings::getFlag == nullptr || KO::Settings::getFlag("gate.refuse_lossy_values", true);
}

}  // namespace

bool isRepresentable(const DataFile& file, const std::string& dateTime) {
    return cim::isPointInTime(dateTime) || (file.hasRecords && cim::isInterval(dateTime));
}

bool survivesRoundTrip(const DataFile& file, const Property& property, const std::string& value) {
    return lossOf(file, property, value) == nullptr;
}

void requireRoundTrip(const DataFile& file, const Property& property, const std::string& value) {
    const char* loss = lossOf(file, property, value);
    if (loss != nullptr && refusesLossyValues()) {
        fail(CMPI_RC_ERR_INVALID_PARAMETER, std::string(file.className) + '.' + property.name + ": the value \"" +
                                                value + "\" cannot be stored unchanged: " + loss + ".");
    }
}

void requireRoundTrip(const DataFile& file, const Values& values) {
    for (const auto& [property, value] : values) {
        if (property->isWritable) {
            requireRoundTrip(file, *property, value);
        }
    }
}

}  // namespace gate

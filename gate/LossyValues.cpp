#include "LossyValues.h"

#include "Failure.h"
#include "KO/Settings.h"
#include "KO/Utils.h"

#include <algorithm>
#include <string_view>

namespace gate {

namespace {

bool hasWhiteSpace(std::string_view text) {
    return text.find_first_of("\t\n\v\f\r") != std::string_view::npos;
}

bool hasOuterBlank(std::string_view text) {
    return !text.empty() && (text.front() == ' ' || text.back() == ' ');
}

/** A rule of what a text in a record file must not be. */
struct Rule {
    bool (*isBroken)(std::string_view text);
    bool isOfIdentifiers;  ///< whether it holds for an identifier too
    const char* reason;
};

constexpr Rule textRules[] = {
    {[](std::string_view text) { return text.find('_') != std::string_view::npos; }, true,
     "an underscore comes back as a blank"},
    {hasWhiteSpace, true, "a tab or line break tears the data file's records apart"},
    {hasOuterBlank, true, "object managers take blanks off its ends"},
    {[](std::string_view text) { return text.find("  ") != std::string_view::npos; }, true,
     "blanks one after another may become one on their way to and from clients"},
    {[](std::string_view text) { return text == "*"; }, false, "\"*\" stands for no text"},
    {[](std::string_view text) { return text.size() == 1; }, false, "a text of one character is lost"},
};

bool isDigits(std::string_view text) {
    return std::all_of(text.begin(), text.end(), [](char each) { return each >= '0' && each <= '9'; });
}

bool isInterval(std::string_view text) {
    constexpr std::size_t length = 25;
    return text.size() == length && isDigits(text.substr(0, 14)) && text[14] == '.' && isDigits(text.substr(15, 6)) &&
           text.substr(21) == ":000" && text.substr(8, 2) < "24" && text.substr(10, 2) < "60" &&
           text.substr(12, 2) < "60";
}

/** The framework makes a date of a text and a text of the date: a valid one comes back. */
bool isPointInTime(const std::string& text) {
    return text != noDate && KO::Utils::convertCIMDateTime(KO::Utils::convertStringToDateTime(text)) == text;
}

const char* lossOf(const DataFile& file, const Property& property, const std::string& text) {
    if (property.type == CMPI_dateTime) {
        return text == noDate || isShown(file, text) ? nullptr : "it is not a valid datetime";
    }
    if (property.type != CMPI_string || !file.keepsRecords()) {
        return nullptr;
    }
    for (const Rule& rule : textRules) {
        if ((rule.isOfIdentifiers || !property.isKey) && rule.isBroken(text)) {
            return rule.reason;
        }
    }
    return nullptr;
}

}  // namespace

bool isShown(const DataFile& file, const std::string& dateTime) {
    return isPointInTime(dateTime) || (file.keepsRecords() && isInterval(dateTime));
}

bool isKept(const DataFile& file, const Property& property, const std::string& text) {
    return lossOf(file, property, text) == nullptr;
}

bool refusesLossyValues() {
    // An agent whose framework has no such operation refuses.
    return &KO::Settings::getFlag == nullptr || KO::Settings::getFlag("gate.refuse_lossy_values", true);
}

void requireKept(const DataFile& file, const Property& property, const std::string& text) {
    const char* loss = lossOf(file, property, text);
    if (loss != nullptr && refusesLossyValues()) {
        fail(CMPI_RC_ERR_INVALID_PARAMETER, std::string(file.className) + '.' + property.name + ": the value \"" +
                                                text + "\" would not be kept: " + loss + ".");
    }
}

void requireKept(const DataFile& file, const Values& values) {
    for (const auto& [property, text] : values) {
        if (property->isWritable) {
            requireKept(file, *property, text);
        }
    }
}

}  // namespace gate

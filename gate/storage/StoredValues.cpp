#include "StoredValues.h"

#include <algorithm>
#include <iterator>
#include <string_view>
#include <utility>

#include "KO/Settings.h"
#include "cim/DateTime.h"

namespace gate {

namespace {

/** Whether the property is part of a personalized pair. The provider copies a missing value from the preceding pair. */
bool isPersonalized(const Property& property) {
    constexpr std::string_view prefix = "Personalized";
    return sameName(std::string_view(property.name).substr(0, prefix.size()), prefix);
}

bool isDate(const Property& property) {
    return property.type == CMPI_dateTime;
}

bool isAmong(const Property& property, const Values& values) {
    return std::any_of(values.begin(), values.end(), [&](const auto& value) { return value.first == &property; });
}

/** The value in the data file. The provider returns "Null" for a personalized value that is empty in the file. */
std::string storedValue(const Property& property, const std::string& returned) {
    return isPersonalized(property) && returned == "Null" ? std::string() : returned;
}

/** The datetime with the offset "-000" instead of "+000", which is equal. */
std::string normalized(std::string dateTime) {
    const std::size_t plus = dateTime.find("+000");
    return plus == std::string::npos ? dateTime : dateTime.replace(plus, 1, "-");
}

/** The value without blanks at its ends, which object managers trim. Some also trim non-ASCII letters there. */
std::string_view trimmed(std::string_view value, bool alsoNonAscii) {
    const auto stays = [&](unsigned char each) { return each > ' ' && !(alsoNonAscii && each > 0x7F); };
    const auto* begin = std::find_if(value.begin(), value.end(), stays);
    const auto end = std::find_if(value.rbegin(), std::string_view::reverse_iterator(begin), stays).base();
    return value.substr(static_cast<std::size_t>(begin - value.begin()), static_cast<std::size_t>(end - begin));
}

/**
 * Whether a given value is the current one, apart from what the object manager has trimmed. For a writable property on
 * the property list, a missing non-ASCII letter at an end is a change.
 */
bool isCurrent(const Property& property, const CMPIInstance* current, const std::string& given, bool isListed) {
    const auto value = propertyOf(current, property);
    if (isDate(property)) {
        return normalized(value.value_or(std::string(cim::noDate))) == normalized(given);
    }
    if (!value) {
        return !property.isWritable && property.type == CMPI_string && given.empty();
    }
    if (storedValue(property, *value) == storedValue(property, given)) {
        return true;
    }
    const bool mayLackLetters = !property.isWritable || !isListed;
    return property.type == CMPI_string &&
           (trimmed(*value, false) == given || (mayLackLetters && trimmed(*value, true) == given));
}

/** The reason why a record file or an object manager does not preserve a string; null if both preserve it. */
const char* lossOfString(std::string_view value, bool isIdentifier) {
    const auto has = [&](const char* characters) { return value.find_first_of(characters) != std::string_view::npos; };
    const bool hasOuterBlank = !value.empty() && (value.front() == ' ' || value.back() == ' ');
    const std::pair<bool, const char*> losses[] = {
        {has("_"), "an underscore is read back as a blank"},
        {has("\t\n\v\f\r"), "a tab or line break corrupts the data file's records"},
        {hasOuterBlank, "object managers remove blanks at its ends"},
        {value.find("  ") != std::string_view::npos, "adjacent blanks may become one on the way to and from clients"},
        {!isIdentifier && value == "*", "\"*\" represents an empty value"},
        {!isIdentifier && value.size() == 1, "a value of one character is lost"},
        {true, nullptr},
    };
    return std::find_if(std::begin(losses), std::end(losses), [](const auto& loss) { return loss.first; })->second;
}

/** Whether the provider returns a datetime after it was stored. If not, it returns null. */
bool isRepresentable(const DataFile& file, const std::string& dateTime) {
    return cim::isPointInTime(dateTime) || (file.hasRecords && cim::isInterval(dateTime));
}

/** The reason why a value does not survive the round trip; null if it does. */
const char* lossOf(const DataFile& file, const Property& property, const std::string& value) {
    if (isDate(property)) {
        return value == cim::noDate || isRepresentable(file, value) ? nullptr : "it is not a valid datetime";
    }
    return property.type == CMPI_string && file.hasRecords ? lossOfString(value, property.isKey) : nullptr;
}

bool refusesLossyValues() {
    // Older agents lack this function and the setting, whose default is true.
    return &KO::Settings::getFlag == nullptr || KO::Settings::getFlag("gate.refuse_lossy_values", true);
}

/** Whether the changes remove a value. Two properties may share one value in the file. */
bool isRemoved(const std::string& value, const DataFile& file, const CMPIInstance* before, const Values& changes) {
    return std::any_of(changes.begin(), changes.end(), [&](const auto& change) {
        const bool isNullDate = isDate(*change.first) && !isRepresentable(file, change.second);
        return (change.second.empty() || isNullDate) && propertyOf(before, *change.first) == value;
    });
}

void requireNothingLost(const Class& requested, const DataFile& file, const CMPIInstance* before,
                        const CMPIInstance* after, const Values& changes) {
    for (const Property& property : requested) {
        const std::string value = propertyOf(before, property).value_or(std::string());
        const std::string now = propertyOf(after, property).value_or(std::string());
        const bool isLost = storedValue(property, now).empty() && !storedValue(property, value).empty();
        failIf(isLost && !isAmong(property, changes) && !isRemoved(value, file, before, changes), CMPI_RC_ERR_FAILED,
               property.name, " was lost: the data file could not be read.");
    }
}

}  // namespace

void requireRoundTrip(const DataFile& file, const Values& values) {
    for (const auto& [property, value] : values) {
        const char* loss = property->isKey || property->isWritable ? lossOf(file, *property, value) : nullptr;
        failIf(loss != nullptr && refusesLossyValues(), CMPI_RC_ERR_INVALID_PARAMETER, file.name, '.', property->name,
               ": the value \"", value, "\" cannot be stored unchanged: ", loss, ".");
    }
}

Values diff(const CMPIInstance* current, const Values& given, bool areListed) {
    Values changes;
    for (const auto& [property, value] : given) {
        const bool isClock = sameName(property->name, "LocalDateTime");  // a client always sends back an old value
        if (isClock || isCurrent(*property, current, value, areListed)) {
            continue;
        }
        failIf(!property->isWritable, CMPI_RC_ERR_INVALID_PARAMETER, property->name,
               " is read-only. Omit it, or send it back unchanged.");
        const bool isNoDate = isDate(*property) && cim::isNoDate(value);
        changes.emplace_back(property, isNoDate ? std::string(cim::noDate) : value);
    }
    return changes;
}

Values valuesToSend(const Class& requested, const CMPIInstance* current, const Values& changes) {
    Values values = changes;
    for (const Property& property : requested) {
        if (!isPersonalized(property) || isAmong(property, changes)) {
            continue;
        }
        const auto value = propertyOf(current, property);
        // These properties are never null, unless the provider could not read the file.
        failIf(!value, CMPI_RC_ERR_FAILED, property.name, " cannot be read, so nothing is changed.");
        values.emplace_back(&property, storedValue(property, *value));
    }
    return values;
}

bool altersFile(const DataFile& file, const CMPIInstance* current, const Values& changes) {
    return std::any_of(changes.begin(), changes.end(), [&](const auto& change) {
        const auto& [property, value] = change;
        const char* null = isDate(*property) ? cim::noDate.data() : property->type == CMPI_string ? "" : "0";
        const std::string before = propertyOf(current, *property).value_or(null);
        return before != value && lossOf(file, *property, before) == nullptr &&
               lossOf(file, *property, value) == nullptr;
    });
}

void requireChanged(const Class& requested, const DataFile& file, const CMPIInstance* before, const CMPIInstance* after,
                    const Values& changes) {
    requireNothingLost(requested, file, before, after, changes);
    for (const auto& [property, value] : changes) {
        const auto now = propertyOf(after, *property);
        const bool isEqual = now && (isDate(*property) ? normalized(*now) == normalized(value) : *now == value);
        const bool isNull = !now && isDate(*property) && !isRepresentable(file, value);
        // For an empty value, the provider may return "Null". It suffices that the value is not the former one.
        const bool isEmptied = value.empty() && now != propertyOf(before, *property);
        failIf(!isEqual && !isNull && !isEmptied, CMPI_RC_ERR_FAILED, property->name,
               " could not be stored; see the agent's log at level 3000.");
    }
}

}  // namespace gate

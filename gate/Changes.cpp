#include "Changes.h"

#include "Calls.h"
#include "LossyValues.h"

#include <algorithm>
#include <string_view>

namespace gate {

namespace {

/** Goes on by itself: what a client sends back is always of yesterday. */
constexpr const char* movingProperty = "LocalDateTime";

/** Properties of which the provider takes one that it is not given from the one before it. */
constexpr std::string_view chainedProperties = "Personalized";

/** How the provider shows an empty one of them. */
constexpr const char* shownForEmpty = "Null";

bool isChained(const Property& property) {
    return sameName(std::string_view(property.name).substr(0, chainedProperties.size()), chainedProperties);
}

bool isAmong(const Property& property, const Values& values) {
    return std::any_of(values.begin(), values.end(), [&](const auto& value) { return value.first == &property; });
}

/** What is stored where the provider shows a text. */
std::string stored(const Property& property, const std::string& shown) {
    return isChained(property) && shown == shownForEmpty ? std::string() : shown;
}

/** How a file of records has a property without a value. */
std::string noValueOf(const Property& property) {
    return property.type == CMPI_dateTime ? noDate : property.type == CMPI_string ? "" : "0";
}

/** A datetime in one of the ways to write it: no date and no offset have two. */
std::string uniform(const std::string& dateTime) {
    constexpr std::string_view noOffset = "+000";
    const std::size_t offset = std::string_view(noDate).size() - noOffset.size();
    const bool isOther = dateTime.size() == offset + noOffset.size() && dateTime.compare(offset, 4, noOffset) == 0;
    return isOther ? dateTime.substr(0, offset) + "-000" : dateTime;
}

/** A text without what object managers take off its ends: all of them blanks, some also what is outside of ASCII. */
std::string_view trimmed(std::string_view text, bool alsoOutsideAscii) {
    const auto stays = [&](unsigned char each) { return each > ' ' && !(alsoOutsideAscii && each > 0x7F); };
    const auto* begin = std::find_if(text.begin(), text.end(), stays);
    const auto end = std::find_if(text.rbegin(), std::string_view::reverse_iterator(begin), stays).base();
    return text.substr(static_cast<std::size_t>(begin - text.begin()), static_cast<std::size_t>(end - begin));
}

/**
 * Whether a given value is the current one, such as a client has read it and an object manager has passed it on.
 * One that can be changed, and that the client has listed, may really be the current one without its last letter.
 */
bool isAsItWas(const Property& property, const CMPIInstance* current, const std::string& given, bool isListed) {
    const auto text = propertyOf(current, property);
    if (property.type == CMPI_dateTime) {
        return uniform(text.value_or(noDate)) == uniform(given);
    }
    if (!text) {
        return !property.isWritable && property.type == CMPI_string && given.empty();
    }
    if (stored(property, *text) == stored(property, given)) {
        return true;
    }
    const bool mayLackLetters = !property.isWritable || !isListed;
    return property.type == CMPI_string &&
           (trimmed(*text, false) == given || (mayLackLetters && trimmed(*text, true) == given));
}

/** Refuses names that the class does not have. */
void requireKnownProperties(const Class& owner, const CMPIInstance* instance) {
    const auto count = ask<&CMPIInstanceFT::getPropertyCount>(instance);
    require(count.isOk(), "count the properties of the instance", count.status);
    for (CMPICount index = 0; index < count.value; ++index) {
        CMPIString* nameString = nullptr;
        ask<&CMPIInstanceFT::getPropertyAt>(instance, index, &nameString);
        const std::string name = textOf(nameString);
        require(!name.empty(), "name a property of the instance");
        if (findProperty(owner, name) == nullptr) {
            fail(CMPI_RC_ERR_NO_SUCH_PROPERTY, std::string(owner.name) + " has no property " + name + ".");
        }
    }
}

}  // namespace

Values givenValues(const Class& owner, const CMPIInstance* instance, const PropertyList& list) {
    requireKnownProperties(owner, instance);
    Values values;
    for (const Property& property : owner) {
        if (!list.has(property)) {
            continue;
        }
        if (const auto text = propertyOf(instance, property)) {
            values.emplace_back(&property, *text);
        }
    }
    return values;
}

Values changesTo(const CMPIInstance* current, const Values& given, bool areListed) {
    Values changes;
    for (const auto& [property, text] : given) {
        if (sameName(property->name, movingProperty) || isAsItWas(*property, current, text, areListed)) {
            continue;
        }
        if (!property->isWritable) {
            fail(CMPI_RC_ERR_INVALID_PARAMETER,
                 std::string(property->name) + " cannot be changed. Leave it out, or send it back as it is.");
        }
        const bool isNoDate = property->type == CMPI_dateTime && uniform(text) == noDate;
        changes.emplace_back(property, isNoDate ? noDate : text);
    }
    return changes;
}

Values changed(const Class& owner, const CMPIInstance* current, const Values& changes) {
    Values values = changes;
    for (const Property& property : owner) {
        if (!isChained(property) || isAmong(property, changes)) {
            continue;
        }
        const auto text = propertyOf(current, property);
        if (!text) {
            // Each of them has a value: without it, the provider cannot have read its file.
            fail(CMPI_RC_ERR_FAILED, std::string(property.name) + " cannot be read, so nothing is changed.");
        }
        values.emplace_back(&property, stored(property, *text));
    }
    return values;
}

Values undoing(const Class& owner, const DataFile& file, const Values& changes, const CMPIInstance* current) {
    Values values;
    for (const Property& property : owner) {
        const auto text = propertyOf(current, property);
        if (isAmong(property, changes) || (!file.keepsRecords() && text && !property.isKey)) {
            values.emplace_back(&property, stored(property, text.value_or(noDate)));
        }
    }
    return values;
}

bool areSame(const Values& properties, const CMPIInstance* one, const CMPIInstance* other) {
    return std::all_of(properties.begin(), properties.end(), [&](const auto& value) {
        return sameName(value.first->name, movingProperty) ||
               propertyOf(one, *value.first) == propertyOf(other, *value.first);
    });
}

bool showIn(const DataFile& file, const CMPIInstance* current, const Values& changes) {
    return std::any_of(changes.begin(), changes.end(), [&](const auto& change) {
        const auto& [property, text] = change;
        const std::string before = propertyOf(current, *property).value_or(noValueOf(*property));
        return before != text && isKept(file, *property, before) && isKept(file, *property, text);
    });
}

namespace {

/** Whether the value that a property had was one that the changes take away, which may stand behind two properties. */
bool wasTakenAway(const std::string& text, const DataFile& file, const CMPIInstance* before, const Values& changes) {
    return std::any_of(changes.begin(), changes.end(), [&](const auto& change) {
        const bool isDate = change.first->type == CMPI_dateTime;
        const bool isEmptied = change.second.empty() || (isDate && !isShown(file, change.second));
        return isEmptied && propertyOf(before, *change.first) == text;
    });
}

/** Fails if a value that was not to be changed is not there any more. */
void requireNothingLost(const Class& owner, const DataFile& file, const CMPIInstance* before, const CMPIInstance* after,
                        const Values& changes) {
    for (const Property& property : owner) {
        const std::string text = propertyOf(before, property).value_or(std::string());
        const std::string now = propertyOf(after, property).value_or(std::string());
        const bool isLost = stored(property, now).empty() && !stored(property, text).empty();
        if (isLost && !isAmong(property, changes) && !wasTakenAway(text, file, before, changes)) {
            fail(CMPI_RC_ERR_FAILED, std::string(property.name) + " was lost: the data file could not be read.");
        }
    }
}

}  // namespace

void requireChanged(const Class& owner, const DataFile& file, const CMPIInstance* before, const CMPIInstance* after,
                    const Values& changes) {
    requireNothingLost(owner, file, before, after, changes);
    for (const auto& [property, text] : changes) {
        const auto now = propertyOf(after, *property);
        const bool isDate = property->type == CMPI_dateTime;
        const bool isThere = now && (isDate ? uniform(*now) == uniform(text) : *now == text);
        const bool isNull = !now && isDate && !isShown(file, text);
        // An empty text may be shown by a word for it: that it is not the old one must do.
        const bool isEmptied = text.empty() && now != propertyOf(before, *property);
        if (!isThere && !isNull && !isEmptied) {
            fail(CMPI_RC_ERR_FAILED,
                 std::string(property->name) + " could not be stored. The agent's log, level 3000, may say why.");
        }
    }
}

}  // namespace gate

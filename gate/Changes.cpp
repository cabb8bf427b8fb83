#include "Changes.h"

#include "Calls.h"

#include <algorithm>

namespace gate {

namespace {

/** Goes on by itself: what a client sends back is always of yesterday. */
constexpr const char* movingProperty = "LocalDateTime";

/** How the provider knows that there is no date. */
constexpr const char* noDate = "00000000000000.000000-000";

/** Refuses names that the class does not have. */
void requireKnownProperties(const Class& owner, const CMPIInstance* instance) {
    const CMPICount count = ask<&CMPIInstanceFT::getPropertyCount>(instance).value;
    for (CMPICount index = 0; index < count; ++index) {
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

Values changesTo(const CMPIInstance* current, const Values& given) {
    Values changes;
    for (const auto& [property, text] : given) {
        if (propertyOf(current, *property) == text || sameName(property->name, movingProperty)) {
            continue;
        }
        if (!property->isWritable) {
            fail(CMPI_RC_ERR_INVALID_PARAMETER,
                 std::string(property->name) + " cannot be changed. Leave it out, or send it back as it is.");
        }
        changes.emplace_back(property, text);
    }
    return changes;
}

Values changed(const Class& owner, const CMPIInstance* current, const Values& changes) {
    Values values = changes;
    for (const Property& property : owner) {
        const auto isIt = [&](const auto& change) { return change.first == &property; };
        if (!property.isWritable || std::any_of(changes.begin(), changes.end(), isIt)) {
            continue;
        }
        const auto text = propertyOf(current, property);
        if (text) {
            values.emplace_back(&property, *text);
        } else if (property.type != CMPI_dateTime) {
            // Everything but a date has a value: without it, the provider cannot have read its file.
            fail(CMPI_RC_ERR_FAILED, std::string(property.name) + " cannot be read, so nothing is changed.");
        }
    }
    return values;
}

Values undoing(const Values& changes, const CMPIInstance* current) {
    Values values;
    for (const auto& change : changes) {
        values.emplace_back(change.first, propertyOf(current, *change.first).value_or(noDate));
    }
    return values;
}

void requireChanged(const CMPIInstance* before, const CMPIInstance* after, const Values& changes) {
    for (const auto& [property, text] : changes) {
        const auto now = propertyOf(after, *property);
        // An empty text may be shown by a word for it: that it is not the old one must do.
        const bool isChanged = text.empty() ? now != propertyOf(before, *property) : now == text;
        if (!isChanged) {
            fail(CMPI_RC_ERR_FAILED,
                 std::string(property->name) + " could not be stored. The agent's log, level 3000, may say why.");
        }
    }
}

}  // namespace gate

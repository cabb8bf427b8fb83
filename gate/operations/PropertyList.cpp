#include "PropertyList.h"

#include <algorithm>
#include <string>
#include <vector>

namespace gate {

namespace {

/** The class's keys, followed by null. */
std::vector<const char*> keysOf(const Class& owner) {
    std::vector<const char*> keys;
    for (const Property& property : owner) {
        if (property.isKey) {
            keys.push_back(property.name);
        }
    }
    keys.push_back(nullptr);
    return keys;
}

}  // namespace

PropertyList::PropertyList(const char** listed, const Class& itsClass)
    : names(listed),
      owner(itsClass),
      isComplete(std::all_of(owner.begin(), owner.end(), [&](const Property& property) { return has(property); })) {}

bool PropertyList::has(const Property& property) const {
    if (names == nullptr) {
        return true;
    }
    for (const char** name = names; *name != nullptr; ++name) {
        if (sameName(*name, property.name)) {
            return true;
        }
    }
    return false;
}

void PropertyList::requireKnown() const {
    for (const char** name = names; name != nullptr && *name != nullptr; ++name) {
        if (findProperty(owner, *name) == nullptr) {
            fail(CMPI_RC_ERR_NO_SUCH_PROPERTY, std::string(owner.name) + " has no property " + *name + ".");
        }
    }
}

const CMPIInstance* PropertyList::applied(const CMPIBroker* broker, const CMPIInstance* instance) const {
    if (isComplete) {
        return instance;
    }
    CMPIInstance* made = makeInstance(broker, pathOf(instance));
    // Some managers put all properties of the class into a new instance; the filter removes them. The keys are listed,
    // too, since some managers hide properties that are only named as keys.
    std::vector<const char*> keys = keysOf(owner);
    std::vector<const char*> shown = keys;
    for (const char** name = names; *name != nullptr; ++name) {
        shown.insert(shown.end() - 1, *name);
    }
    tell<&CMPIInstanceFT::setPropertyFilter>(made, shown.data(), keys.data());
    for (const Property& property : owner) {
        const auto answer = ask<&CMPIInstanceFT::getProperty>(instance, property.name);
        require(answer.isOk() || isAbsent(answer.status), "return the value of a property", answer.status);
        const bool isPresent = answer.isOk() && (answer.value.state & (CMPI_notFound | CMPI_badValue)) == 0;
        if (isPresent && (property.isKey || has(property))) {
            const CMPIValue* value = cim::hasValue(answer.value) ? &answer.value.value : nullptr;
            const CMPIStatus status = tell<&CMPIInstanceFT::setProperty>(made, property.name, value, answer.value.type);
            require(status.rc == CMPI_RC_OK, "set a property", status);
        }
    }
    return made;
}

}  // namespace gate

#include "PropertyList.h"

#include "Calls.h"
#include "Objects.h"

#include <algorithm>
#include <string>
#include <vector>

namespace gate {

namespace {

/** The class's keys as a list that ends with null. */
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

bool PropertyList::hasAll(const Class& owner) const {
    if (lookedAt != &owner) {
        lookedAt = &owner;
        isWhole = names == nullptr ||
                  std::all_of(owner.begin(), owner.end(), [&](const Property& property) { return has(property); });
    }
    return isWhole;
}

void PropertyList::requireKnown(const Class& owner) const {
    for (const char** name = names; name != nullptr && *name != nullptr; ++name) {
        if (findProperty(owner, *name) == nullptr) {
            fail(CMPI_RC_ERR_NO_SUCH_PROPERTY, std::string(owner.name) + " has no property " + *name + ".");
        }
    }
}

const CMPIInstance* PropertyList::applied(const Request& request, const CMPIInstance* instance,
                                          const Class& owner) const {
    if (hasAll(owner)) {
        return instance;
    }
    request.requireManager();
    CMPIInstance* made = makeInstance(request.broker, pathOf(instance));
    // Some managers put all properties of a class into a new instance: this keeps out what nobody asked for.
    // The keys are listed besides: there are managers that do not show what is only named as a key.
    std::vector<const char*> keys = keysOf(owner);
    std::vector<const char*> shown = keys;
    for (const char** name = names; *name != nullptr; ++name) {
        shown.insert(shown.end() - 1, *name);
    }
    tell<&CMPIInstanceFT::setPropertyFilter>(made, shown.data(), keys.data());
    for (const Property& property : owner) {
        const auto answer = ask<&CMPIInstanceFT::getProperty>(instance, property.name);
        require(answer.isOk() || saysAbsent(answer.status), "give the value of a property", answer.status);
        const bool isThere = answer.isOk() && (answer.value.state & (CMPI_notFound | CMPI_badValue)) == 0;
        if (isThere && (property.isKey || has(property))) {
            const CMPIValue* value = cim::hasValue(answer.value) ? &answer.value.value : nullptr;
            const CMPIStatus status = tell<&CMPIInstanceFT::setProperty>(made, property.name, value, answer.value.type);
            require(status.rc == CMPI_RC_OK, "set a property", status);
        }
    }
    return made;
}

void PropertyList::apply(const Request& request, std::vector<const CMPIInstance*>& instances,
                         const Class& owner) const {
    for (const CMPIInstance*& instance : instances) {
        instance = applied(request, instance, owner);
    }
}

}  // namespace gate

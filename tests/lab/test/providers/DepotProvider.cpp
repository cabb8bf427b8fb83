#include <map>
#include <mutex>
#include <optional>
#include <stdexcept>

#include "host/operations/providers/ProviderKit.h"

// A provider "Depot" that takes many requests at a time and answers them rightly, but for classes that each go wrong in
// one way: Depot_Liar, Depot_Hoarder and so on. Every class has a store of its own.

namespace {

struct Item {
    std::optional<std::string> text{};
    std::optional<CMPIUint32> number{};
    std::optional<bool> open{};
};

using Store = std::map<std::string, Item>;

const CMPIBroker* broker = nullptr;
std::mutex mutex;
std::map<std::string, Store> stores;  ///< by class
std::map<std::string, int> turns;     ///< how often something was asked of a class

/** Whether the class goes wrong now: it is that one, and does so every third time, so not at the very first. */
bool goesWrong(const std::string& asked, const char* className) {
    return asked == className && ++turns[asked] % 3 == 0;
}

CMPIObjectPath* pathOf(const CMPIObjectPath* like, const std::string& asked, const std::string& name) {
    CMPIObjectPath* path = kit::newPath(broker, like, asked);
    kit::addKey(path, "Name", name);
    return path;
}

template <class Plain>
void set(CMPIInstance* instance, const char* name, CMPIType type, const std::optional<Plain>& value) {
    if (value) {
        instance->ft->setProperty(instance, name, reinterpret_cast<const CMPIValue*>(&*value), type);
    }
}

CMPIInstance* instanceOf(const CMPIObjectPath* like, const std::string& asked, const std::string& name,
                         const Item& item) {
    CMPIInstance* instance = broker->eft->newInstance(broker, pathOf(like, asked, name), nullptr);
    kit::set(instance, "Name", name);
    if (item.text) {
        kit::set(instance, "Text", *item.text);
    }
    set(instance, "Number", CMPI_uint32, item.number);
    set(instance, "Open", CMPI_boolean,
        item.open ? std::optional<CMPIBoolean>(*item.open ? 1 : 0) : std::optional<CMPIBoolean>());
    return instance;
}

/** The value of a property; none when it is not there or null. */
std::optional<CMPIValue> valueOf(const CMPIInstance* instance, const char* name) {
    CMPIStatus status = kit::ok;
    const CMPIData data = instance->ft->getProperty(instance, name, &status);
    const bool isThere = status.rc == CMPI_RC_OK && (data.state & CMPI_nullValue) == 0;
    return isThere ? std::optional<CMPIValue>(data.value) : std::nullopt;
}

void apply(Item& item, const CMPIInstance* instance) {
    if (const auto text = valueOf(instance, "Text")) {
        item.text = kit::characters(text->string);
    }
    if (const auto number = valueOf(instance, "Number")) {
        item.number = number->uint32;
    }
    if (const auto open = valueOf(instance, "Open")) {
        item.open = open->boolean != 0;
    }
}

/** The key from the path or, where that has none, from the instance. */
std::string nameOf(const CMPIObjectPath* path, const CMPIInstance* instance) {
    const std::string name = kit::key(path, "Name");
    const auto inInstance = valueOf(instance, "Name");
    return name.empty() && inInstance ? kit::characters(inInstance->string) : name;
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return kit::ok;
}

/** What a class shows: what it has, or more, or less. */
Store shownBy(const std::string& asked) {
    Store shown = stores[asked];
    if (asked == "Depot_Forgetful") {
        shown.clear();
    } else if (goesWrong(asked, "Depot_Inventive")) {
        shown["nobody's"] = {};
    } else if (goesWrong(asked, "Depot_Nameless")) {
        shown[""] = {};
    }
    return shown;
}

template <class Return>
CMPIStatus enumerate(const CMPIResult* result, const CMPIObjectPath* path, Return returnOne) {
    const std::string asked = kit::className(path);
    Store shown;
    {
        const std::lock_guard<std::mutex> lock(mutex);
        shown = shownBy(asked);
    }
    for (const auto& [name, item] : shown) {
        for (int times = asked == "Depot_Repeating" ? 2 : 1; times > 0; --times) {
            returnOne(instanceOf(path, asked, name, item));
        }
    }
    result->ft->returnDone(result);
    return kit::ok;
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* path) {
    return enumerate(result, path, [&](const CMPIInstance* instance) {
        result->ft->returnObjectPath(result, instance->ft->getObjectPath(instance, nullptr));
    });
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                              const char**) {
    return enumerate(result, path, [&](const CMPIInstance* instance) { result->ft->returnInstance(result, instance); });
}

CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                       const char**) {
    const std::string asked = kit::className(path);
    const std::lock_guard<std::mutex> lock(mutex);
    const Store& store = stores[asked];
    const auto found = store.find(kit::key(path, "Name"));
    if (found == store.end()) {
        return {CMPI_RC_ERR_NOT_FOUND, nullptr};
    }
    Item item = found->second;
    if (asked == "Depot_Liar") {
        item.number = item.number.value_or(0) + 1;
    }
    result->ft->returnInstance(result, instanceOf(path, asked, found->first, item));
    result->ft->returnDone(result);
    return kit::ok;
}

CMPIStatus createInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                          const CMPIInstance* instance) {
    const std::string asked = kit::className(path);
    const std::string name = nameOf(path, instance);
    const std::lock_guard<std::mutex> lock(mutex);
    if (asked == "Depot_Throwing") {
        throw std::runtime_error("full");
    }
    if (!stores[asked].emplace(name, Item{}).second && asked != "Depot_Generous") {
        return {CMPI_RC_ERR_ALREADY_EXISTS, nullptr};
    }
    apply(stores[asked][name], instance);
    if (asked != "Depot_Silent") {
        result->ft->returnObjectPath(result, pathOf(path, asked, asked == "Depot_Misnaming" ? "other" : name));
    }
    return kit::ok;
}

CMPIStatus modifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* path,
                          const CMPIInstance* instance, const char**) {
    const std::string asked = kit::className(path);
    const std::lock_guard<std::mutex> lock(mutex);
    Store& store = stores[asked];
    const auto found = store.find(kit::key(path, "Name"));
    if (found == store.end()) {
        return {asked == "Depot_Polite" ? CMPI_RC_OK : CMPI_RC_ERR_NOT_FOUND, nullptr};
    }
    apply(found->second, instance);
    return kit::ok;
}

CMPIStatus deleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* path) {
    const std::string asked = kit::className(path);
    const std::lock_guard<std::mutex> lock(mutex);
    if (asked == "Depot_Hoarder") {
        return kit::ok;
    }
    return stores[asked].erase(kit::key(path, "Name")) == 0 ? CMPIStatus{CMPI_RC_ERR_NOT_FOUND, nullptr} : kit::ok;
}

CMPIInstanceMIFT instanceTable{CMPIVersion200,         CMPIVersion200,     "instanceDepot", cleanup,
                               enumerateInstanceNames, enumerateInstances, getInstance,     createInstance,
                               modifyInstance,         deleteInstance,     nullptr};
CMPIInstanceMI instanceMI{nullptr, &instanceTable};

// Associations: from anywhere to the gates of the depot, of which there are two; Depot_Wandering loses one at times.

CMPIStatus associationCleanup(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {
    return kit::ok;
}

int gatesOf(const char* association) {
    const std::lock_guard<std::mutex> lock(mutex);
    return association != nullptr && goesWrong(association, "Depot_Wandering") ? 1 : 2;
}

/** Asks the object manager for the class of things first, as providers of associations do. */
void askBack(const CMPIContext* context, const CMPIObjectPath* path) {
    broker->bft->enumerateInstanceNames(broker, context, kit::newPath(broker, path, "Depot_Thing"), nullptr);
}

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result,
                       const CMPIObjectPath* path, const char* association, const char*, const char*, const char*,
                       const char**) {
    askBack(context, path);
    for (int gate = gatesOf(association); gate > 0; --gate) {
        result->ft->returnInstance(result, instanceOf(path, "Depot_Gate", std::to_string(gate), {}));
    }
    return kit::ok;
}

CMPIStatus associatorNames(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result,
                           const CMPIObjectPath* path, const char* association, const char*, const char*, const char*) {
    askBack(context, path);
    for (int gate = gatesOf(association); gate > 0; --gate) {
        result->ft->returnObjectPath(result, pathOf(path, "Depot_Gate", std::to_string(gate)));
    }
    return kit::ok;
}

CMPIStatus references(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*,
                      const char*, const char**) {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

CMPIStatus referenceNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*,
                          const char*) {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

CMPIAssociationMIFT associationTable{CMPIVersion200, CMPIVersion200,  "associationDepot", associationCleanup,
                                     associators,    associatorNames, references,         referenceNames};
CMPIAssociationMI associationMI{nullptr, &associationTable};

}  // namespace

KIT_EXPORT CMPIInstanceMI* Depot_Create_InstanceMI(const CMPIBroker* itsBroker, const CMPIContext*, CMPIStatus*) {
    kit::keep(broker, itsBroker);
    return &instanceMI;
}

KIT_EXPORT CMPIAssociationMI* Depot_Create_AssociationMI(const CMPIBroker* itsBroker, const CMPIContext*, CMPIStatus*) {
    kit::keep(broker, itsBroker);
    return &associationMI;
}

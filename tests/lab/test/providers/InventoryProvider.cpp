#include <map>
#include <mutex>
#include <optional>
#include <stdexcept>

#include "host/operations/providers/ProviderKit.h"

// The provider "Inventory", which supports concurrent requests. Some of its classes each have one defect:
// Inventory_Liar, Inventory_Hoarder and so on. Each class has a separate store.

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
std::map<std::string, int> turns;     ///< number of requests per class

/** Whether the defect of a class applies to this request. It applies to every third request. */
bool isDefective(const std::string& asked, const char* className) {
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

/** The value of a property; none if it is missing or null. */
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

/** The key of the path or, if it has none, of the instance. */
std::string nameOf(const CMPIObjectPath* path, const CMPIInstance* instance) {
    const std::string name = kit::key(path, "Name");
    const auto inInstance = valueOf(instance, "Name");
    return name.empty() && inInstance ? kit::characters(inInstance->string) : name;
}

/** The instances that a class returns: those of its store, or more, or fewer. */
Store shownBy(const std::string& asked) {
    Store shown = stores[asked];
    if (asked == "Inventory_Forgetful") {
        shown.clear();
    } else if (isDefective(asked, "Inventory_Inventive")) {
        shown["no manager's"] = {};
    } else if (isDefective(asked, "Inventory_Nameless")) {
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
        for (int times = asked == "Inventory_Repeating" ? 2 : 1; times > 0; --times) {
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
    if (asked == "Inventory_Liar") {
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
    if (asked == "Inventory_Throwing") {
        throw std::runtime_error("full");
    }
    if (!stores[asked].emplace(name, Item{}).second && asked != "Inventory_Generous") {
        return {CMPI_RC_ERR_ALREADY_EXISTS, nullptr};
    }
    apply(stores[asked][name], instance);
    if (asked != "Inventory_Silent") {
        result->ft->returnObjectPath(result, pathOf(path, asked, asked == "Inventory_Misnaming" ? "other" : name));
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
        return {asked == "Inventory_Polite" ? CMPI_RC_OK : CMPI_RC_ERR_NOT_FOUND, nullptr};
    }
    apply(found->second, instance);
    return kit::ok;
}

CMPIStatus deleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* path) {
    const std::string asked = kit::className(path);
    const std::lock_guard<std::mutex> lock(mutex);
    if (asked == "Inventory_Hoarder") {
        return kit::ok;
    }
    return stores[asked].erase(kit::key(path, "Name")) == 0 ? CMPIStatus{CMPI_RC_ERR_NOT_FOUND, nullptr} : kit::ok;
}

CMPIInstanceMIFT instanceTable{CMPIVersion200,
                               CMPIVersion200,
                               "instanceInventory",
                               kit::cleanup,
                               enumerateInstanceNames,
                               enumerateInstances,
                               getInstance,
                               createInstance,
                               modifyInstance,
                               deleteInstance,
                               nullptr};
CMPIInstanceMI instanceMI{nullptr, &instanceTable};

// Associations: from any instance to two instances of Inventory_Gate; Inventory_Wandering sometimes omits one.

int gatesOf(const char* association) {
    const std::lock_guard<std::mutex> lock(mutex);
    return association != nullptr && isDefective(association, "Inventory_Wandering") ? 1 : 2;
}

/** Enumerates Inventory_Thing, since providers of associations send requests. */
void sendUpCall(const CMPIContext* context, const CMPIObjectPath* path) {
    broker->bft->enumerateInstanceNames(broker, context, kit::newPath(broker, path, "Inventory_Thing"), nullptr);
}

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result,
                       const CMPIObjectPath* path, const char* association, const char*, const char*, const char*,
                       const char**) {
    sendUpCall(context, path);
    for (int gate = gatesOf(association); gate > 0; --gate) {
        result->ft->returnInstance(result, instanceOf(path, "Inventory_Gate", std::to_string(gate), {}));
    }
    return kit::ok;
}

CMPIStatus associatorNames(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result,
                           const CMPIObjectPath* path, const char* association, const char*, const char*, const char*) {
    sendUpCall(context, path);
    for (int gate = gatesOf(association); gate > 0; --gate) {
        result->ft->returnObjectPath(result, pathOf(path, "Inventory_Gate", std::to_string(gate)));
    }
    return kit::ok;
}

CMPIAssociationMIFT associationTable{CMPIVersion200, CMPIVersion200,  "associationInventory", kit::cleanup,
                                     associators,    associatorNames, kit::noReferences,      kit::noReferenceNames};
CMPIAssociationMI associationMI{nullptr, &associationTable};

}  // namespace

KIT_EXPORT CMPIInstanceMI* Inventory_Create_InstanceMI(const CMPIBroker* itsBroker, const CMPIContext*, CMPIStatus*) {
    kit::store(broker, itsBroker);
    return &instanceMI;
}

KIT_EXPORT CMPIAssociationMI* Inventory_Create_AssociationMI(const CMPIBroker* itsBroker, const CMPIContext*,
                                                             CMPIStatus*) {
    kit::store(broker, itsBroker);
    return &associationMI;
}

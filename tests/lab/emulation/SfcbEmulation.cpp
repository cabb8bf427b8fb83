#include <algorithm>

#include "broker/NamedValues.h"
#include "lab/emulation/Emulations.h"
#include "lab/emulation/TypeCoercion.h"
#include "operations/RequestThread.h"

namespace cimhost::lab {
namespace {

/** Approximate size of a value's markup in XML: elements, attributes, a type. */
constexpr std::size_t markup = 75;

/** The longest response in XML, in bytes. */
constexpr std::size_t responseLimit = 10'000'000;

std::size_t xmlSize(const std::vector<NamedValue>& values);

std::size_t xmlSize(const ObjectPath& path) {
    return markup + path.nameSpace.size() + path.className.size() + xmlSize(path.keys);
}

std::size_t xmlSize(const Scalar& value) {
    constexpr std::size_t number = 10;
    if (const auto* string = std::get_if<std::string>(&value)) {
        return string->size();
    }
    const auto* path = std::get_if<std::shared_ptr<const ObjectPath>>(&value);
    return path == nullptr || *path == nullptr ? number : xmlSize(**path);
}

std::size_t xmlSize(const std::vector<NamedValue>& values) {
    std::size_t size = 0;
    for (const NamedValue& each : values) {
        size += markup + each.name.string().size();
        for (const Scalar& element : each.value.elements()) {
            size += xmlSize(element);
        }
    }
    return size;
}

/** The approximate size of a response in XML. */
std::size_t xmlSize(const ResultEvents& events) {
    std::size_t size = 0;
    for (const ResultEvent& event : events) {
        if (const auto* path = resultOf<ObjectPath>(event)) {
            size += xmlSize(*path);
        } else if (const auto* instance = resultOf<Instance>(event)) {
            size += xmlSize(instance->path) + xmlSize(instance->properties);
        }
    }
    return size;
}

bool returnedObject(const ProviderResponse& response) {
    return std::any_of(response.events.begin(), response.events.end(), [](const ResultEvent& event) {
        return resultOf<Instance>(event) != nullptr || resultOf<ObjectPath>(event) != nullptr;
    });
}

/** Leaves only the functions for marks in the memory table. */
void leaveMarksOnly(CMPIBrokerMemFT& memory) {
    memory.cmpiMalloc = nullptr;
    memory.cmpiCalloc = nullptr;
    memory.cmpiRealloc = nullptr;
    memory.cmpiStrDup = nullptr;
    memory.cmpiFree = nullptr;
    memory.freeInstance = nullptr;
    memory.freeObjectPath = nullptr;
    memory.freeArgs = nullptr;
    memory.freeString = nullptr;
    memory.freeArray = nullptr;
    memory.freeDateTime = nullptr;
    memory.freeSelectExp = nullptr;
}

FunctionTables sfcbTables() {
    FunctionTables tables = standardTables();
    changeToSfcbTables(tables);
    return tables;
}

/** SFCB runs providers in separate processes, which an exception or a wrong result may end. */
class SfcbEmulation : public ManagerBehaviour {
public:
    const FunctionTables& tables() const override {
        static const FunctionTables all = sfcbTables();
        return all;
    }

    ProviderPolicy policy() const override {
        ProviderPolicy policy;
        policy.factory = FactoryChoice::generic;
        policy.startsAllInterfaces = true;
        policy.startsProviderPerClass = true;
        policy.startsConcurrently = true;
        return policy;
    }

    std::optional<Status> statusOf(const LibraryNotLoaded&) const override {
        return Status{CMPI_RC_ERR_NOT_FOUND, "Provider not found or not loadable"};
    }

    Value principal() const override { return Value::stringWithoutCharacters(); }
    bool namesAssociationClass() const override { return false; }

    Status coerceTypes(Request& request, const Broker& broker) const override {
        return refuseStringsForNumbers(request, broker);
    }

    /** Removes blanks and non-ASCII bytes at the ends of strings. Unset strings become null string objects. */
    void adapt(Request& request, const Broker& broker) const override {
        trimStrings(request, [](char each) { return each == ' ' || static_cast<unsigned char>(each) > 0x7F; });
        completeInstance(request, broker, Value::nullStringObject(), CreationKey::asSent);
        if (findNamed(request.context, CMPIRole) == nullptr) {
            request.context.push_back({CMPIRole, Value::stringWithoutCharacters()});
        }
    }

    ResultRules resultRules(Operation operation) const override {
        ResultRules rules;
        rules.keepsPaths = operation == Operation::createInstance;
        return rules;
    }

    /** Uses a new thread. An up-call runs on the thread of the provider that makes it. */
    void onRequestThread(const std::function<void()>& callProvider) const override {
        const bool isNested = Broker::arenaOfThread() != nullptr;
        isNested ? callProvider() : onNewThread(callProvider);
    }

    std::string crashReason(const ProviderResponse& response, Operation operation) const override {
        if (response.threw) {
            return response.status.message;
        }
        if (response.releasedPath) {
            return "The provider released the path that it had returned.";
        }
        const bool lacksPath =
            operation == Operation::createInstance && response.status.ok() && !returnedObject(response);
        return lacksPath ? "The provider accepted CreateInstance, but returned nothing." : "";
    }

    using ManagerBehaviour::statusOf;
    Status statusOf(const ProviderResponse& response, Operation operation) const override {
        const std::string reason = crashReason(response, operation);
        if (!reason.empty()) {
            return crashed(reason);
        }
        if (xmlSize(response.events) > responseLimit) {
            return {CMPI_RC_ERR_FAILED, "The answer is longer than the manager's limit."};
        }
        return ManagerBehaviour::statusOf(response, operation);
    }

    /** An instance is misread as a path, with the namespace as its class. */
    StatusOr<ObjectPath> createdPath(const ProviderResponse& response) const override {
        const auto first = std::find_if(response.events.begin(), response.events.end(), [](const ResultEvent& each) {
            return resultOf<Instance>(each) != nullptr || resultOf<ObjectPath>(each) != nullptr;
        });
        const auto* instance = first == response.events.end() ? nullptr : resultOf<Instance>(*first);
        return instance == nullptr
                   ? ManagerBehaviour::createdPath(response)
                   : StatusOr<ObjectPath>{{}, {{}, instance->path.nameSpace, instance->path.nameSpace, {}}};
    }
};

}  // namespace

void changeToSfcbTables(FunctionTables& tables) {
    tables.broker.brokerVersion = 0;
    tables.encapsulation.ftVersion = 1;
    tables.instance.setPropertyFilter = setPropertyFilterWithKeys;
    tables.encapsulation.newCMPIError = nullptr;
    tables.encapsulation.openMessageFile = nullptr;
    tables.encapsulation.closeMessageFile = nullptr;
    tables.encapsulation.getMessage2 = nullptr;
    tables.threads.joinThread = nullptr;
    tables.threads.exitThread = nullptr;
    tables.threads.cancelThread = nullptr;
    tables.threads.threadSleep = nullptr;
    tables.threads.signalCondition = nullptr;
    leaveMarksOnly(tables.memory);
}

std::shared_ptr<const ManagerBehaviour> sfcbEmulation() {
    return std::make_shared<SfcbEmulation>();
}

}  // namespace cimhost::lab

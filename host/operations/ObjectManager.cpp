#include "operations/ObjectManager.h"

#include <algorithm>
#include <utility>

#include "broker/NamedValues.h"
#include "cim/Names.h"
#include "operations/RequestRunner.h"
#include "operations/ResponseMapping.h"

namespace cimhost {
namespace {

void addIfMissing(ContextEntries& entries, const Name& name, Value value) {
    if (findNamed(entries, name) == nullptr) {
        entries.push_back({name, std::move(value)});
    }
}

Status noProvider(const Request& request, const std::string& className) {
    const bool isAssociation = isAssociationOperation(request.operation);
    return {CMPI_RC_ERR_INVALID_CLASS, std::string("No ") + (isAssociation ? "association" : "instance") +
                                           " provider is registered for " +
                                           (className.empty() ? std::string("any class") : "class " + className) +
                                           " in namespace " + request.path.nameSpace + "."};
}

/** The member of the filter that names the association class: for references, the result class. */
auto associationClassOf(Operation operation) {
    return isReferenceOperation(operation) ? &AssociationFilter::resultClass : &AssociationFilter::associationClass;
}

/** Returns the instance to create: the keys that are only in the path, then the properties. */
Instance withKeys(const ObjectPath& path, const Instance& instance) {
    Instance complete{path, {}};
    for (const NamedValue& key : path.keys) {
        if (findNamed(instance.properties, key.name) == nullptr) {
            complete.properties.push_back(key);
        }
    }
    complete.properties.insert(complete.properties.end(), instance.properties.begin(), instance.properties.end());
    return complete;
}

/** Removes each class whose provider also serves an earlier class of the list. */
void removeSameProviders(std::vector<const ServedClass*>& classes) {
    std::vector<const ServedClass*> unique;
    std::copy_if(classes.begin(), classes.end(), std::back_inserter(unique), [&](const ServedClass* each) {
        return std::none_of(unique.begin(), unique.end(), [&](const ServedClass* other) {
            return other->address.location == each->address.location &&
                   other->address.provider == each->address.provider;
        });
    });
    classes = std::move(unique);
}

}  // namespace

ObjectManager::ObjectManager(ObjectManagerOptions itsOptions, ProviderRegistry itsRegistry)
    : ownedBehaviour(std::move(itsOptions.behaviour)),
      behaviour(ownedBehaviour == nullptr ? ManagerBehaviour::standard() : *ownedBehaviour),
      policy(behaviour.policy()),
      keepsEvents(itsOptions.keepsEvents),
      baseContext(std::move(itsOptions.context)),
      providers(std::move(itsRegistry)),
      itsBroker({std::move(itsOptions.classInfo), this, std::move(itsOptions.log), &behaviour.tables(),
                 behaviour.hasMemoryTable()}),
      pool(itsBroker, std::move(itsOptions.libraries), policy) {}

void ObjectManager::completeContext(Request& request) const {
    for (const NamedValue& entry : baseContext) {
        addIfMissing(request.context, entry.name, entry.value);
    }
    addIfMissing(request.context, CMPIInvocationFlags, Value::of(CMPI_uint32, std::uint32_t{0}));
    addIfMissing(request.context, CMPIInitNameSpace, Value::of(request.path.nameSpace));
    addIfMissing(request.context, CMPIPrincipal, behaviour.principal());
}

ProviderAddress ObjectManager::addressOf(const ServedClass& served) const {
    ProviderAddress address = served.address;
    if (policy.startsProviderPerClass) {
        address.forClass = cim::foldedName(served.className);
    }
    return address;
}

template <class Interface>
Interface* ObjectManager::started(const ServedClass& served) {
    const ProviderAddress address = addressOf(served);
    if (policy.startsAllInterfaces) {
        if (providers.find(served.nameSpace, served.className, InterfaceKind::instance) != nullptr) {
            pool.get<CMPIInstanceMI>(address);
        }
        if (providers.find(served.nameSpace, served.className, InterfaceKind::association) != nullptr) {
            pool.get<CMPIAssociationMI>(address);
        }
    }
    return pool.get<Interface>(address);
}

template <class Interface>
ProviderResponse ObjectManager::call(const ServedClass& served, const Request& request) {
    ProviderResponse response = runRequest(itsBroker, started<Interface>(served), request, behaviour);
    if (!response.crashReason.empty()) {
        pool.unloadWhenUnused(served.address.location);
    }
    return response;
}

Response ObjectManager::perform(Request request) {
    const ProviderPool::InUse use(pool);
    if (pool.isStopped()) {
        return Response::failed({CMPI_RC_ERR_FAILED, stoppingMessage});
    }
    if (request.operation > Operation::referenceNames) {
        return notSupported(request.operation);
    }
    if (!providers.knowsNameSpace(request.path.nameSpace)) {
        return Response::failed(
            {CMPI_RC_ERR_INVALID_NAMESPACE, "There is no namespace " + request.path.nameSpace + "."});
    }
    completeContext(request);
    try {
        return isAssociationOperation(request.operation) ? performForAssociation(std::move(request))
                                                         : performForInstance(std::move(request));
    } catch (const LibraryNotLoaded& error) {
        const std::optional<Status> status = behaviour.statusOf(error);
        if (!status) {
            throw;
        }
        return Response::failed(*status);
    }
}

Response ObjectManager::performForInstance(Request request) {
    const ServedClass* served = providers.find(request.path.nameSpace, request.path.className, InterfaceKind::instance);
    if (served == nullptr) {
        return Response::failed(noProvider(request, request.path.className));
    }
    if (request.operation == Operation::createInstance) {
        request.instance = withKeys(request.path, request.instance);
    } else {
        request.instance.path = request.path;
    }
    const Status refusal = behaviour.coerceTypes(request, itsBroker);
    if (!refusal.ok()) {
        return Response::failed(refusal);
    }
    std::vector<ProviderResponse> responses;  // An initializer list would copy the response.
    responses.push_back(call<CMPIInstanceMI>(*served, request));
    return mapResponses(behaviour, request, std::move(responses), keepsEvents);
}

Response ObjectManager::performForAssociation(Request request) {
    const auto associationClass = associationClassOf(request.operation);
    const std::optional<std::string> requested = request.filter.*associationClass;
    std::vector<const ServedClass*> found = associationsFor(request.path.nameSpace, requested);
    if (found.empty()) {
        return Response::failed(noProvider(request, requested.value_or(std::string{})));
    }
    const bool namesClass = behaviour.namesAssociationClass();
    if (!namesClass) {
        removeSameProviders(found);
    }
    std::vector<ProviderResponse> responses;
    for (const ServedClass* served : found) {
        if (namesClass) {
            const bool isRequested = requested && cim::sameName(served->className, *requested);
            request.filter.*associationClass = isRequested ? *requested : served->className;
        }
        responses.push_back(call<CMPIAssociationMI>(*served, request));
    }
    return mapResponses(behaviour, request, std::move(responses), keepsEvents);
}

std::vector<const ServedClass*> ObjectManager::associationsFor(const std::string& nameSpace,
                                                               const std::optional<std::string>& className) const {
    std::vector<const ServedClass*> found = providers.associations(nameSpace);
    if (className) {
        const auto isOther = [&](const ServedClass* each) { return !itsBroker.isA(each->className, *className); };
        found.erase(std::remove_if(found.begin(), found.end(), isOther), found.end());
    }
    return found;
}

}  // namespace cimhost

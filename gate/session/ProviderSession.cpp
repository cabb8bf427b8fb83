#include "ProviderSession.h"

namespace gate {

namespace {

constexpr const char** allProperties = nullptr;
constexpr const char* any = nullptr;

/** Returns the results to the client, each with this function of the request's CMPIResult. */
template <auto function, class Object>
void returnAll(const ClientRequest& request, const std::vector<Object>& results) {
    constexpr const char* task = "accept the results";
    for (const Object& object : results) {
        request.requireManager();
        requireOk(task, tell<function>(request.result, object));
    }
    request.requireManager();
    requireOk(task, tell<&CMPIResultFT::returnDone>(request.result));
}

void requireFinished(bool isFinished) {
    failIf(!isFinished, CMPI_RC_ERR_FAILED,
           "The provider did not finish its answer; see the agent's log at level 3000.");
}

const CMPIInstance* firstOf(const Instances& instances) {
    return instances.empty() ? nullptr : instances.front();
}

/** The provider's response to a request. The object manager owns its objects and frees them after the request. */
struct ProviderResponse {
    Instances instances{};
    Paths paths{};
    bool isDone = false;  ///< whether the provider called returnDone
};

/** Adds an object to one of the lists of the response. */
template <auto list, class Object>
CMPIStatus collect(const CMPIResult* result, Object* object) {
    (static_cast<ProviderResponse*>(result->hdl)->*list).push_back(object);
    return {CMPI_RC_OK, nullptr};
}

/** The functions of a CMPIResult that collects the provider's response, except those that the provider never calls. */
CMPIResultFT collectorFunctions{
    CMPIVersion200,
    nullptr,
    nullptr,
    nullptr,
    collect<&ProviderResponse::instances>,
    collect<&ProviderResponse::paths>,
    [](const CMPIResult* result) {
        static_cast<ProviderResponse*>(result->hdl)->isDone = true;
        return CMPIStatus{CMPI_RC_OK, nullptr};
    },
    nullptr,
};

/** Calls a function of one of the provider's interfaces. */
template <auto function, class... Arguments>
ProviderResponse call(const ClientRequest& request, const LocalObject& path, Arguments... arguments) {
    auto* const interface = theConnection.provider().interfaceWith(function);
    ProviderResponse response;
    const CMPIResult result{&response, &collectorFunctions};
    theConnection.wrappedBroker().hasFailed = false;
    const CMPIStatus status =
        (interface->ft->*function)(interface, request.context, &result, path.path(), arguments...);
    if (status.rc != CMPI_RC_OK) {
        const std::string reason = toString(status.msg);
        fail(status.rc, reason.empty() ? "The provider returned code " + std::to_string(status.rc) + "." : reason);
    }
    request.requireManager();
    return response;
}

/** The same, but fails if the provider did not end its response, or omitted an object that could not be created. */
template <auto function, class... Arguments>
ProviderResponse read(const ClientRequest& request, const LocalObject& path, Arguments... arguments) {
    ProviderResponse response = call<function>(request, path, arguments...);
    require(!theConnection.wrappedBroker().hasFailed, "create the paths and instances of the results");
    requireFinished(response.isDone);
    return response;
}

}  // namespace

const CMPIBroker* ClientRequest::broker() const {
    const CMPIBroker* found = brokerOrNull();
    ManagerGone::throwUnless(found != nullptr);
    return found;
}

const Class& ClientRequest::requestedClass() const {
    const std::string name = classNameOf(path);
    const Class* found = findClass(name);
    failIf(found == nullptr || sameName(name, computerClass), CMPI_RC_ERR_INVALID_CLASS,
           "This provider does not serve the class \"", name, "\".");
    return *found;
}

void ClientRequest::returnResults(const Instances& instances) const {
    returnAll<&CMPIResultFT::returnInstance>(*this, instances);
}

void ClientRequest::returnResults(const Paths& paths) const {
    returnAll<&CMPIResultFT::returnObjectPath>(*this, paths);
}

ProviderSession::ProviderSession(const ClientRequest& itsRequest, Access access)
    : request(itsRequest), isReading(access == Access::read) {
    request.broker();  // throws if there is none
    if (!isReading) {
        theConnection.requireOwner(guard);
    }
    theConnection.requireCurrent(guard, isReading);
}

Paths ProviderSession::names(const Class& requested) const {
    const LocalObject path(nameSpaceOf(request.path), requested);
    Paths paths = read<&CMPIInstanceMIFT::enumerateInstanceNames>(request, path).paths;
    theConnection.requireRead(requested, paths.size());
    return paths;
}

/** Fails unless the provider has read the records of a class, or of both classes that an association connects. */
void ProviderSession::requireRead(const Class& requested) const {
    for (const Property& property : requested) {
        if (property.referenceClass != nullptr) {
            requireRead(*findClass(property.referenceClass));
        }
    }
    const auto* table = theConnection.tableOf(requested);
    if (table != nullptr && !table->isRead) {
        names(requested);
    }
}

Instances ProviderSession::instances(const Class& requested) const {
    requireRead(requested);
    const LocalObject path(nameSpaceOf(request.path), requested);
    return read<&CMPIInstanceMIFT::enumerateInstances>(request, path, allProperties).instances;
}

Paths ProviderSession::associatorNames(const LocalObject& computer, const Class& association) const {
    requireRead(association);
    return read<&CMPIAssociationMIFT::associatorNames>(request, computer, association.name, any, any, any).paths;
}

Instances ProviderSession::associators(const LocalObject& computer, const Class& association) const {
    requireRead(association);
    return read<&CMPIAssociationMIFT::associators>(request, computer, association.name, any, any, any, allProperties)
        .instances;
}

const CMPIInstance* ProviderSession::find(const LocalObject& keys, const Class& requested) const {
    if (sameName(requested.name, agentClass)) {
        // For the keys of another instance, the provider does not end its response to a get, as after an error.
        const CMPIInstance* agent = firstOf(instances(requested));
        return agent != nullptr && samePath(pathOf(agent), keys.path()) ? agent : nullptr;
    }
    requireRead(requested);
    return firstOf(read<&CMPIInstanceMIFT::getInstance>(request, keys, allProperties).instances);
}

const CMPIInstance* ProviderSession::get(const LocalObject& keys, const Class& requested) const {
    const CMPIInstance* instance = find(keys, requested);
    failIf(instance == nullptr, CMPI_RC_ERR_NOT_FOUND, "There is no such ", requested.name, ".");
    return instance;
}

const CMPIInstance* ProviderSession::create(const LocalObject& keys) {
    // The provider ignores the instance.
    const CMPIInstance* created =
        firstOf(read<&CMPIInstanceMIFT::createInstance>(request, keys, keys.instance()).instances);
    requireFinished(created != nullptr);
    return created;
}

void ProviderSession::modify(const LocalObject& keys, const LocalObject& values) {
    call<&CMPIInstanceMIFT::modifyInstance>(request, keys, values.instance(), allProperties);
}

void ProviderSession::remove(const LocalObject& keys) {
    call<&CMPIInstanceMIFT::deleteInstance>(request, keys);
}

}  // namespace gate

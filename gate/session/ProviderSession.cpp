#include "ProviderSession.h"

#include "gate/cmpi/ResultCollector.h"

#include <algorithm>

namespace gate {

namespace {

template <auto function, class... Answer>
void callResult(const Request& request, Answer... answer) {
    request.requireManager();
    const CMPIStatus status = tell<function>(request.result, answer...);
    require(status.rc == CMPI_RC_OK, "accept the answer", status);
}

template <auto function, class Answer>
void giveAll(const Request& request, const std::vector<Answer>& answers) {
    for (const Answer& answer : answers) {
        callResult<function>(request, answer);
    }
    callResult<&CMPIResultFT::returnDone>(request);
}

void requireOk(const CMPIStatus& status) {
    if (status.rc != CMPI_RC_OK) {
        const std::string reason = toString(status.msg);
        fail(status.rc, reason.empty() ? "The provider returned code " + std::to_string(status.rc) + "." : reason);
    }
}

void requireDone(const ResultCollector& result) {
    if (!result.isDone) {
        fail(CMPI_RC_ERR_FAILED, "The provider did not finish its answer; see the agent's log at level 3000.");
    }
}

/** Calls a function of one of the provider's interfaces. */
template <auto function, class Interface, class... Arguments>
void call(ResultCollector& result, const Request& request, Interface* interface, Arguments... arguments) {
    requireOk((interface->ft->*function)(interface, request.context, &result.handle, arguments...));
    request.requireManager();
}

/** The same for a function that returns objects, which the provider omits where it cannot create them. */
template <auto function, class Interface, class... Arguments>
void collect(ResultCollector& result, const Request& request, Interface* interface, Arguments... arguments) {
    theConnection.wrappedBroker().forgetFailures();
    call<function>(result, request, interface, arguments...);
    require(!theConnection.wrappedBroker().hasFailed(), "create the paths and instances of the answer");
}

constexpr const char** allProperties = nullptr;

}  // namespace

const CMPIBroker* Request::broker() const {
    const CMPIBroker* found = brokerOrNull();
    if (found == nullptr) {
        throw ManagerGone{};
    }
    return found;
}

const CMPIBroker* Request::brokerOrNull() const {
    return hasManager() ? theConnection.broker() : nullptr;
}

const Class& Request::requestedClass() const {
    const std::string name = classNameOf(path);
    const Class* found = findClass(name);
    if (found == nullptr || sameName(name, computerClass)) {
        fail(CMPI_RC_ERR_INVALID_CLASS, "This provider does not serve the class \"" + name + "\".");
    }
    return *found;
}

void Request::give(const std::vector<const CMPIInstance*>& instances) const {
    giveAll<&CMPIResultFT::returnInstance>(*this, instances);
}

void Request::give(const std::vector<const CMPIObjectPath*>& paths) const {
    giveAll<&CMPIResultFT::returnObjectPath>(*this, paths);
}

ProviderSession::ProviderSession(const Request& itsRequest, Access access) : request(itsRequest) {
    request.broker();  // there must be one
    if (access == Access::change) {
        theConnection.requireOwner(guard);
    }
    theConnection.requireCurrent(guard);
}

ProviderSession::Paths ProviderSession::names(const LocalObjectPath& classPath) const {
    ResultCollector result;
    collect<&CMPIInstanceMIFT::enumerateInstanceNames>(result, request, theConnection.instanceInterface(),
                                                       classPath.handle());
    requireDone(result);
    return result.paths;
}

ProviderSession::Instances ProviderSession::instances(const LocalObjectPath& classPath) const {
    ResultCollector result;
    collect<&CMPIInstanceMIFT::enumerateInstances>(result, request, theConnection.instanceInterface(),
                                                   classPath.handle(), allProperties);
    requireDone(result);
    return result.instances;
}

ProviderSession::Paths ProviderSession::associatorNames(const LocalObjectPath& path, const Class& association) const {
    ResultCollector result;
    const char* const any = nullptr;
    collect<&CMPIAssociationMIFT::associatorNames>(result, request, theConnection.associationInterface(), path.handle(),
                                                   association.name, any, any, any);
    requireDone(result);
    return result.paths;
}

const CMPIInstance* ProviderSession::find(const LocalObjectPath& path, const Class& owner) const {
    ResultCollector result;
    collect<&CMPIInstanceMIFT::getInstance>(result, request, theConnection.instanceInterface(), path.handle(),
                                            allProperties);
    if (result.instances.empty() && !result.isDone && isListed(path, owner)) {
        requireDone(result);
    }
    return result.instances.empty() ? nullptr : result.instances.front();
}

/** Whether an instance exists: the provider completes its response neither after an error nor for a missing one. */
bool ProviderSession::isListed(const LocalObjectPath& path, const Class& owner) const {
    const Paths listed = names(LocalObjectPath(nameSpaceOf(path.handle()), owner));
    return std::any_of(listed.begin(), listed.end(), [&](const auto* each) { return samePath(each, path.handle()); });
}

const CMPIInstance* ProviderSession::get(const LocalObjectPath& path, const Class& owner) const {
    const CMPIInstance* instance = find(path, owner);
    if (instance == nullptr) {
        fail(CMPI_RC_ERR_NOT_FOUND, std::string("There is no such ") + owner.name + ".");
    }
    return instance;
}

void ProviderSession::create(const LocalObjectPath& path) {
    ResultCollector result;
    const LocalInstance ignored(Values{});  // the provider reads the path only
    collect<&CMPIInstanceMIFT::createInstance>(result, request, theConnection.instanceInterface(), path.handle(),
                                               ignored.handle());
    requireDone(result);
}

void ProviderSession::modify(const LocalObjectPath& path, const Values& values) {
    ResultCollector result;
    const LocalInstance instance(values);
    call<&CMPIInstanceMIFT::modifyInstance>(result, request, theConnection.instanceInterface(), path.handle(),
                                            instance.handle(), allProperties);
}

void ProviderSession::remove(const LocalObjectPath& path) {
    ResultCollector result;
    call<&CMPIInstanceMIFT::deleteInstance>(result, request, theConnection.instanceInterface(), path.handle());
}

}  // namespace gate

#include "lab/load/Client.h"

#include "lab/load/Requests.h"
#include "lab/load/Values.h"
#include "schema/ObjectPathText.h"

namespace cimhost::lab {
namespace {

ExpectedState::Values byName(const std::vector<NamedValue>& values) {
    ExpectedState::Values map;
    for (const NamedValue& each : values) {
        map[each.name] = each.value;
    }
    return map;
}

/** Whether a request of this kind is about an existing instance. */
bool needsInstance(OperationKind kind) {
    return kind == OperationKind::modify || kind == OperationKind::remove || kind == OperationKind::get;
}

}  // namespace

Client::Client(ObjectManager& itsManager, const Plan& itsPlan, const InitialState& itsInitial, unsigned itsNumber)
    : manager(itsManager),
      plan(itsPlan),
      initial(itsInitial),
      number(itsNumber),
      prefix(initial.prefix + "c" + std::to_string(number) + "-"),
      random(plan.seed, number),
      found(plan.shown),
      known(plan.classes.size()) {}

void Client::run(std::size_t requests) {
    for (std::size_t i = 0; i < requests; ++i) {
        sendOne();
    }
}

void Client::sendOne() {
    current = {random.below(plan.classes.size()), plan.mix.pick(random), {}, {}};
    if (needsInstance(current.kind) && state().isEmpty() && !plan.probes) {
        current.kind = OperationKind::create;
    }
    ++requestCount;
    CheckResult mismatch = send();
    found.count(current.kind, current.time, mismatch.has_value());
    if (mismatch) {
        found.note({number, requestCount, current.description, std::move(*mismatch)});
    }
}

CheckResult Client::send() {
    switch (current.kind) {
        case OperationKind::create:
            return create();
        case OperationKind::modify:
            return modify();
        case OperationKind::remove:
            return remove();
        case OperationKind::enumerate:
            return enumerate();
        case OperationKind::associate:
            return associate();
        default:
            return get();
    }
}

Response Client::perform(const Request& request) {
    current.description = std::string(nameOf(request.operation)) + " " + formatObjectPath(request.path);
    const auto start = std::chrono::steady_clock::now();
    Response response = manager.perform(request);
    current.time = std::chrono::steady_clock::now() - start;
    return response;
}

CheckResult Client::checkResponse(const Response& response, int code) {
    const std::string reason = response.crashReason();
    return reason.empty() ? checkStatus(response.status, code) : CheckResult(Mismatch{"died", "a response", reason});
}

CheckResult Client::create() {
    if (!state().isEmpty() && plan.probes && random.oneIn(16)) {
        return createAgain();
    }
    const std::string id = newId();
    const std::vector<NamedValue> values = plan.fills ? someValues() : std::vector<NamedValue>{};
    const Request request = createRequest(aClass(), id, values);
    const Response response = perform(request);
    CheckResult mismatch = checkResponse(response, CMPI_RC_OK);
    if (!mismatch) {
        mismatch = checkPath(response.paths.front(), request.path);
    }
    if (mismatch) {
        state().doubt(id);
    } else {
        state().created(id, byName(values));
    }
    return mismatch;
}

CheckResult Client::createAgain() {
    const std::string id = state().any(random);
    CheckResult mismatch = checkResponse(perform(createRequest(aClass(), id, {})), CMPI_RC_ERR_ALREADY_EXISTS);
    if (mismatch) {
        state().doubt(id);
    }
    return mismatch;
}

CheckResult Client::requestMissing(const Request& request) {
    return checkResponse(perform(request), CMPI_RC_ERR_NOT_FOUND);
}

CheckResult Client::modify() {
    return probes() ? requestMissing(modifyRequest(aClass(), missingId(), someValues(), plan.listsChanges))
                    : modifyOwn(state().any(random));
}

CheckResult Client::modifyOwn(const std::string& id) {
    const std::vector<NamedValue> values = someValues();
    CheckResult mismatch = checkResponse(perform(modifyRequest(aClass(), id, values, plan.listsChanges)), CMPI_RC_OK);
    if (mismatch) {
        state().doubt(id);
    } else {
        state().modified(id, byName(values));
    }
    return mismatch;
}

CheckResult Client::remove() {
    return probes() ? requestMissing(Request::deleteInstance(aClass().instancePath(missingId())))
                    : removeOwn(state().any(random));
}

CheckResult Client::removeOwn(const std::string& id) {
    CheckResult mismatch = checkResponse(perform(Request::deleteInstance(aClass().instancePath(id))), CMPI_RC_OK);
    if (mismatch) {
        state().doubt(id);
    } else {
        state().removed(id);
        lastRemoved = id;
    }
    return mismatch;
}

CheckResult Client::get() {
    if (probes()) {
        return requestMissing(Request::getInstance(aClass().instancePath(missingId())));
    }
    const std::string id = state().any(random);
    const Response response = perform(Request::getInstance(aClass().instancePath(id)));
    CheckResult mismatch = checkResponse(response, CMPI_RC_OK);
    return mismatch ? mismatch : checkInstance(aClass(), response.instances.front(), id, state().instances().at(id));
}

CheckResult Client::enumerate() {
    const bool hasProperties = random.coin();
    const ObjectPath& path = aClass().path;
    const Response response =
        perform(hasProperties ? Request::enumerateInstances(path) : Request::enumerateInstanceNames(path));
    CheckResult mismatch = checkResponse(response, CMPI_RC_OK);
    const Expectation expectation{aClass(), initial.ids[current.index], state(), prefix, initial.prefix};
    return mismatch ? mismatch : checkListing(expectation, listed(response), hasProperties);
}

CheckResult Client::associate() {
    const std::size_t which = random.below(associationOperations.size());
    const Associated& before = initial.associated[which];
    const Response response = perform(associationRequest(associationOperations[which], plan));
    CheckResult mismatch = checkResponse(response, before.code);
    return mismatch ? mismatch : checkAssociated(associated(response, initial.prefix), before.paths);
}

std::string Client::newId() {
    return prefix + std::to_string(++idCount);
}

std::string Client::missingId() {
    const bool isOld = !lastRemoved.empty() && random.coin();
    return isOld ? lastRemoved : prefix + "none" + std::to_string(random.below(100));
}

std::vector<NamedValue> Client::someValues() {
    std::vector<NamedValue> values;
    for (const Property* property : aClass().modifiable) {
        if (random.oneIn(3)) {
            values.push_back({property->name, makeValue(*property, random)});
        }
    }
    if (values.empty() && !aClass().modifiable.empty()) {
        const Property* property = random.oneOf(aClass().modifiable);
        values.push_back({property->name, makeValue(*property, random)});
    }
    return values;
}

}  // namespace cimhost::lab

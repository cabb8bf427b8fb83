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

/** Whether it is done to an instance that is there. */
bool needsInstance(OperationKind kind) {
    return kind == OperationKind::modify || kind == OperationKind::remove || kind == OperationKind::get;
}

}  // namespace

Client::Client(ObjectManager& itsManager, const Plan& itsPlan, const Baseline& itsBaseline, unsigned itsNumber)
    : manager(itsManager),
      plan(itsPlan),
      baseline(itsBaseline),
      number(itsNumber),
      prefix(baseline.prefix + "c" + std::to_string(number) + "-"),
      random(plan.seed, number),
      found(plan.shown),
      known(plan.classes.size()) {}

void Client::run(std::size_t requests) {
    for (std::size_t i = 0; i < requests; ++i) {
        take();
    }
}

void Client::take() {
    turn = {random.below(plan.classes.size()), plan.mix.pick(random), {}, {}};
    if (needsInstance(turn.kind) && state().isEmpty() && !plan.probes) {
        turn.kind = OperationKind::create;
    }
    ++asked;
    Verdict verdict = act();
    found.count(turn.kind, turn.time, verdict.has_value());
    if (verdict) {
        found.note({number, asked, turn.request, std::move(*verdict)});
    }
}

Verdict Client::act() {
    switch (turn.kind) {
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

Response Client::ask(const Request& request) {
    turn.request = std::string(nameOf(request.operation)) + " " + formatObjectPath(request.path);
    const auto start = std::chrono::steady_clock::now();
    Response response = manager.perform(request);
    turn.time = std::chrono::steady_clock::now() - start;
    return response;
}

Verdict Client::judge(const Response& response, int code) {
    const std::string reason = response.crashReason();
    return reason.empty() ? checkStatus(response.status, code) : Verdict(Mismatch{"died", "an answer", reason});
}

Verdict Client::create() {
    if (!state().isEmpty() && plan.probes && random.oneIn(16)) {
        return createAgain();
    }
    const std::string id = newId();
    const std::vector<NamedValue> values = plan.fills ? someValues() : std::vector<NamedValue>{};
    const Request request = createRequest(aClass(), id, values);
    const Response response = ask(request);
    Verdict verdict = judge(response, CMPI_RC_OK);
    if (!verdict) {
        verdict = checkPath(response.paths.front(), request.path);
    }
    if (verdict) {
        state().doubt(id);
    } else {
        state().created(id, byName(values));
    }
    return verdict;
}

Verdict Client::createAgain() {
    const std::string id = state().any(random);
    Verdict verdict = judge(ask(createRequest(aClass(), id, {})), CMPI_RC_ERR_ALREADY_EXISTS);
    if (verdict) {
        state().doubt(id);
    }
    return verdict;
}

Verdict Client::askForMissing(const Request& request) {
    return judge(ask(request), CMPI_RC_ERR_NOT_FOUND);
}

Verdict Client::modify() {
    return probes() ? askForMissing(modifyRequest(aClass(), missingId(), someValues(), plan.listsChanges))
                    : modifyOwn(state().any(random));
}

Verdict Client::modifyOwn(const std::string& id) {
    const std::vector<NamedValue> values = someValues();
    Verdict verdict = judge(ask(modifyRequest(aClass(), id, values, plan.listsChanges)), CMPI_RC_OK);
    if (verdict) {
        state().doubt(id);
    } else {
        state().modified(id, byName(values));
    }
    return verdict;
}

Verdict Client::remove() {
    return probes() ? askForMissing(Request::deleteInstance(aClass().instancePath(missingId())))
                    : removeOwn(state().any(random));
}

Verdict Client::removeOwn(const std::string& id) {
    Verdict verdict = judge(ask(Request::deleteInstance(aClass().instancePath(id))), CMPI_RC_OK);
    if (verdict) {
        state().doubt(id);
    } else {
        state().removed(id);
        lastRemoved = id;
    }
    return verdict;
}

Verdict Client::get() {
    if (probes()) {
        return askForMissing(Request::getInstance(aClass().instancePath(missingId())));
    }
    const std::string id = state().any(random);
    const Response response = ask(Request::getInstance(aClass().instancePath(id)));
    Verdict verdict = judge(response, CMPI_RC_OK);
    return verdict ? verdict : checkInstance(aClass(), response.instances.front(), id, state().instances().at(id));
}

Verdict Client::enumerate() {
    const bool hasProperties = random.coin();
    const ObjectPath& path = aClass().path;
    const Response response =
        ask(hasProperties ? Request::enumerateInstances(path) : Request::enumerateInstanceNames(path));
    Verdict verdict = judge(response, CMPI_RC_OK);
    const Expectation expectation{aClass(), baseline.ids[turn.index], state(), prefix, baseline.prefix};
    return verdict ? verdict : checkListing(expectation, listed(response), hasProperties);
}

Verdict Client::associate() {
    const std::size_t which = random.below(associationOperations.size());
    const Associated& before = baseline.associated[which];
    const Response response = ask(associationRequest(associationOperations[which], plan));
    Verdict verdict = judge(response, before.code);
    return verdict ? verdict : checkAssociated(associated(response, baseline.prefix), before.paths);
}

std::string Client::newId() {
    return prefix + std::to_string(++made);
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

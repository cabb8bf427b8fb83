#include "load/Client.h"

#include "load/Requests.h"
#include "load/Values.h"
#include "operations/Interpretation.h"
#include "schema/ObjectPathText.h"

namespace cimhost::load {
namespace {

Ledger::Values byName(const std::vector<NamedValue>& values) {
    Ledger::Values map;
    for (const NamedValue& each : values) {
        map[each.name] = each.value;
    }
    return map;
}

/** Whether it is done to an instance that is there. */
bool needsInstance(Deed deed) {
    return deed == Deed::modify || deed == Deed::remove || deed == Deed::get;
}

/** "died" when the object manager's provider process would have ended with the answer. */
Verdict judgeFatal(const Answer<std::vector<RawAnswer>>& answers, Operation operation) {
    for (const RawAnswer& each : answers.value) {
        const std::string reason = fatality(each, operation);
        if (!reason.empty()) {
            return Wrong{"died", "an answer", reason};
        }
    }
    return std::nullopt;
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
    if (needsInstance(turn.deed) && ledger().isEmpty() && !plan.probes) {
        turn.deed = Deed::create;
    }
    ++asked;
    Verdict verdict = act();
    found.count(turn.deed, turn.time, verdict.has_value());
    if (verdict) {
        found.note({number, asked, turn.request, std::move(*verdict)});
    }
}

Verdict Client::act() {
    switch (turn.deed) {
        case Deed::create:
            return create();
        case Deed::modify:
            return modify();
        case Deed::remove:
            return remove();
        case Deed::enumerate:
            return enumerate();
        case Deed::associate:
            return associate();
        default:
            return get();
    }
}

Client::Answers Client::ask(const Request& request) {
    turn.request = std::string(nameOf(request.operation)) + " " + formatObjectPath(request.path);
    const auto start = std::chrono::steady_clock::now();
    Answers answers = manager.run(request);
    turn.time = std::chrono::steady_clock::now() - start;
    return answers;
}

Verdict Client::judge(const Answers& answers, const Status& status, Operation operation, int code) const {
    Verdict fatal = judgeFatal(answers, operation);
    return fatal ? fatal : checkStatus(status, code);
}

Verdict Client::create() {
    if (!ledger().isEmpty() && plan.probes && random.oneIn(16)) {
        return createAgain();
    }
    const std::string id = newId();
    const std::vector<NamedValue> values = plan.fills ? someValues() : std::vector<NamedValue>{};
    const Request request = createRequest(aClass(), id, values);
    const Answers answers = ask(request);
    const Answer<ObjectPath> path = createdPath(answers);
    Verdict verdict = judge(answers, path.status, request.operation, CMPI_RC_OK);
    if (!verdict) {
        verdict = checkPath(path.value, request.path);
    }
    if (verdict) {
        ledger().doubt(id);
    } else {
        ledger().created(id, byName(values));
    }
    return verdict;
}

Verdict Client::createAgain() {
    const std::string id = ledger().any(random);
    const Request request = createRequest(aClass(), id, {});
    const Answers answers = ask(request);
    Verdict verdict = judge(answers, createdPath(answers).status, request.operation, CMPI_RC_ERR_ALREADY_EXISTS);
    if (verdict) {
        ledger().doubt(id);
    }
    return verdict;
}

Verdict Client::askForMissing(const Request& request) {
    const Answers answers = ask(request);
    const bool gets = request.operation == Operation::getInstance;
    const Status status = gets ? oneInstance(answers, request.path).status : statusOf(answers, request.operation);
    return judge(answers, status, request.operation, CMPI_RC_ERR_NOT_FOUND);
}

Verdict Client::modify() {
    return probes() ? askForMissing(modifyRequest(aClass(), missingId(), someValues(), plan.listsChanges))
                    : modifyOwn(ledger().any(random));
}

Verdict Client::modifyOwn(const std::string& id) {
    const std::vector<NamedValue> values = someValues();
    const Request request = modifyRequest(aClass(), id, values, plan.listsChanges);
    const Answers answers = ask(request);
    Verdict verdict = judge(answers, statusOf(answers, request.operation), request.operation, CMPI_RC_OK);
    if (verdict) {
        ledger().doubt(id);
    } else {
        ledger().modified(id, byName(values));
    }
    return verdict;
}

Verdict Client::remove() {
    const auto operation = Operation::deleteInstance;
    return probes() ? askForMissing(instanceRequest(operation, aClass(), missingId()))
                    : removeOwn(ledger().any(random));
}

Verdict Client::removeOwn(const std::string& id) {
    const Request request = instanceRequest(Operation::deleteInstance, aClass(), id);
    const Answers answers = ask(request);
    Verdict verdict = judge(answers, statusOf(answers, request.operation), request.operation, CMPI_RC_OK);
    if (verdict) {
        ledger().doubt(id);
    } else {
        ledger().removed(id);
        lastRemoved = id;
    }
    return verdict;
}

Verdict Client::get() {
    const auto operation = Operation::getInstance;
    if (probes()) {
        return askForMissing(instanceRequest(operation, aClass(), missingId()));
    }
    const std::string id = ledger().any(random);
    const Request request = instanceRequest(operation, aClass(), id);
    const Answers answers = ask(request);
    const Answer<Instance> instance = oneInstance(answers, request.path);
    Verdict verdict = judge(answers, instance.status, operation, CMPI_RC_OK);
    return verdict ? verdict : checkInstance(aClass(), instance.value, id, ledger().instances().at(id));
}

Verdict Client::enumerate() {
    const bool hasProperties = random.coin();
    const Operation operation = hasProperties ? Operation::enumerateInstances : Operation::enumerateInstanceNames;
    const Answers answers = ask(classRequest(operation, aClass()));
    const Answer<std::vector<Instance>> instances = listed(answers, operation);
    Verdict verdict = judge(answers, instances.status, operation, CMPI_RC_OK);
    const Expectation expectation{aClass(), baseline.ids[turn.index], ledger(), prefix, baseline.prefix};
    return verdict ? verdict : checkListing(expectation, instances.value, hasProperties);
}

Verdict Client::associate() {
    const std::size_t which = random.below(associationOperations.size());
    const Operation operation = associationOperations[which];
    const Associated& before = baseline.associated[which];
    const Answers answers = ask(associationRequest(operation, plan));
    const Answer<std::vector<std::string>> now = associated(answers, operation, baseline.prefix);
    Verdict verdict = judge(answers, now.status, operation, before.code);
    return verdict ? verdict : checkAssociated(now.value, before.paths);
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

}  // namespace cimhost::load

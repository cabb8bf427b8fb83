#include "support/RecordingBroker.h"

#include <algorithm>
#include <mutex>
#include <utility>

#include "broker/Arena.h"
#include "cim/Names.h"
#include "support/Recording.h"

namespace testsupport {

/** The responses to enumerations. */
class ServedInstances : public cimhost::UpCalls {
public:
    void serve(const std::string& className, std::vector<cimhost::Instance> instances) {
        cimhost::Response response = cimhost::Response::ofInstances(std::move(instances));
        for (const cimhost::Instance& instance : response.instances) {
            response.paths.push_back(instance.path);
        }
        served[cim::foldedName(className)] = std::move(response);
    }

    void fail(const std::string& className, CMPIrc rc) {
        served[cim::foldedName(className)] = cimhost::Response::failed({rc, "requested failure"});
    }

    cimhost::Response perform(cimhost::Request request) override {
        const auto found = served.find(cim::foldedName(request.path.className));
        if (request.operation > cimhost::Operation::enumerateInstanceNames) {
            return cimhost::notSupported(request.operation);
        }
        if (found == served.end()) {
            return cimhost::Response::failed({CMPI_RC_ERR_INVALID_CLASS, request.path.className + " is not served"});
        }
        return found->second;
    }

private:
    std::map<std::string, cimhost::Response> served;
};

/** The members of a RecordingBroker. */
struct RecordingBroker::State {
    State()
        : tables(recordingTables()),
          broker({[this](const std::string& name) { return classes ? classes(name) : nullptr; }, &upCalls, nullptr,
                  &tables, true}),
          handle(*broker.handle()),
          objects(tables) {}

    /** Whether a function table is one of this broker. */
    bool owns(const void* table) const {
        const void* all[] = {&tables.broker,   &tables.string, &tables.objectPath,  &tables.instance,
                             &tables.dateTime, &tables.array,  &tables.enumeration, &tables.args,
                             &tables.context,  &tables.result, &tables.error};
        return std::find(std::begin(all), std::end(all), table) != std::end(all);
    }

    cimhost::FunctionTables tables;
    ServedInstances upCalls;
    cimhost::ClassInfoLookup classes;
    cimhost::Broker broker;
    CMPIBroker handle;
    cimhost::Arena objects;  ///< created for the test
    Recording recording;
};

namespace {

/** The existing brokers, the newest last. */
struct Alive {
    std::mutex mutex;
    std::vector<RecordingBroker::State*> states;
};

Alive& alive() {
    static Alive all;
    return all;
}

}  // namespace

Recording* recordingOf(const void* table) {
    Alive& all = alive();
    const std::lock_guard<std::mutex> lock(all.mutex);
    if (all.states.empty()) {
        return nullptr;
    }
    const auto found = std::find_if(all.states.begin(), all.states.end(),
                                    [&](const RecordingBroker::State* state) { return state->owns(table); });
    return found == all.states.end() ? &all.states.back()->recording : &(*found)->recording;
}

RecordingBroker::RecordingBroker() : state(std::make_unique<State>()) {
    const std::lock_guard<std::mutex> lock(alive().mutex);
    alive().states.push_back(state.get());
}

RecordingBroker::~RecordingBroker() {
    const std::lock_guard<std::mutex> lock(alive().mutex);
    auto& states = alive().states;
    states.erase(std::remove(states.begin(), states.end(), state.get()), states.end());
}

const CMPIBroker* RecordingBroker::handle() const {
    return &state->handle;
}

cimhost::Broker& RecordingBroker::broker() {
    return state->broker;
}

std::vector<RecordedCall> RecordingBroker::calls() const {
    return state->recording.calls();
}

std::vector<RecordedCall> RecordingBroker::calls(const std::string& function) const {
    requireFunction(function);
    std::vector<RecordedCall> found = calls();
    found.erase(
        std::remove_if(found.begin(), found.end(), [&](const RecordedCall& call) { return call.function != function; }),
        found.end());
    return found;
}

std::vector<std::string> RecordingBroker::functions() const {
    std::vector<std::string> names;
    for (const RecordedCall& call : calls()) {
        names.push_back(call.function);
    }
    return names;
}

int RecordingBroker::count(const std::string& function) const {
    return static_cast<int>(calls(function).size());
}

void RecordingBroker::forget() {
    state->recording.forget();
}

void RecordingBroker::failCall(const std::string& function, int number, CMPIrc rc) {
    state->recording.fail(function, number, {rc, {}});
}

void RecordingBroker::failEvery(const std::string& function, CMPIrc rc) {
    state->recording.fail(function, std::nullopt, {rc, {}});
}

void RecordingBroker::answerNothing(const std::string& function, int number) {
    failCall(function, number, CMPI_RC_OK);
}

void RecordingBroker::answerNothingEver(const std::string& function) {
    failEvery(function, CMPI_RC_OK);
}

void RecordingBroker::answerData(const std::string& function, const std::string& name, const CMPIData& data,
                                 CMPIrc rc) {
    state->recording.returnData(function, name, {rc, data});
}

void RecordingBroker::answerState(const std::string& function, CMPIValueState valueState) {
    state->recording.returnState(function, valueState);
}

void RecordingBroker::cancelFailures() {
    state->recording.cancelFailures();
}

CMPIString* RecordingBroker::string(const std::string& text) {
    return state->objects.make<CMPIString>(text);
}

CMPIString* RecordingBroker::stringWithoutCharacters() {
    CMPIString* made = string({});
    state->recording.silence(made);
    return made;
}

CMPIObjectPath* RecordingBroker::objectPath(const cimhost::ObjectPath& path) {
    return state->objects.make<CMPIObjectPath>(path);
}

CMPIInstance* RecordingBroker::instance(const cimhost::Instance& instance) {
    return state->objects.make<CMPIInstance>({instance});
}

void RecordingBroker::emulate(Manager manager) {
    cimhost::lab::changeTables(manager, state->tables);
    if (!cimhost::lab::emulationOf(manager)->hasMemoryTable()) {
        state->handle.mft = nullptr;
    }
}

void RecordingBroker::know(cimhost::ClassInfoLookup classes) {
    state->classes = std::move(classes);
}

void RecordingBroker::serve(const std::string& className, std::vector<cimhost::Instance> instances) {
    state->upCalls.serve(className, std::move(instances));
}

void RecordingBroker::failEnumeration(const std::string& className, CMPIrc rc) {
    state->upCalls.fail(className, rc);
}

}  // namespace testsupport

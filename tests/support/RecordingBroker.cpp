#include "support/RecordingBroker.h"

#include <algorithm>
#include <mutex>
#include <utility>

#include "broker/Arena.h"
#include "schema/Names.h"
#include "support/Recording.h"

namespace testsupport {
namespace {

/** What the broker answers to enumerations. */
class ServedInstances : public cimhost::UpCalls {
public:
    void serve(const std::string& className, std::vector<cimhost::Instance> instances) {
        served[cimhost::foldedName(className)] = {{}, std::move(instances)};
    }

    void fail(const std::string& className, CMPIrc rc) {
        served[cimhost::foldedName(className)] = {{rc, "ordered to fail"}, {}};
    }

    cimhost::Answer<std::vector<cimhost::Instance>> enumerateInstances(const cimhost::ContextEntries&,
                                                                       const cimhost::ObjectPath& path,
                                                                       const cimhost::PropertyList&) override {
        const auto found = served.find(cimhost::foldedName(path.className));
        if (found == served.end()) {
            return {{CMPI_RC_ERR_INVALID_CLASS, path.className + " is not served"}, {}};
        }
        return found->second;
    }

    cimhost::Answer<std::vector<cimhost::ObjectPath>> enumerateInstanceNames(const cimhost::ContextEntries& context,
                                                                             const cimhost::ObjectPath& path) override {
        const auto instances = enumerateInstances(context, path, {});
        std::vector<cimhost::ObjectPath> paths;
        for (const cimhost::Instance& instance : instances.value) {
            paths.push_back(instance.path);
        }
        return {instances.status, std::move(paths)};
    }

private:
    std::map<std::string, cimhost::Answer<std::vector<cimhost::Instance>>> served;
};

}  // namespace

/** What a RecordingBroker is made of. */
struct RecordingBroker::State {
    State()
        : tables(recordingTables()),
          broker({[this](const std::string& name) { return shapes ? shapes(name) : nullptr; }, &upCalls, nullptr,
                  &tables, Manager::standard}),
          handle(*broker.handle()),
          objects(tables) {}

    /** Whether a handle's table pointer leads here. */
    bool owns(const void* table) const {
        const void* all[] = {&tables.broker,   &tables.string, &tables.objectPath,  &tables.instance,
                             &tables.dateTime, &tables.array,  &tables.enumeration, &tables.args,
                             &tables.context,  &tables.result, &tables.error};
        return std::find(std::begin(all), std::end(all), table) != std::end(all);
    }

    cimhost::FunctionTables tables;
    ServedInstances upCalls;
    cimhost::ClassShapeLookup shapes;
    cimhost::Broker broker;
    CMPIBroker handle;
    cimhost::Arena objects;  ///< made for the test
    Recording recording;
};

namespace {

/** The brokers alive, the youngest last. */
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
    state->recording.order(function, number, {rc, {}});
}

void RecordingBroker::failEvery(const std::string& function, CMPIrc rc) {
    state->recording.order(function, std::nullopt, {rc, {}});
}

void RecordingBroker::answerNothing(const std::string& function, int number) {
    failCall(function, number, CMPI_RC_OK);
}

void RecordingBroker::answerNothingEver(const std::string& function) {
    failEvery(function, CMPI_RC_OK);
}

void RecordingBroker::answerData(const std::string& function, const std::string& name, const CMPIData& data,
                                 CMPIrc rc) {
    state->recording.orderData(function, name, {rc, data});
}

void RecordingBroker::answerState(const std::string& function, CMPIValueState valueState) {
    state->recording.orderState(function, valueState);
}

void RecordingBroker::obey() {
    state->recording.obey();
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
    return state->objects.make<CMPIInstance>({instance, nullptr, {}});
}

void RecordingBroker::poseAs(Manager manager) {
    const cimhost::Profile& profile = cimhost::profileOf(manager);
    cimhost::applyGaps(profile, state->tables);
    if (profile.gaps == cimhost::BrokerGaps::memoryTable) {
        state->handle.mft = nullptr;
    }
}

void RecordingBroker::behaveAs(Manager manager) {
    poseAs(manager);
    state->broker.play(manager);
}

void RecordingBroker::know(cimhost::ClassShapeLookup shapes) {
    state->shapes = std::move(shapes);
}

void RecordingBroker::serve(const std::string& className, std::vector<cimhost::Instance> instances) {
    state->upCalls.serve(className, std::move(instances));
}

void RecordingBroker::failEnumeration(const std::string& className, CMPIrc rc) {
    state->upCalls.fail(className, rc);
}

}  // namespace testsupport

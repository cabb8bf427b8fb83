#include "support/Recording.h"

#include <algorithm>
#include <stdexcept>

#include "cim/Names.h"

namespace testsupport {

void requireFunction(const std::string& function) {
    if (recordedFunctions().count(function) == 0) {
        throw std::invalid_argument("no function of the broker: " + function);
    }
}

void Recording::silence(const CMPIString* string) {
    const std::lock_guard<std::mutex> lock(mutex);
    silent.insert(string);
}

std::optional<InjectedResult> Recording::note(RecordedCall call, const void* object) {
    const std::lock_guard<std::mutex> lock(mutex);
    const int number = ++counts[call.function];
    const std::string name = call.arguments.empty() ? std::string{} : cim::foldedName(call.arguments.front());
    const auto byName = dataByName.find({call.function, name});
    const std::vector<InjectedFailure>& ofFunction = failures[call.function];
    const bool isSilent = call.function == "CMPIStringFT.getCharPtr" && silent.count(object) != 0;
    made.push_back(std::move(call));
    if (isSilent) {
        return InjectedResult{};
    }
    const auto due = std::find_if(ofFunction.rbegin(), ofFunction.rend(), [&](const InjectedFailure& failure) {
        return !failure.number || *failure.number == number;
    });
    if (due != ofFunction.rend()) {
        return due->result;
    }
    return byName == dataByName.end() ? std::nullopt : std::optional<InjectedResult>(byName->second);
}

void Recording::fail(const std::string& function, std::optional<int> number, InjectedResult result) {
    requireFunction(function);
    const std::lock_guard<std::mutex> lock(mutex);
    if (number) {
        *number += counts[function];
    }
    failures[function].push_back({number, result});
}

void Recording::returnData(const std::string& function, const std::string& name, InjectedResult result) {
    requireFunction(function);
    const std::lock_guard<std::mutex> lock(mutex);
    dataByName[{function, cim::foldedName(name)}] = result;
}

void Recording::returnState(const std::string& function, CMPIValueState state) {
    requireFunction(function);
    const std::lock_guard<std::mutex> lock(mutex);
    states[function] = state;
}

CMPIData Recording::withInjectedState(const std::string& function, CMPIData data) const {
    const std::lock_guard<std::mutex> lock(mutex);
    const auto ordered = states.find(function);
    data.state = ordered == states.end() ? data.state : ordered->second;
    return data;
}

void Recording::cancelFailures() {
    const std::lock_guard<std::mutex> lock(mutex);
    states.clear();
    failures.clear();
    dataByName.clear();
}

std::vector<RecordedCall> Recording::calls() const {
    const std::lock_guard<std::mutex> lock(mutex);
    return made;
}

void Recording::forget() {
    const std::lock_guard<std::mutex> lock(mutex);
    made.clear();
}

}  // namespace testsupport

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

std::optional<Verdict> Recording::note(RecordedCall call, const void* object) {
    const std::lock_guard<std::mutex> lock(mutex);
    const int number = ++counts[call.function];
    const std::string name = call.arguments.empty() ? std::string{} : cim::foldedName(call.arguments.front());
    const auto byName = dataOrders.find({call.function, name});
    const std::vector<Order>& ofFunction = orders[call.function];
    const bool isSilent = call.function == "CMPIStringFT.getCharPtr" && silent.count(object) != 0;
    made.push_back(std::move(call));
    if (isSilent) {
        return Verdict{};
    }
    const auto due = std::find_if(ofFunction.rbegin(), ofFunction.rend(),
                                  [&](const Order& order) { return !order.dueAt || *order.dueAt == number; });
    if (due != ofFunction.rend()) {
        return due->verdict;
    }
    return byName == dataOrders.end() ? std::nullopt : std::optional<Verdict>(byName->second);
}

void Recording::order(const std::string& function, std::optional<int> number, Verdict verdict) {
    requireFunction(function);
    const std::lock_guard<std::mutex> lock(mutex);
    const std::optional<int> dueAt = number ? std::optional<int>(counts[function] + *number) : std::nullopt;
    orders[function].push_back({dueAt, verdict});
}

void Recording::orderData(const std::string& function, const std::string& name, Verdict verdict) {
    requireFunction(function);
    const std::lock_guard<std::mutex> lock(mutex);
    dataOrders[{function, cim::foldedName(name)}] = verdict;
}

void Recording::orderState(const std::string& function, CMPIValueState state) {
    requireFunction(function);
    const std::lock_guard<std::mutex> lock(mutex);
    states[function] = state;
}

CMPIData Recording::withOrderedState(const std::string& function, CMPIData data) const {
    const std::lock_guard<std::mutex> lock(mutex);
    const auto ordered = states.find(function);
    data.state = ordered == states.end() ? data.state : ordered->second;
    return data;
}

void Recording::obey() {
    const std::lock_guard<std::mutex> lock(mutex);
    states.clear();
    orders.clear();
    dataOrders.clear();
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

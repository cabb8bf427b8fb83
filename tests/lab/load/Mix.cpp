#include "lab/load/Mix.h"

#include <algorithm>
#include <charconv>
#include <iterator>
#include <numeric>
#include <sstream>

namespace cimhost::lab {
namespace {

constexpr std::array<const char*, operationKindCount> names{"create",    "modify", "delete",
                                                            "enumerate", "get",    "associate"};
constexpr std::array<unsigned, operationKindCount> usualWeights{20, 25, 15, 5, 35, 0};

std::size_t kindNamed(const std::string& name) {
    const auto* const found = std::find(names.begin(), names.end(), name);
    if (found == names.end()) {
        throw PlanError(name + " is not one of create, modify, delete, enumerate, get and associate");
    }
    return static_cast<std::size_t>(std::distance(names.begin(), found));
}

unsigned weightFrom(const std::string& digits) {
    unsigned weight = 0;
    const char* end = digits.data() + digits.size();
    const auto read = std::from_chars(digits.data(), end, weight);
    if (digits.empty() || read.ec != std::errc() || read.ptr != end || weight > 1'000'000) {
        throw PlanError("'" + digits + "' is not a weight; write a number up to 1000000");
    }
    return weight;
}

}  // namespace

const char* nameOf(OperationKind kind) {
    return names[static_cast<std::size_t>(kind)];
}

Mix::Mix() : weights(usualWeights) {}

Mix::Mix(const std::string& list) {
    std::istringstream parts(list);
    for (std::string part; std::getline(parts, part, ',');) {
        const std::size_t equals = part.find('=');
        if (equals == std::string::npos) {
            throw PlanError("'" + part + "' is not NAME=WEIGHT, such as create=2");
        }
        weights[kindNamed(part.substr(0, equals))] = weightFrom(part.substr(equals + 1));
    }
    if (std::all_of(weights.begin(), weights.end(), [](unsigned each) { return each == 0; })) {
        throw PlanError("all weights of the mix '" + list + "' are 0");
    }
}

OperationKind Mix::pick(Random& random) const {
    std::uint64_t left = random.below(std::accumulate(weights.begin(), weights.end(), std::uint64_t{0}));
    std::size_t kind = 0;
    while (left >= weights[kind]) {
        left -= weights[kind++];
    }
    return static_cast<OperationKind>(kind);
}

}  // namespace cimhost::lab

#pragma once

#include <array>
#include <stdexcept>
#include <string>

#include "lab/load/Random.h"

namespace cimhost::lab {

/** A load that cannot be run as it is wanted; the text says why. */
class PlanError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** What clients do. */
enum class OperationKind { create, modify, remove, enumerate, get, associate };

constexpr std::size_t operationKindCount = 6;

/** "create", "modify", "delete" and so on. */
const char* nameOf(OperationKind kind);

/** How often clients do what, as weights. */
class Mix {
public:
    /** Something of everything, but for associations. */
    Mix();

    /** Reads "create=2,get=5": what is not named is not done. PlanError when the text is none or nothing is left. */
    explicit Mix(const std::string& text);

    unsigned weight(OperationKind kind) const { return weights[static_cast<std::size_t>(kind)]; }
    OperationKind pick(Random& random) const;

private:
    std::array<unsigned, operationKindCount> weights{};
};

}  // namespace cimhost::lab

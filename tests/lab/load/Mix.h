#pragma once

#include <array>
#include <stdexcept>
#include <string>

#include "lab/load/Random.h"

namespace cimhost::lab {

/** A load is not possible. The message says why. */
class PlanError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/** The kinds of requests of clients. */
enum class OperationKind { create, modify, remove, enumerate, get, associate };

constexpr std::size_t operationKindCount = 6;

/** "create", "modify", "delete" and so on. */
const char* nameOf(OperationKind kind);

/** The weights of the kinds of requests. */
class Mix {
public:
    /** The usual weights, without associations. */
    Mix();

    /** Reads a list such as "create=2,get=5". Other kinds have the weight 0. @throws PlanError if it is not such a list
     */
    explicit Mix(const std::string& list);

    unsigned weight(OperationKind kind) const { return weights[static_cast<std::size_t>(kind)]; }
    OperationKind pick(Random& random) const;

private:
    std::array<unsigned, operationKindCount> weights{};
};

}  // namespace cimhost::lab

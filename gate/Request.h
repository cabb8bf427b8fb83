#pragma once

#include "Gate.h"
#include "Schema.h"

#include <cmpift.h>

#include <cstddef>
#include <vector>

namespace gate {

/** The computers' class. Another provider serves it; this one's associations begin there. */
constexpr const char* computerClass = "VELKO_ComputerSystem";

/** One request: what the object manager passed, all of it borrowed. */
struct Request {
    mutable const CMPIBroker* broker;  ///< the object manager's own: the one that the provider has, at each turn anew
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    std::size_t round;  ///< of the gate, in which it came

    /** Whether its object manager has not ended since. */
    bool hasManager() const { return theGate.round() == round; }

    /** Ended when it has: for who is about to call it. */
    void requireManager() const {
        if (!hasManager()) {
            throw Ended{};
        }
    }

    /** The path's class; CMPI_RC_ERR_INVALID_CLASS when it is none that the provider serves. */
    const Class& requestedClass() const;

    /** Hands an answer out; fails when the object manager does not take it. */
    void give(const CMPIInstance* instance) const;
    void give(const CMPIObjectPath* path) const;

    /** Ends the answer. */
    void finish() const;

    /** Hands out all answers and ends: called when all are made, so that none goes out of those that fail. */
    template <class Answer>
    void giveAll(const std::vector<Answer>& answers) const {
        for (const Answer& answer : answers) {
            give(answer);
        }
        finish();
    }
};

}  // namespace gate

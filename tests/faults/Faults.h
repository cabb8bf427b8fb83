#pragma once

#include <functional>
#include <iosfwd>
#include <map>
#include <string>
#include <vector>

#include "Operations.h"

// Letting operations of the system and allocations fail, for a test, on its own thread. What the object manager that
// the test plays does for the provider never fails, and is not counted.

namespace faults {

/** Names kinds as a person would. */
const char* nameOf(OperationKind kind);

/** Which operations fail, counted from 1 since the fault was armed, and how. */
struct Fault {
    OperationKind kind = operationAllocate;
    int number = 1;
    bool lasting = false;  ///< all of the kind from that one on, instead of that one alone
    int error = 0;         ///< errno value; 0 fails allocations, and does other operations in part

    /** What happens at that operation instead of a failure. */
    std::function<void()> instead{};
};

std::ostream& operator<<(std::ostream& stream, const Fault& fault);

/** How often each kind of operation came. */
using Counts = std::map<OperationKind, int>;

/**
 * Faults happen, and operations are counted, on this thread while one of these lives; there is one at a time. Makes
 * nothing that allocates while it counts.
 */
class Armed {
public:
    explicit Armed(const Fault& fault);
    Armed();  ///< counts only
    ~Armed();
    Armed(const Armed&) = delete;
    Armed& operator=(const Armed&) = delete;

    /** How often each kind of operation came until now. */
    Counts counts() const;

private:
    void begin();
};

/** The kinds that are not allocations, and the errno values with which one of them is let fail. */
struct FileFailure {
    OperationKind kind;
    int error;
};
const std::vector<FileFailure>& fileFailures();

}  // namespace faults

#pragma once

#include <functional>
#include <iosfwd>
#include <limits>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "Operations.h"

// Letting operations of the system and allocations fail, for a test, on its own thread. What the object manager that
// the test plays does for the provider never fails, and is not counted.

namespace faults {

/** Names kinds as a person would. */
const char* nameOf(OperationKind kind);

/** Whether operations of the kind are none that take memory. */
bool isOnFiles(OperationKind kind);

/** Stands for a kind: any that is on files. */
constexpr OperationKind anyOnFiles = operationKinds;

/** A kind of operations, and the errno value with which they fail; 0 fails allocations, and does others in part. */
struct Failure {
    OperationKind kind;
    int error;
};

/** Which operations fail, counted from 1 since the fault was armed, and how. */
struct Fault {
    OperationKind kind = operationAllocate;
    int number = 1;
    bool lasting = false;  ///< all of the kind from that one on, instead of that one alone
    int error = 0;         ///< as in Failure

    /** What happens at that operation instead of a failure. */
    std::function<void()> instead{};

    /** What also fails, each time, once the fault has happened. */
    std::optional<Failure> then{};
};

std::ostream& operator<<(std::ostream& stream, const Fault& fault);

/** How often each kind of operation came. */
using Counts = std::map<OperationKind, int>;

/** The counts of those kinds that are on files; kinds that did not come are left out. */
Counts onFiles(const Counts& counts);

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

/** The ways in which each kind on files is let fail, and in which each that takes memory is. */
const std::vector<Failure>& fileFailures();
const std::vector<Failure>& memoryFailures();
std::vector<Failure> allFailures();

/** Which of the possible faults are gone through. */
struct Extent {
    bool lasting = true;                               ///< each failure also with all of its kind after it
    int operations = std::numeric_limits<int>::max();  ///< of each kind at most so many, evenly spread
    bool isKept = false;                               ///< also where time allows for a few only
};

/**
 * Goes through the faults of a request that comes with these counts: every failure of each operation. Ends when a test
 * has failed. A call that is interrupted may be made again and again, so that none is interrupted lastingly.
 */
void eachFault(const Counts& counts, const std::vector<Failure>& failures,
               const std::function<void(const Fault&)>& body, const Extent& extent = {});

/** Goes through the operations on files as the moments at which something else may happen; the faults have no error. */
void eachMoment(const Counts& counts, const std::function<void(const Fault&)>& body);

/** How many files this process has open. */
int openDescriptors();

}  // namespace faults

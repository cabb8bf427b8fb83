#pragma once

#include <functional>
#include <iosfwd>
#include <limits>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "Operations.h"

// Fault injection: makes system calls and allocations fail on the test's thread. Functions of the emulated object
// manager never fail and are not counted.

namespace faults {

/** Returns a readable name of a kind. */
const char* nameOf(OperationKind kind);

/** Returns whether operations of the kind use files, rather than allocate memory. */
bool isOnFiles(OperationKind kind);

/** Any kind that uses files. */
constexpr OperationKind anyOnFiles = operationKinds;

/**
 * A kind of operation and the errno value of its failure. 0 makes an allocation fail and other operations succeed
 * partially.
 */
struct InjectedFailure {
    OperationKind kind;
    int error;
};

/** The operations that fail, counted from 1 since the injection began, and their failure. */
struct Fault {
    OperationKind kind = operationAllocate;
    int number = 1;
    bool lasting = false;  ///< all later operations of the kind fail, too
    int error = 0;         ///< see InjectedFailure

    /** Called at that operation instead of a failure. */
    std::function<void()> instead{};

    /** A further failure of every operation of its kind after the first failure. */
    std::optional<InjectedFailure> then{};
};

std::ostream& operator<<(std::ostream& stream, const Fault& fault);

/** Number of operations per kind. */
using Counts = std::map<OperationKind, int>;

/** Returns the nonzero counts of the kinds that use files. */
Counts onFiles(const Counts& counts);

/**
 * Injects faults and counts operations on this thread while it exists. Only one instance may exist. Does not allocate.
 */
class FaultInjection {
public:
    explicit FaultInjection(const Fault& fault);
    FaultInjection();  ///< only counts operations
    ~FaultInjection();
    FaultInjection(const FaultInjection&) = delete;
    FaultInjection& operator=(const FaultInjection&) = delete;

    /** Returns the number of operations per kind so far. */
    Counts counts() const;

private:
    void begin();
};

/** Return the tested failures of the kinds that use files, or that allocate memory. */
const std::vector<InjectedFailure>& fileFailures();
const std::vector<InjectedFailure>& memoryFailures();
std::vector<InjectedFailure> allFailures();

/** Selects faults. */
struct FaultSelection {
    bool lasting = true;  ///< includes faults after which all later operations of the kind fail
    int operations = std::numeric_limits<int>::max();  ///< maximum number of operations per kind, evenly spaced
    bool withSanitizers = false;                       ///< with sanitizers, tests as many operations as without
};

/**
 * Calls `body` with each fault of a request with these counts: every failure of each operation. Stops when the test
 * fails. Omits lasting interruptions (EINTR), since interrupted calls may be retried forever.
 */
void eachFault(const Counts& counts, const std::vector<InjectedFailure>& failures,
               const std::function<void(const Fault&)>& body, const FaultSelection& selection = {});

/** Calls `body` with a fault for each operation on files, as the time of another event. The faults have no error. */
void eachMoment(const Counts& counts, const std::function<void(const Fault&)>& body);

/** Returns the number of open file descriptors of this process. */
int openDescriptors();

}  // namespace faults

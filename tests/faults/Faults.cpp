#include "Faults.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <iterator>
#include <new>
#include <ostream>
#include <system_error>
#include <utility>

#include "support/Recording.h"

namespace faults {

namespace {

constexpr std::array<const char*, operationKinds + 1> operationNames{
    "allocation",   "malloc call",      "opening",        "reading",  "writing",
    "seeking",      "syncing",          "renaming",       "removing", "closing",
    "status query", "attribute change", "path resolving", "locking",  "operation on files",
};

/** The fault injection of this thread. Functions that use this state do not allocate memory. */
struct State {
    bool armed = false;
    const Fault* fault = nullptr;
    bool happened = false;
    std::array<int, operationKinds> counts{};
    int onFiles = 0;  ///< number of file operations
};

thread_local State state;

/** Runs an event that replaces a failure. Disables faults meanwhile. */
void runDisarmed(const std::function<void()>& event) {
    state.armed = false;
    event();
    state.armed = true;
}

OperationFailure failed(int error) {
    return {error, error == 0 ? 1 : 0};
}

/** Counts an operation of a kind. @return its number in the fault's count; 0 if the fault does not apply to the kind */
int numberForFault(OperationKind kind) {
    const int number = ++state.counts[kind];
    state.onFiles += isOnFiles(kind) ? 1 : 0;
    if (state.fault == nullptr) {
        return 0;
    }
    if (state.fault->kind == anyOnFiles) {
        return isOnFiles(kind) ? state.onFiles : 0;
    }
    return state.fault->kind == kind ? number : 0;
}

OperationFailure injectFault(OperationKind kind) {
    constexpr OperationFailure done{0, 0};
    if (!state.armed || testsupport::insideBroker != 0) {
        return done;
    }
    const int number = numberForFault(kind);
    const Fault* fault = state.fault;
    if (fault != nullptr && state.happened && fault->then && fault->then->kind == kind) {
        return failed(fault->then->error);
    }
    if (number == 0 || number < fault->number || (number > fault->number && !fault->lasting)) {
        return done;
    }
    state.happened = true;
    if (fault->instead) {
        runDisarmed(fault->instead);
        return done;
    }
    return failed(fault->error);
}

/** Allocates memory without counting the call of malloc. */
void* allocate(std::size_t size) {
    const bool wasArmed = std::exchange(state.armed, false);
    void* memory = std::malloc(size);
    state.armed = wasArmed;
    return memory;
}

/** Limits the number of operations with sanitizers, where libraries load slowly. */
int maximumOperations() {
#ifdef LAW_SANITIZE
    return 4;
#else
    return std::numeric_limits<int>::max();
#endif
}

void printError(std::ostream& stream, int error) {
    if (error != 0) {
        stream << ": " << std::generic_category().message(error);
    }
}

}  // namespace

const char* nameOf(OperationKind kind) {
    return operationNames.at(kind);
}

bool isOnFiles(OperationKind kind) {
    return kind != operationAllocate && kind != operationTakeMemory;
}

Counts onFiles(const Counts& counts) {
    Counts some;
    std::copy_if(counts.begin(), counts.end(), std::inserter(some, some.end()),
                 [](const auto& each) { return isOnFiles(each.first) && each.second != 0; });
    return some;
}

std::ostream& operator<<(std::ostream& stream, const Fault& fault) {
    stream << nameOf(fault.kind) << " number " << fault.number << (fault.lasting ? " and all after it" : "");
    printError(stream, fault.error);
    if (fault.then) {
        stream << ", then each " << nameOf(fault.then->kind);
        printError(stream, fault.then->error);
    }
    return stream;
}

void FaultInjection::begin() {
    state.counts = {};
    state.onFiles = 0;
    state.happened = false;
    setOperationHook(&injectFault);
    state.armed = true;
}

FaultInjection::FaultInjection(const Fault& fault) {
    state.fault = &fault;
    begin();
}

FaultInjection::FaultInjection() {
    state.fault = nullptr;
    begin();
}

FaultInjection::~FaultInjection() {
    state.armed = false;
    state.fault = nullptr;
}

Counts FaultInjection::counts() const {
    const bool wasArmed = std::exchange(state.armed, false);
    Counts counts;
    for (int kind = 0; kind < operationKinds; ++kind) {
        counts[static_cast<OperationKind>(kind)] = state.counts.at(static_cast<std::size_t>(kind));
    }
    state.armed = wasArmed;
    return counts;
}

const std::vector<InjectedFailure>& fileFailures() {
    static const std::vector<InjectedFailure> all{
        {operationOpen, EMFILE},   {operationOpen, EACCES},      {operationRead, EIO},       {operationRead, EINTR},
        {operationRead, 0},        {operationWrite, ENOSPC},     {operationWrite, EINTR},    {operationWrite, 0},
        {operationSync, EIO},      {operationRename, ENOSPC},    {operationRemove, EACCES},  {operationClose, EIO},
        {operationStatus, EACCES}, {operationAttributes, EPERM}, {operationResolve, EACCES}, {operationSeek, EIO},
        {operationLock, ENOLCK},
    };
    return all;
}

const std::vector<InjectedFailure>& memoryFailures() {
    static const std::vector<InjectedFailure> all{{operationAllocate, 0}, {operationTakeMemory, ENOMEM}};
    return all;
}

std::vector<InjectedFailure> allFailures() {
    std::vector<InjectedFailure> all = fileFailures();
    all.insert(all.end(), memoryFailures().begin(), memoryFailures().end());
    return all;
}

void eachFault(const Counts& counts, const std::vector<InjectedFailure>& failures,
               const std::function<void(const Fault&)>& body, const FaultSelection& selection) {
    const int most =
        selection.withSanitizers ? selection.operations : std::min(selection.operations, maximumOperations());
    for (const InjectedFailure& failure : failures) {
        const int count = counts.at(failure.kind);
        const int step = 1 + (count - 1) / most;
        for (const bool lasting : {false, true}) {
            const bool isLeftOut = lasting && (!selection.lasting || failure.error == EINTR);
            for (int number = 1; !isLeftOut && number <= count && !testing::Test::HasFailure(); number += step) {
                const Fault fault{failure.kind, number, lasting, failure.error};
                SCOPED_TRACE(testing::PrintToString(fault));
                body(fault);
            }
        }
    }
}

void eachMoment(const Counts& counts, const std::function<void(const Fault&)>& body) {
    std::vector<InjectedFailure> kinds;
    for (const auto& each : onFiles(counts)) {
        kinds.push_back({each.first, 0});
    }
    eachFault(counts, kinds, body, {false});
}

int openDescriptors() {
    const std::filesystem::directory_iterator entries("/proc/self/fd");
    return static_cast<int>(std::distance(begin(entries), end(entries)));
}

}  // namespace faults

// The libraries under test use these operators too.

void* operator new(std::size_t size) {
    const bool fails = faults::injectFault(operationAllocate).partly != 0;
    if (void* memory = fails ? nullptr : faults::allocate(size)) {
        return memory;
    }
    throw std::bad_alloc();
}

// Sanitizers replace this operator; the operators below could not free its memory.
void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    try {
        return operator new(size);
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}

void operator delete(void* memory) noexcept {
    std::free(memory);
}
void operator delete(void* memory, std::size_t) noexcept {
    std::free(memory);
}

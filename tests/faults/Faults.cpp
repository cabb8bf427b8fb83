#include "Faults.h"

#include <array>
#include <cerrno>
#include <cstdlib>
#include <new>
#include <ostream>
#include <system_error>

#include "support/Recording.h"

namespace faults {

namespace {

constexpr std::array<const char*, operationKinds> names{
    "allocation", "opening", "reading", "writing", "syncing",        "renaming",
    "removing",   "closing", "asking",  "owning",  "path resolving",
};

/** What this thread's faults are; nothing in here allocates. */
struct State {
    bool armed = false;
    const Fault* fault = nullptr;
    std::array<int, operationKinds> counts{};
};

thread_local State state;

/** Disarmed while what stands for a failure happens. */
void happen(const std::function<void()>& event) {
    state.armed = false;
    event();
    state.armed = true;
}

OperationVerdict judge(OperationKind kind) {
    constexpr OperationVerdict done{0, 0};
    if (!state.armed || testsupport::insideBroker != 0) {
        return done;
    }
    const int number = ++state.counts[kind];
    const Fault* fault = state.fault;
    if (fault == nullptr || fault->kind != kind || number < fault->number ||
        (number > fault->number && !fault->lasting)) {
        return done;
    }
    if (fault->instead) {
        happen(fault->instead);
        return done;
    }
    return {fault->error, fault->error == 0 ? 1 : 0};
}

}  // namespace

const char* nameOf(OperationKind kind) {
    return names.at(kind);
}

std::ostream& operator<<(std::ostream& stream, const Fault& fault) {
    stream << nameOf(fault.kind) << " number " << fault.number << (fault.lasting ? " and all after it" : "");
    if (fault.error != 0) {
        stream << ": " << std::generic_category().message(fault.error);
    }
    return stream;
}

void Armed::begin() {
    state.counts = {};
    setOperationJudge(&judge);
    state.armed = true;
}

Armed::Armed(const Fault& fault) {
    state.fault = &fault;
    begin();
}

Armed::Armed() {
    state.fault = nullptr;
    begin();
}

Armed::~Armed() {
    state.armed = false;
    state.fault = nullptr;
}

Counts Armed::counts() const {
    const bool wasArmed = std::exchange(state.armed, false);
    Counts counts;
    for (int kind = 0; kind < operationKinds; ++kind) {
        counts[static_cast<OperationKind>(kind)] = state.counts.at(static_cast<std::size_t>(kind));
    }
    state.armed = wasArmed;
    return counts;
}

const std::vector<FileFailure>& fileFailures() {
    static const std::vector<FileFailure> all{
        {operationOpen, EMFILE},   {operationOpen, EACCES},      {operationRead, EIO},       {operationRead, EINTR},
        {operationRead, 0},        {operationWrite, ENOSPC},     {operationWrite, EINTR},    {operationWrite, 0},
        {operationSync, EIO},      {operationRename, ENOSPC},    {operationRemove, EACCES},  {operationClose, EIO},
        {operationStatus, EACCES}, {operationAttributes, EPERM}, {operationResolve, EACCES},
    };
    return all;
}

}  // namespace faults

// The libraries under test allocate with these too.

void* operator new(std::size_t size) {
    const bool fails = faults::judge(operationAllocate).partly != 0;
    if (void* memory = fails ? nullptr : std::malloc(size)) {
        return memory;
    }
    throw std::bad_alloc();
}

// Sanitizers have one of their own, whose memory the operators below may not free.
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

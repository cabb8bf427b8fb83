#pragma once

#include <cmpift.h>

#include <map>
#include <mutex>
#include <optional>
#include <set>
#include <string>
#include <tuple>
#include <type_traits>
#include <utility>
#include <vector>

#include "broker/ErrorTranslation.h"
#include "support/Describe.h"
#include "support/RecordingBroker.h"

// The implementation of RecordingBroker: functions that record a call and then call the broker's function.

namespace testsupport {

/** Number of nested broker calls of this thread. Failures that a test injects apply only outside of them. */
inline thread_local int insideBroker = 0;

/** Marks this thread as inside a broker call, for its lifetime. */
class BrokerScope {
public:
    BrokerScope() { ++insideBroker; }
    ~BrokerScope() { --insideBroker; }
    BrokerScope(const BrokerScope&) = delete;
    BrokerScope& operator=(const BrokerScope&) = delete;
};

/** The result of a call instead of that of the real function. */
struct InjectedResult {
    CMPIrc rc = CMPI_RC_OK;
    std::optional<CMPIData> data{};  ///< of a function that returns data
};

/** The calls and failures of one RecordingBroker. */
class Recording {
public:
    /** Records a call. @return the injected result; none: call the real function */
    std::optional<InjectedResult> note(RecordedCall call, const void* object = nullptr);

    /** Removes the characters of a string. */
    void silence(const CMPIString* string);

    /** Fails a call of a function. @param number from the next call; none: all following calls */
    void fail(const std::string& function, std::optional<int> number, InjectedResult result);
    void returnData(const std::string& function, const std::string& name, InjectedResult result);
    void returnState(const std::string& function, CMPIValueState state);

    /** The data with the state of returnState(), if there is one for the function. */
    CMPIData withInjectedState(const std::string& function, CMPIData data) const;
    void cancelFailures();

    std::vector<RecordedCall> calls() const;
    void forget();

private:
    struct InjectedFailure {
        std::optional<int> number{};  ///< number of the call since the beginning
        InjectedResult result{};
    };

    mutable std::mutex mutex;
    std::vector<RecordedCall> made;
    std::map<std::string, int> counts;  ///< calls of each function since the beginning
    std::map<std::string, std::vector<InjectedFailure>> failures;
    std::map<std::pair<std::string, std::string>, InjectedResult> dataByName;  ///< by function and name in lower case
    std::map<std::string, CMPIValueState> states;                              ///< by function
    std::set<const void*> silent;                                              ///< strings without characters
};

/** The recording that a call on this object or broker belongs to; the youngest if it is null. */
Recording* recordingOf(const void* table);

/** Fills the tables with functions that record, then call those of the host. */
cimhost::FunctionTables recordingTables();

/** Throws std::invalid_argument for a name that is no recorded function's. */
void requireFunction(const std::string& function);

/** Names of all functions that are recorded, once the first tables were made. */
const std::set<std::string>& recordedFunctions();

/** The pointer to its function table identifies the type of a handle. */
template <class Handle>
const void* tableOf(const Handle* handle) {
    if constexpr (std::is_same_v<Handle, CMPIBroker>) {
        return handle == nullptr ? nullptr : handle->bft;
    } else {
        return handle == nullptr ? nullptr : handle->ft;
    }
}

/** The object of a call; null if the function has none. */
template <class First, class... Others>
const void* objectOfCall(First first, Others...) {
    if constexpr (hasTable<First>) {
        return first;
    } else {
        return nullptr;
    }
}

inline const void* objectOfCall() {
    return nullptr;
}

template <class First, class... Others>
const void* tableOfCall(First first, Others...) {
    if constexpr (hasTable<First>) {
        return tableOf(first);
    } else {
        return nullptr;
    }
}

inline const void* tableOfCall() {
    return nullptr;
}

/** As in brokers, the status of a failed call has a message. */
inline CMPIStatus injectedStatus(CMPIrc rc) {
    return cimhost::toCmpi({rc, rc == CMPI_RC_OK ? std::string{} : "ordered by the test"});
}

inline void setStatus(CMPIStatus* status, CMPIrc rc) {
    if (status != nullptr) {
        *status = injectedStatus(rc);
    }
}

template <class Other>
void setStatus(const Other&, CMPIrc) {}

/** The result of a function that fails or returns null. */
template <class Result>
Result emptyAnswer(const InjectedResult& result) {
    if constexpr (std::is_same_v<Result, CMPIStatus>) {
        return injectedStatus(result.rc);
    } else if constexpr (std::is_same_v<Result, CMPIData>) {
        CMPIData data{};
        data.state = result.rc == CMPI_RC_OK ? CMPI_nullValue : CMPI_badValue;
        return result.data.value_or(data);
    } else if constexpr (!std::is_void_v<Result>) {
        return Result{};
    }
}

/** The recording function of one slot of a table. */
template <auto slot>
struct Recorded;

template <class Table, class Result, class... Arguments, Result (*Table::*slot)(Arguments...)>
struct Recorded<slot> {
    static inline std::string name;
    static inline Result (*original)(Arguments...) = nullptr;

    static Result call(Arguments... arguments) {
        const BrokerScope scope;
        Recording* recording = recordingOf(tableOfCall(arguments...));
        if (recording == nullptr) {
            return original(arguments...);
        }
        const std::optional<InjectedResult> result =
            recording->note({name, describeAll(arguments...)}, objectOfCall(arguments...));
        if (result) {
            (setStatus(arguments, result->rc), ...);
            return emptyAnswer<Result>(*result);
        }
        if constexpr (std::is_same_v<Result, CMPIData>) {
            return recording->withInjectedState(name, original(arguments...));
        } else {
            return original(arguments...);
        }
    }
};

}  // namespace testsupport

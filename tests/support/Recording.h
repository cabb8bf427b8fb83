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

// How RecordingBroker stands between a provider and the broker's functions.

namespace testsupport {

/** How deep this thread is inside the broker: what a test lets fail for a provider must not fail for its broker. */
inline thread_local int insideBroker = 0;

/** A thread is inside the broker while this lives. */
class BrokerScope {
public:
    BrokerScope() { ++insideBroker; }
    ~BrokerScope() { --insideBroker; }
    BrokerScope(const BrokerScope&) = delete;
    BrokerScope& operator=(const BrokerScope&) = delete;
};

/** What happens to a call instead of the real function. */
struct Verdict {
    CMPIrc rc = CMPI_RC_OK;
    std::optional<CMPIData> data{};  ///< what a function that answers data answers; nothing otherwise
};

/** The calls and orders of one RecordingBroker. */
class Recording {
public:
    /** Writes a call down and says what happens to it; none for the real function. */
    std::optional<Verdict> note(RecordedCall call, const void* object = nullptr);

    /** Lets this string have no characters. */
    void silence(const CMPIString* string);

    /** An order for a call of a function: by its number from now, or for every one when the number is none. */
    void order(const std::string& function, std::optional<int> number, Verdict verdict);
    void orderData(const std::string& function, const std::string& name, Verdict verdict);
    void orderState(const std::string& function, CMPIValueState state);

    /** The data as the function returns them: with another state if one is ordered for it. */
    CMPIData withOrderedState(const std::string& function, CMPIData data) const;
    void obey();

    std::vector<RecordedCall> calls() const;
    void forget();

private:
    struct Order {
        std::optional<int> dueAt{};  ///< number of the call since the beginning
        Verdict verdict{};
    };

    mutable std::mutex mutex;
    std::vector<RecordedCall> made;
    std::map<std::string, int> counts;  ///< calls of each function since the beginning
    std::map<std::string, std::vector<Order>> orders;
    std::map<std::pair<std::string, std::string>, Verdict> dataOrders;  ///< by function and name in lower case
    std::map<std::string, CMPIValueState> states;                       ///< ordered, by function
    std::set<const void*> silent;                                       ///< strings without characters
};

/** The recording that a call on this object or broker belongs to; the youngest if it is null. */
Recording* recordingOf(const void* table);

/** Fills the tables with functions that record, then call those of the host. */
cimhost::FunctionTables recordingTables();

/** Throws std::invalid_argument for a name that is no recorded function's. */
void requireFunction(const std::string& function);

/** Names of all functions that are recorded, once the first tables were made. */
const std::set<std::string>& recordedFunctions();

/** Function tables are told apart by the pointer that every handle has to its table. */
template <class Handle>
const void* tableOf(const Handle* handle) {
    if constexpr (std::is_same_v<Handle, CMPIBroker>) {
        return handle == nullptr ? nullptr : handle->bft;
    } else {
        return handle == nullptr ? nullptr : handle->ft;
    }
}

/** The object that a function is called on; null where there is none. */
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

/** As brokers do, a call that fails tells why in words. */
inline CMPIStatus orderedStatus(CMPIrc rc) {
    return cimhost::toCmpi({rc, rc == CMPI_RC_OK ? std::string{} : "ordered by the test"});
}

inline void setStatus(CMPIStatus* status, CMPIrc rc) {
    if (status != nullptr) {
        *status = orderedStatus(rc);
    }
}

template <class Other>
void setStatus(const Other&, CMPIrc) {}

/** The answer of a function that does nothing. */
template <class Result>
Result emptyAnswer(const Verdict& verdict) {
    if constexpr (std::is_same_v<Result, CMPIStatus>) {
        return orderedStatus(verdict.rc);
    } else if constexpr (std::is_same_v<Result, CMPIData>) {
        CMPIData data{};
        data.state = verdict.rc == CMPI_RC_OK ? CMPI_nullValue : CMPI_badValue;
        return verdict.data.value_or(data);
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
        const std::optional<Verdict> verdict =
            recording->note({name, describeAll(arguments...)}, objectOfCall(arguments...));
        if (verdict) {
            (setStatus(arguments, verdict->rc), ...);
            return emptyAnswer<Result>(*verdict);
        }
        if constexpr (std::is_same_v<Result, CMPIData>) {
            return recording->withOrderedState(name, original(arguments...));
        } else {
            return original(arguments...);
        }
    }
};

}  // namespace testsupport

#pragma once

#include <cmpift.h>

#include <cstdint>
#include <type_traits>
#include <vector>

/** Function pointers that record their calls, for use in function tables. */
namespace recorder {

/** Arguments or a result as integers: integers unchanged, pointers as their address. */
using Words = std::vector<std::uintptr_t>;

inline void append(Words& words, const CMPIStatus& status) {
    words.push_back(static_cast<std::uintptr_t>(status.rc));
    words.push_back(reinterpret_cast<std::uintptr_t>(status.msg));
}

inline void append(Words& words, const CMPIData& data) {
    words.push_back(data.type);
    words.push_back(data.state);
    words.push_back(data.value.uint64);
}

template <class Scalar>
void append(Words& words, Scalar scalar) {
    if constexpr (std::is_pointer_v<Scalar>) {
        words.push_back(reinterpret_cast<std::uintptr_t>(scalar));
    } else {
        words.push_back(static_cast<std::uintptr_t>(scalar));
    }
}

template <class... Values>
Words words(const Values&... values) {
    Words result;
    (append(result, std::decay_t<Values>(values)), ...);
    return result;
}

/** Result of a recording function: a nonzero value of the result's type. */
template <class Result>
Result answer() {
    if constexpr (std::is_same_v<Result, CMPIStatus>) {
        return {CMPI_RC_ERR_TYPE_MISMATCH, nullptr};
    } else if constexpr (std::is_same_v<Result, CMPIData>) {
        CMPIData data{};
        data.type = CMPI_uint64;
        data.value.uint64 = 4711;
        return data;
    } else if constexpr (std::is_pointer_v<Result>) {
        return reinterpret_cast<Result>(std::uintptr_t{4711});
    } else {
        return static_cast<Result>(47);
    }
}

/** The arguments of every call of a recording function since the list was cleared. */
inline std::vector<Words> calls;

template <class Result, class... Arguments>
Result record(Arguments... arguments) {
    calls.push_back(words(arguments...));
    return answer<Result>();
}

/**
 * Runs a call while one slot of a table records.
 * @return the slot's arguments; empty unless the slot was called once and the call returned its result
 */
template <class Result, class... Arguments, class Call>
Words callsOf(Result (*&slot)(Arguments...), const Call& call) {
    calls.clear();
    slot = record<Result, Arguments...>;
    const Words result = words(call());
    slot = nullptr;
    return calls.size() == 1 && result == words(answer<Result>()) ? calls.front() : Words{};
}

}  // namespace recorder

/** Expects that a macro calls one slot of a table once with these arguments and returns its result. */
#define EXPECT_CALL_OF(slot, call, ...) \
    EXPECT_EQ(recorder::callsOf(slot, [&] { return call; }), recorder::words(__VA_ARGS__)) << #call

#pragma once

#include <cmpift.h>

#include <memory>
#include <utility>

// Broker objects in which tests replace single functions, for example with functions that throw exceptions.

namespace contract {

/** A copy of an object with a separate function table. Functions that are not replaced call the original. */
template <class Handle>
class Altered {
public:
    using Table = std::remove_pointer_t<decltype(Handle::ft)>;

    explicit Altered(const Handle* original) : table(*original->ft), object(*original) { object.ft = &table; }
    Altered(const Altered&) = delete;
    Altered& operator=(const Altered&) = delete;

    Handle* handle() { return &object; }

    Table table;

private:
    Handle object;
};

/** A copy of a broker with a separate table of functions that create objects. */
class AlteredBroker {
public:
    explicit AlteredBroker(const CMPIBroker* original) : factories(*original->eft), broker(*original) {
        broker.eft = &factories;
    }
    AlteredBroker(const AlteredBroker&) = delete;
    AlteredBroker& operator=(const AlteredBroker&) = delete;

    const CMPIBroker* handle() const { return &broker; }

    CMPIBrokerEncFT factories;

private:
    CMPIBroker broker;
};

/**
 * Throwing functions with the signature of a table's function. error() throws a Thrown that is constructed from a
 * string, number() an int.
 */
template <class Function>
struct Throwing;

template <class Result, class... Arguments>
struct Throwing<Result (*)(Arguments...)> {
    template <class Thrown>
    static Result error(Arguments...) {
        throw Thrown("the broker throws");
    }
    static Result number(Arguments...) { throw 42; }
};

/** Replaces a slot of a table with a function that throws a standard exception. */
template <class Thrown, class Function>
void throwFrom(Function& slot) {
    slot = &Throwing<Function>::template error<Thrown>;
}

/** Replaces a slot of a table with a function that throws the number 42. */
template <class Function>
void throwNumberFrom(Function& slot) {
    slot = &Throwing<Function>::number;
}

}  // namespace contract

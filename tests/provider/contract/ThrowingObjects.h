#pragma once

#include <cmpift.h>

#include <memory>
#include <utility>

// Objects of a broker of which single functions are replaced, by ones that throw for instance.

namespace contract {

/** A copy of an object with a function table of its own. What is not replaced works as before. */
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

/** The same for a broker and its functions that make objects. */
class AlteredBroker {
public:
    explicit AlteredBroker(const CMPIBroker* original) : makers(*original->eft), broker(*original) {
        broker.eft = &makers;
    }
    AlteredBroker(const AlteredBroker&) = delete;
    AlteredBroker& operator=(const AlteredBroker&) = delete;

    const CMPIBroker* handle() const { return &broker; }

    CMPIBrokerEncFT makers;

private:
    CMPIBroker broker;
};

/** A function of any table that throws. Thrown must be made from the text, or be an int. */
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

/** Lets a slot of a table throw a standard exception. */
template <class Thrown, class Function>
void throwFrom(Function& slot) {
    slot = &Throwing<Function>::template error<Thrown>;
}

/** Lets a slot of a table throw the number 42. */
template <class Function>
void throwNumberFrom(Function& slot) {
    slot = &Throwing<Function>::number;
}

}  // namespace contract

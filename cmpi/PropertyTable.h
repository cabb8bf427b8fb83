#pragma once

#include <string>
#include <type_traits>

#include "KO/ProviderUtilities.h"

namespace KO::LeaseWarrantyProvider {

/** An instance that is being filled from an element. All string properties are read into the same string. */
struct InstanceBuilder {
    const CMPIBroker* broker;
    CMPIInstance* instance;
    std::string text{};
};

/**
 * A property of a CIM class. Instances are filled in the order of a class's rows. Modifications are applied in the same
 * order, by the rows that have a modify function.
 */
template <class Element>
struct PropertyRow {
    const char* name;

    /** Sets the instance's property from the element. */
    void (*fill)(const Element& element, InstanceBuilder& builder, const char* name);

    /** Sets the element's value if the instance has the property. Null for a row that does not modify the element. */
    void (*modify)(Element& element, const CMPIInstance* instance, const char* name);
};

/** CIM type of a property: the type of the getter's value, or string or datetime. */
enum class ValueForm {
    typed,     ///< string, number or flag
    text,      ///< string that is not a datetime
    dateTime,  ///< datetime, read and written as a CIM datetime string
};

/**
 * When to set a property. `always` sets it even if the getter returns false. The property then has the value of the
 * string property before it.
 */
enum class Presence {
    ifAvailable,
    always,
};

namespace PropertyTableDetail {

/** Class and value type of a getter. */
template <class Getter>
struct GetterTraits;

template <class DeclaringClass, class FilledValue>
struct GetterTraits<bool (DeclaringClass::*)(FilledValue&) const> {
    using Class = DeclaringClass;
    using Value = FilledValue;

    static bool get(const Class& element, bool (Class::*getter)(Value&) const, Value& value) {
        return (element.*getter)(value);
    }
};

template <class DeclaringClass, class ReturnedValue>
struct GetterTraits<ReturnedValue (DeclaringClass::*)() const> {
    using Class = DeclaringClass;
    using Value = ReturnedValue;

    static bool get(const Class& element, Value (Class::*getter)() const, Value& value) {
        value = (element.*getter)();
        return true;
    }
};

template <auto getter>
using Traits = GetterTraits<decltype(getter)>;

template <ValueForm form, class Value>
void set(const InstanceBuilder& builder, const char* name, Value& value) {
    if constexpr (form == ValueForm::typed) {
        ProviderUtilities::setProperty(builder.instance, name, value);
    } else {
        ProviderUtilities::setProperty(builder.broker, builder.instance, name, value, form == ValueForm::dateTime);
    }
}

template <class Element, auto getter, ValueForm form, Presence presence>
void fill(const Element& element, InstanceBuilder& builder, const char* name) {
    using Value = typename Traits<getter>::Value;
    const auto fillFrom = [&](Value& value) {
        if (Traits<getter>::get(element, getter, value) || presence == Presence::always) {
            set<form>(builder, name, value);
        }
    };
    if constexpr (std::is_same_v<Value, std::string>) {
        fillFrom(builder.text);
    } else {
        Value value{};
        fillFrom(value);
    }
}

template <class Element, auto getter, auto setter>
void modify(Element& element, const CMPIInstance* instance, const char* name) {
    using Value = typename Traits<getter>::Value;
    Value value{};
    bool present = false;
    if constexpr (std::is_same_v<Value, std::string>) {
        present = ProviderUtilities::getProperty(instance, name, value, false);
    } else {
        present = ProviderUtilities::getProperty(instance, name, value);
    }
    if (present) {
        (element.*setter)(value);
    }
}

}  // namespace PropertyTableDetail

/** Returns the row of a property that is only filled: it is read-only, or the class modifies it separately. */
template <class Element, auto getter, ValueForm form = ValueForm::typed, Presence presence = Presence::ifAvailable>
constexpr PropertyRow<Element> readOnly(const char* name) {
    return {name, &PropertyTableDetail::fill<Element, getter, form, presence>, nullptr};
}

/** Returns the row of a property that clients can modify. */
template <class Element, auto getter, auto setter, ValueForm form = ValueForm::typed>
constexpr PropertyRow<Element> modifiable(const char* name) {
    return {name, &PropertyTableDetail::fill<Element, getter, form, Presence::ifAvailable>,
            &PropertyTableDetail::modify<Element, getter, setter>};
}

/** Fills an instance from an element, row by row. */
template <class Rows, class Element>
void fillInstance(const Rows& rows, const Element& element, const CMPIBroker* broker, CMPIInstance* instance) {
    InstanceBuilder builder{broker, instance};
    for (const auto& row : rows) {
        row.fill(element, builder, row.name);
    }
}

}  // namespace KO::LeaseWarrantyProvider

#pragma once

#include "KO/ProviderUtilities.h"

#include <string>
#include <type_traits>

namespace KO::LeaseWarrantyProvider {

/** An instance being filled from an element. The text serves one string property after the other. */
struct InstanceBuilder {
    const CMPIBroker* broker;
    CMPIInstance* instance;
    std::string text{};
};

/**
 * One property of a CIM class. The rows of a class stand in the order in which its instances are
 * filled; they drive builder and, where it keeps that order, modification.
 */
template <class Element>
struct PropertyRow {
    const char* name;

    /** Sets the property from the element. */
    void (*fill)(const Element& element, InstanceBuilder& builder, const char* name);

    /** Changes the element from the instance, if the instance has the property. Null: not by this row. */
    void (*modify)(Element& element, const CMPIInstance* instance, const char* name);
};

/** How a property's value is set: by the type of the getter's value, or from text that says which it is. */
enum class ValueForm {
    typed,     ///< string, number or flag
    text,      ///< string, set as text that is no datetime
    dateTime,  ///< datetime, given and taken as CIM datetime text
};

/** Whether a property is set when the getter answers that there is no value: with what the text held before. */
enum class Presence {
    ifAvailable,
    always,
};

namespace PropertyTableDetail {

/** What a getter tells: the class that declares it and the type of its value. */
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

/** The row of a property that is only filled: a read-only one, or one whose changes the class takes in another way. */
template <class Element, auto getter, ValueForm form = ValueForm::typed, Presence presence = Presence::ifAvailable>
constexpr PropertyRow<Element> readOnly(const char* name) {
    return {name, &PropertyTableDetail::fill<Element, getter, form, presence>, nullptr};
}

/** The row of a property that a client may change. */
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

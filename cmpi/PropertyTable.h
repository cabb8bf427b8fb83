#pragma once

#include "KO/ProviderUtilities.h"

#include <string>
#include <type_traits>

namespace KO::LeaseWarrantyProvider {

/**
 * One property of a CIM class. The rows of a class stand in the order in which its instances are
 * filled; they drive both filling and modification.
 */
template <class Element>
struct PropertyRow {
    const char* name;

    /** Sets the property from the element, if the element has it. */
    void (*fill)(const Element& element, const CMPIBroker* broker, CMPIInstance* instance, const char* name);

    /** Changes the element from the instance, if the instance has the property. Null: read-only. */
    void (*modify)(Element& element, const CMPIInstance* instance, const char* name);
};

namespace PropertyTableDetail {

/** The class that declares a getter, and the type of value that the getter fills. */
template <class Getter>
struct GetterTraits;

template <class DeclaringClass, class FilledValue>
struct GetterTraits<bool (DeclaringClass::*)(FilledValue&) const> {
    using Class = DeclaringClass;
    using Value = FilledValue;
};

template <auto getter>
using ClassOf = typename GetterTraits<decltype(getter)>::Class;

template <auto getter>
using ValueOf = typename GetterTraits<decltype(getter)>::Value;

template <class Element, auto getter, bool asDateTime>
void fill(const Element& element, const CMPIBroker* broker, CMPIInstance* instance, const char* name) {
    const ClassOf<getter>& declaring = element;
    ValueOf<getter> value{};
    if (!(declaring.*getter)(value)) {
        return;
    }
    if constexpr (asDateTime) {
        ProviderUtilities::setProperty(broker, instance, name, value, true);
    } else {
        ProviderUtilities::setProperty(instance, name, value);
    }
}

inline bool read(const CMPIInstance* instance, const char* name, std::string& value) {
    return ProviderUtilities::getProperty(instance, name, value, false);
}

template <class Value>
bool read(const CMPIInstance* instance, const char* name, Value& value) {
    return ProviderUtilities::getProperty(instance, name, value);
}

template <class Element, auto getter, auto setter>
void modify(Element& element, const CMPIInstance* instance, const char* name) {
    ValueOf<getter> value{};
    if (read(instance, name, value)) {
        (element.*setter)(value);
    }
}

template <class Element, auto getter, auto setter, bool asDateTime>
constexpr PropertyRow<Element> row(const char* name) {
    if constexpr (std::is_null_pointer_v<decltype(setter)>) {
        return {name, &fill<Element, getter, asDateTime>, nullptr};
    } else {
        return {name, &fill<Element, getter, asDateTime>, &modify<Element, getter, setter>};
    }
}

}  // namespace PropertyTableDetail

/** The row of a property whose CIM type is that of the getter's value; read-only without a setter. */
template <class Element, auto getter, auto setter = nullptr>
constexpr PropertyRow<Element> property(const char* name) {
    return PropertyTableDetail::row<Element, getter, setter, false>(name);
}

/** The row of a datetime property, whose getter and setter give and take CIM datetime text. */
template <class Element, auto getter, auto setter = nullptr>
constexpr PropertyRow<Element> dateTimeProperty(const char* name) {
    return PropertyTableDetail::row<Element, getter, setter, true>(name);
}

}  // namespace KO::LeaseWarrantyProvider

#include "broker/Convert.h"

#include <tuple>

#include "broker/ErrorTranslation.h"

namespace cimhost {
namespace {

/** A type whose values are not pointers, with its alternative of Scalar and its member of CMPIValue. */
template <class Alternative, class Member>
struct PlainType {
    CMPIType type;
    Member CMPIValue::*member;

    void read(const CMPIValue& value, Scalar& scalar) const {
        scalar.emplace<Alternative>(static_cast<Alternative>(value.*member));
    }
    static bool holds(const Scalar& scalar) { return std::holds_alternative<Alternative>(scalar); }
    void writeFrom(const Scalar& scalar, CMPIValue& value) const {
        value.*member = static_cast<Member>(std::get<Alternative>(scalar));
    }
};

template <class Alternative, class Member>
constexpr PlainType<Alternative, Member> plain(CMPIType type, Member CMPIValue::*member) {
    return {type, member};
}

constexpr auto plainTypes = std::make_tuple(
    plain<bool>(CMPI_boolean, &CMPIValue::boolean), plain<Char16>(CMPI_char16, &CMPIValue::char16),
    plain<std::uint8_t>(CMPI_uint8, &CMPIValue::uint8), plain<std::uint16_t>(CMPI_uint16, &CMPIValue::uint16),
    plain<std::uint32_t>(CMPI_uint32, &CMPIValue::uint32), plain<std::uint64_t>(CMPI_uint64, &CMPIValue::uint64),
    plain<std::int8_t>(CMPI_sint8, &CMPIValue::sint8), plain<std::int16_t>(CMPI_sint16, &CMPIValue::sint16),
    plain<std::int32_t>(CMPI_sint32, &CMPIValue::sint32), plain<std::int64_t>(CMPI_sint64, &CMPIValue::sint64),
    plain<float>(CMPI_real32, &CMPIValue::real32), plain<double>(CMPI_real64, &CMPIValue::real64));

/** Calls the action with each plain type until the action returns true. @return whether it returned true */
template <class Action>
bool anyPlainType(Action action) {
    return std::apply([&](const auto&... each) { return (action(each) || ...); }, plainTypes);
}

Scalar readPlain(const CMPIValue& value, CMPIType type) {
    Scalar scalar;
    const bool found = anyPlainType([&](const auto& each) {
        if (each.type == type) {
            each.read(value, scalar);
        }
        return each.type == type;
    });
    if (!found) {
        throw Failure(CMPI_RC_ERR_INVALID_DATA_TYPE);
    }
    return scalar;
}

Scalar readEncapsulated(const CMPIValue& value, CMPIType type) {
    switch (type) {
        case CMPI_string:
            return argument(value.string);
        case CMPI_dateTime:
            return argument(value.dateTime);
        case CMPI_ref:
            return std::make_shared<const ObjectPath>(argument(value.ref));
        case CMPI_instance:
            return std::shared_ptr<const Instance>(argument(value.inst).value.share());
        default:
            throw Failure(CMPI_RC_ERR_INVALID_DATA_TYPE);
    }
}

/** Whether values of this type are pointers. */
bool isEncapsulated(CMPIType type) {
    return (type & CMPI_ENC) != 0;
}

/** Writes values of types that are not plain. */
struct EncapsulatedWriter {
    CMPIValue& value;
    Arena& arena;

    void operator()(const std::string& string) const { value.string = arena.make<CMPIString>(string); }
    void operator()(const DateTime& time) const { value.dateTime = arena.make<CMPIDateTime>(time); }
    void operator()(const std::shared_ptr<const ObjectPath>& path) const {
        value.ref = arena.make<CMPIObjectPath>(*path);
    }
    void operator()(const std::shared_ptr<const Instance>& instance) const {
        value.inst = arena.make<CMPIInstance>({*instance});
    }
    template <class Plain>
    void operator()(const Plain&) const {}
};

CMPIData nullData(CMPIType type) {
    CMPIData data{};
    data.type = type;
    data.state = CMPI_nullValue;
    return data;
}

/** A string object whose character pointer is null. */
CMPIData dataWithoutCharacters(bool isNull, Arena& arena) {
    CMPIData data = nullData(CMPI_string);
    data.state = isNull ? CMPI_nullValue : CMPI_goodValue;
    data.value.string = arena.make<CMPIString>({});
    objectOf(data.value.string)->lacksCharacters = true;
    return data;
}

/** Whether a value is a null pointer or a string object without characters. */
bool lacksObject(const CMPIValue& value, CMPIType type) {
    const auto* string = type == CMPI_string ? objectOf(value.string) : nullptr;
    return value.string == nullptr || (string != nullptr && string->lacksCharacters);
}

Value arrayFrom(const CMPIArray* array, CMPIType type) {
    if (array == nullptr) {
        return Value::null(type, true);
    }
    const ArrayContent& content = argument(array);
    if (content.type != type) {
        throw Failure(CMPI_RC_ERR_TYPE_MISMATCH);
    }
    return Value::array(type, content.elements);
}

Value singleFrom(const CMPIValue* value, CMPIType type) {
    Value converted{type, false, false, false, scalarFrom(value, type), {}};
    converted.isNull = std::holds_alternative<std::monostate>(converted.single);
    if (converted.isNull || type == CMPI_chars) {
        converted.type = elementType(type);  // For other values, scalarFrom() has checked the type.
    }
    return converted;
}

}  // namespace

CMPIType elementType(CMPIType type) {
    const auto element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    if (element == CMPI_chars) {
        return CMPI_string;
    }
    const bool isKnown = element == CMPI_string || element == CMPI_dateTime || element == CMPI_ref ||
                         element == CMPI_instance ||
                         anyPlainType([&](const auto& each) { return each.type == element; });
    if (!isKnown) {
        throw Failure(CMPI_RC_ERR_INVALID_DATA_TYPE);
    }
    return element;
}

Scalar scalarFrom(const CMPIValue* value, CMPIType type) {
    if (value == nullptr || type == CMPI_null) {
        return std::monostate{};
    }
    if (type == CMPI_chars) {
        return Scalar(std::in_place_type<std::string>, reinterpret_cast<const char*>(value));
    }
    if (isEncapsulated(type)) {
        return lacksObject(*value, type) ? Scalar{} : readEncapsulated(*value, type);
    }
    return readPlain(*value, type);
}

Value valueFrom(const CMPIValue* value, CMPIType type) {
    if (type == CMPI_null) {
        return {};
    }
    return (type & CMPI_ARRAY) != 0 ? arrayFrom(value == nullptr ? nullptr : value->array, elementType(type))
                                    : singleFrom(value, type);
}

CMPIData dataFrom(const Scalar& scalar, CMPIType type, Arena& arena) {
    CMPIData data = nullData(type);
    if (std::holds_alternative<std::monostate>(scalar)) {
        return data;
    }
    data.state = CMPI_goodValue;
    const bool isPlain = anyPlainType([&](const auto& each) {
        const bool holds = each.holds(scalar);
        if (holds) {
            each.writeFrom(scalar, data.value);
        }
        return holds;
    });
    if (!isPlain) {
        std::visit(EncapsulatedWriter{data.value, arena}, scalar);
    }
    return data;
}

CMPIData dataFrom(const Value& value, Arena& arena) {
    if (value.isArray) {
        CMPIData data = nullData(static_cast<CMPIType>(value.type | CMPI_ARRAY));
        if (!value.isNull) {
            data.state = CMPI_goodValue;
            const ScalarRange elements = value.elements();
            data.value.array = arena.make<CMPIArray>({value.type, {elements.begin(), elements.end()}});
        }
        return data;
    }
    if (value.lacksCharacters) {
        return dataWithoutCharacters(value.isNull, arena);
    }
    return value.isNull ? nullData(value.type) : dataFrom(value.single, value.type, arena);
}

PropertyList propertyListFrom(const char** names) {
    if (names == nullptr) {
        return std::nullopt;
    }
    std::vector<std::string> list;
    for (; *names != nullptr; ++names) {
        list.emplace_back(*names);
    }
    return list;
}

CPropertyList::CPropertyList(const PropertyList& list) {
    if (list) {
        for (const std::string& name : *list) {
            pointers.push_back(name.c_str());
        }
        pointers.push_back(nullptr);
    }
}

}  // namespace cimhost

#include "schema/Literal.h"

#include <cmath>
#include <limits>

#include "cim/DateTime.h"
#include "schema/Errors.h"
#include "schema/MofReader.h"
#include "schema/ObjectPathGrammar.h"
#include "schema/ObjectPathText.h"
#include "schema/StringLiteral.h"

namespace cimhost {
namespace {

namespace path = grammar::path;
namespace peg = tao::pegtl;

[[noreturn]] void refuse(const Literal& literal, CMPIType type, const std::string& remedy) {
    throw ValueError(literal.source + " is not a " + std::string(typeName(type)) + ": " + remedy);
}

template <typename Integer>
Scalar integerScalar(const Literal& literal, CMPIType type) {
    using Limits = std::numeric_limits<Integer>;
    const std::string range =
        "it must be an integer from " + std::to_string(Limits::min()) + " to " + std::to_string(Limits::max());
    const auto* integer = std::get_if<IntegerLiteral>(&literal.value);
    if (integer == nullptr || integer->tooLarge) {
        refuse(literal, type, range);
    }
    const std::uint64_t magnitude = integer->magnitude;
    const auto highest = static_cast<std::uint64_t>(Limits::max());
    const std::uint64_t lowest = Limits::is_signed ? highest + 1 : 0;  // magnitude of the lowest value
    if (magnitude > (integer->negative ? lowest : highest)) {
        refuse(literal, type, range);
    }
    return static_cast<Integer>(integer->negative ? 0 - magnitude : magnitude);
}

double realOf(const Literal& literal, CMPIType type) {
    if (const auto* real = std::get_if<double>(&literal.value)) {
        return *real;
    }
    const auto* integer = std::get_if<IntegerLiteral>(&literal.value);
    if (integer == nullptr || integer->tooLarge) {
        refuse(literal, type, "it must be a number such as 1.5");
    }
    const auto magnitude = static_cast<double>(integer->magnitude);
    return integer->negative ? -magnitude : magnitude;
}

template <typename Real>
Scalar realScalar(const Literal& literal, CMPIType type) {
    static_assert(std::numeric_limits<Real>::is_iec559);  // an overflow results in infinity
    const Real value = static_cast<Real>(realOf(literal, type));
    if (!std::isfinite(value)) {
        refuse(literal, type, "it is out of range");
    }
    return value;
}

/** The value of a literal of this kind. @throws ValueError with the remedy for other literals */
template <typename Kind>
const Kind& valueOf(const Literal& literal, CMPIType type, const std::string& remedy) {
    const Kind* value = std::get_if<Kind>(&literal.value);
    if (value == nullptr) {
        refuse(literal, type, remedy);
    }
    return *value;
}

Scalar booleanScalar(const Literal& literal, CMPIType type) {
    return valueOf<bool>(literal, type, "it must be true or false");
}

Scalar characterScalar(const Literal& literal, CMPIType type) {
    return valueOf<Char16>(literal, type, "it must be one character in apostrophes, such as 'a'");
}

Scalar stringScalar(const Literal& literal, CMPIType type) {
    return valueOf<std::string>(literal, type, "write it in quotation marks, \"" + literal.source + "\"");
}

Scalar dateTimeScalar(const Literal& literal, CMPIType type) {
    const std::string remedy =
        "it must be 25 characters, a time such as \"20260131120000.000000+060\" or an interval such as "
        "\"00000007000000.000000:000\"";
    const auto& string = valueOf<std::string>(literal, type, remedy);
    if (!cim::isDateTime(string) && !cim::isNoDate(string)) {
        refuse(literal, type, remedy);
    }
    return DateTime{string};
}

Scalar referenceFrom(const Literal& literal, const Property& property, const Schema& schema,
                     const std::string& defaultNameSpace) {
    const auto* uri = std::get_if<std::string>(&literal.value);
    if (uri == nullptr) {
        throw ValueError(literal.source + " is not a reference: write the path of a " + property.referenceClass +
                         " in quotation marks, such as \"" + property.referenceClass + ".Key=\\\"x\\\"\"");
    }
    auto path = std::make_shared<ObjectPath>(parseObjectPath(*uri, schema, defaultNameSpace));
    const bool known = schema.findClass(path->className) != nullptr && schema.findClass(property.referenceClass);
    if (known && !schema.isA(path->className, property.referenceClass)) {
        throw ValueError(property.name + " must refer to a " + property.referenceClass + ", not to a " +
                         path->className);
    }
    return std::shared_ptr<const ObjectPath>(std::move(path));
}

struct Converter {
    CMPIType type;
    Scalar (*convert)(const Literal&, CMPIType);
};

constexpr Converter converters[] = {
    {CMPI_boolean, booleanScalar},
    {CMPI_char16, characterScalar},
    {CMPI_string, stringScalar},
    {CMPI_dateTime, dateTimeScalar},
    {CMPI_uint8, integerScalar<std::uint8_t>},
    {CMPI_uint16, integerScalar<std::uint16_t>},
    {CMPI_uint32, integerScalar<std::uint32_t>},
    {CMPI_uint64, integerScalar<std::uint64_t>},
    {CMPI_sint8, integerScalar<std::int8_t>},
    {CMPI_sint16, integerScalar<std::int16_t>},
    {CMPI_sint32, integerScalar<std::int32_t>},
    {CMPI_sint64, integerScalar<std::int64_t>},
    {CMPI_real32, realScalar<float>},
    {CMPI_real64, realScalar<double>},
};

struct LiteralKind {
    CMPIType operator()(std::monostate) const { return CMPI_null; }
    CMPIType operator()(bool) const { return CMPI_boolean; }
    CMPIType operator()(const IntegerLiteral& integer) const { return integer.negative ? CMPI_sint64 : CMPI_uint64; }
    CMPIType operator()(double) const { return CMPI_real64; }
    CMPIType operator()(Char16) const { return CMPI_char16; }
    CMPIType operator()(const std::string&) const { return CMPI_string; }
};

/** The literal of a value without quotation marks. */
Literal plainLiteral(std::string_view source, const Property& property) {
    if (property.type == CMPI_char16) {
        if (const std::optional<std::uint16_t> code = singleCharacter(source)) {
            return {Char16{*code}, std::string(source)};
        }
    }
    return {std::string(source), std::string(source)};
}

bool isPlain(CMPIType type, std::string_view source) {
    return type == CMPI_string || type == CMPI_dateTime || type == CMPI_ref ||
           (type == CMPI_char16 && (source.empty() || source.front() != '\'' || source.size() == 1));
}

Literal readLiteral(std::string_view source) {
    peg::memory_input<> input(source.data(), source.size(), "");
    const auto root = peg::parse_tree::parse<path::LoneConstant, grammar::Node, path::Selected>(input);
    if (root == nullptr) {
        return {std::string(source), source.empty() ? "an empty string" : std::string(source)};
    }
    return grammar::readLiteral(*root->children.front());
}

Value parseValue(std::string_view source, const Property& property, const Schema& schema,
                 const std::string& defaultNameSpace) {
    if (property.isArray) {
        std::vector<Scalar> elements;
        for (const Literal& literal : readMofArray(source)) {
            elements.push_back(typedElement(literal, property, schema, defaultNameSpace));
        }
        return Value::array(property.type, std::move(elements));
    }
    const Literal literal = isPlain(property.type, source) ? plainLiteral(source, property) : readLiteral(source);
    const Scalar element = typedElement(literal, property, schema, defaultNameSpace);
    if (std::holds_alternative<std::monostate>(element)) {
        throw ValueError("null is not a " + std::string(typeName(property.type)));
    }
    return Value::of(property.type, element);
}

}  // namespace

Scalar typedScalar(const Literal& literal, CMPIType type) {
    if (std::holds_alternative<std::monostate>(literal.value)) {
        return std::monostate{};
    }
    for (const Converter& converter : converters) {
        if (converter.type == type) {
            return converter.convert(literal, type);
        }
    }
    refuse(literal, type, "a value of this type cannot be written as a constant");
}

Scalar typedElement(const Literal& literal, const Property& property, const Schema& schema,
                    const std::string& defaultNameSpace) {
    if (property.type == CMPI_ref && !std::holds_alternative<std::monostate>(literal.value)) {
        return referenceFrom(literal, property, schema, defaultNameSpace);
    }
    return typedScalar(literal, property.type);
}

CMPIType literalType(const Literal& literal) {
    return std::visit(LiteralKind{}, literal.value);
}

Value parsePropertyValue(std::string_view source, const Property& property, const Schema& schema,
                         const std::string& defaultNameSpace) {
    try {
        return parseValue(source, property, schema, defaultNameSpace);
    } catch (const ValueError& error) {
        throw ValueError(property.name + ": " + error.what());
    } catch (const PathError& error) {
        throw PathError(property.name + ": " + error.what());
    }
}

}  // namespace cimhost

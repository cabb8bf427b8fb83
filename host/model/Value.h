#pragma once

#include <cmpidt.h>

#include <cstddef>
#include <cstdint>
#include <iosfwd>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>
#include <variant>
#include <vector>

namespace cimhost {

struct ObjectPath;
struct Instance;

/** A CIM datetime: a point in time or an interval, in the standard's format of 25 characters. */
struct DateTime {
    std::string value;
};

/** One 16-bit character. */
struct Char16 {
    std::uint16_t code = 0;

    Char16() = default;
    explicit Char16(std::uint16_t itsCode) : code(itsCode) {}
    explicit operator std::uint16_t() const { return code; }
};

/** A single CIM value. std::monostate is the null value. References and embedded instances are shared and immutable. */
using Scalar = std::variant<std::monostate, bool, Char16, std::uint8_t, std::uint16_t, std::uint32_t, std::uint64_t,
                            std::int8_t, std::int16_t, std::int32_t, std::int64_t, float, double, std::string, DateTime,
                            std::shared_ptr<const ObjectPath>, std::shared_ptr<const Instance>>;

/** The CIM type of a Scalar's alternative, such as CMPI_uint32 for std::uint32_t; CMPI_null for std::monostate. */
CMPIType typeOf(const Scalar& scalar);

/** Name of a CIM type in MOF, without array brackets. Other types are "reference", "instance", "null" or "unknown". */
std::string_view typeName(CMPIType type);

/** The intrinsic type with this name in MOF, regardless of letter case; none if there is no such type. */
std::optional<CMPIType> intrinsicType(std::string_view name);

/** Whether the type is one of the eight integer types, or an array of one. */
inline bool isInteger(CMPIType type) {
    return (type & CMPI_INTEGER) != 0 && (type & CMPI_ENC) == 0;
}

/** Consecutive scalars of a value, which must outlive the range. */
struct ScalarRange {
    const Scalar* first = nullptr;
    std::size_t count = 0;

    const Scalar* begin() const { return first; }
    const Scalar* end() const { return first + count; }
    std::size_t size() const { return count; }
    bool empty() const { return count == 0; }
    const Scalar& front() const { return *first; }
    const Scalar& operator[](std::size_t index) const { return first[index]; }
};

/** The elements of an array. They are allocated separately, so that the values that are not arrays are small. */
class ArrayElements {
public:
    ArrayElements() = default;
    ArrayElements(std::vector<Scalar> initial) : elements(std::make_unique<std::vector<Scalar>>(std::move(initial))) {}
    ArrayElements(const ArrayElements& other) {
        if (other.elements != nullptr) {
            elements = std::make_unique<std::vector<Scalar>>(*other.elements);
        }
    }
    ArrayElements(ArrayElements&&) noexcept = default;
    ArrayElements& operator=(ArrayElements other) noexcept {
        elements = std::move(other.elements);
        return *this;
    }

    operator ScalarRange() const {
        return elements == nullptr ? ScalarRange{} : ScalarRange{elements->data(), elements->size()};
    }

private:
    std::unique_ptr<std::vector<Scalar>> elements{};  ///< null if there are no elements
};

/** A CIM value, which can be null, with its declared type. */
struct Value {
    CMPIType type = CMPI_null;     ///< element type, without CMPI_ARRAY
    bool isArray = false;          ///< whether it is an array of that type
    bool isNull = true;            ///< whether the value, or the array, is null
    bool lacksCharacters = false;  ///< whether it is a string object whose character pointer is null
    Scalar single{};               ///< the value, unless it is an array; std::monostate if null
    ArrayElements items{};         ///< the elements of an array; none if null

    /** The elements of an array, or the single value; none if null. */
    ScalarRange elements() const { return isArray ? items : ScalarRange{&single, isNull ? 0U : 1U}; }

    /** A single value of the scalar's type. */
    static Value of(Scalar scalar);
    template <std::size_t size>
    static Value of(const char (&characters)[size]) {
        return of(Scalar(std::string(characters)));
    }

    /** A single value of a declared type; null if the scalar is null. */
    static Value of(CMPIType type, Scalar scalar);
    static Value array(CMPIType type, std::vector<Scalar> items);

    static Value null(CMPIType type, bool isArray = false);

    /** @name Strings without characters
     * Some object managers pass string objects whose character pointer is null. The data of nullStringObject() also has
     * the state CMPI_nullValue.
     */
    ///@{
    static Value stringWithoutCharacters();
    static Value nullStringObject();
    ///@}
};

/**
 * The name of a key, a property or a parameter, with the letter case that its author used. Copies share its characters.
 * Most names are declared by classes. Such a name is stored once per process, and neither reference-counted nor freed.
 */
class Name {
public:
    Name() = default;
    Name(std::string itsName) : shared(std::make_shared<const std::string>(std::move(itsName))) {}
    Name(const char* itsName) : Name(std::string(itsName)) {}

    /** Returns a name that is stored until the process ends. Use it only for names that classes declare. */
    static Name declared(const std::string& name);

    const std::string& string() const {
        static const std::string empty;
        return shared == nullptr ? empty : *shared;
    }
    operator const std::string&() const { return string(); }
    operator std::string_view() const { return string(); }

    friend bool operator==(const Name& left, const Name& right) {
        return left.shared == right.shared || left.string() == right.string();
    }
    template <class Other>
    friend std::enable_if_t<std::is_convertible_v<const Other&, std::string_view>, bool> operator==(
        const Name& left, const Other& right) {
        return std::string_view(left) == std::string_view(right);
    }
    template <class Other>
    friend auto operator!=(const Name& left, const Other& right) -> decltype(!(left == right)) {
        return !(left == right);
    }
    friend std::ostream& operator<<(std::ostream& stream, const Name& name);

private:
    std::shared_ptr<const std::string> shared{};  ///< null: empty
};

/** A named value: a key, a property, a parameter or a context entry. */
struct NamedValue {
    NamedValue() = default;
    NamedValue(Name itsName, Value&& itsValue) : name(std::move(itsName)), value(std::move(itsValue)) {}
    NamedValue(Name itsName, const Value& itsValue) : name(std::move(itsName)), value(itsValue) {}

    Name name{};
    Value value{};
};

/** Identity of a CIM instance; without keys, identity of a class. */
struct ObjectPath {
    std::string host{};  ///< empty: the local host
    std::string nameSpace{};
    std::string className{};
    std::vector<NamedValue> keys{};
};

/** A CIM instance: its path, and its properties in the order in which they were set. */
struct Instance {
    ObjectPath path{};
    std::vector<NamedValue> properties{};
};

}  // namespace cimhost

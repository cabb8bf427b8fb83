#pragma once

#include <iosfwd>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

namespace cimhost {

/**
 * The name of a key, a property or a parameter, with the letter case that its author used. Most names are those that
 * classes declare: these are stored once in the process, so that a copy needs no memory.
 */
class Name {
public:
    Name() = default;
    Name(std::string itsName) : own(std::move(itsName)) {}
    Name(const char* itsName) : own(itsName) {}

    /** The same name as one that the process keeps. Only for names of classes, since it never frees them. */
    static Name declared(const std::string& name);

    const std::string& string() const { return kept != nullptr ? *kept : own; }
    operator const std::string&() const { return string(); }
    operator std::string_view() const { return string(); }

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
    std::string own{};
    const std::string* kept = nullptr;  ///< if not null, used instead
};

}  // namespace cimhost

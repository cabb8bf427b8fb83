#pragma once

#include <iosfwd>
#include <memory>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

namespace cimhost {

/**
 * The name of a key, a property or a parameter, with the letter case that its author used. Copies share its characters.
 * Most names are those that classes declare: these are stored once in the process, and never counted or freed.
 */
class Name {
public:
    Name() = default;
    Name(std::string itsName) : shared(std::make_shared<const std::string>(std::move(itsName))) {}
    Name(const char* itsName) : Name(std::string(itsName)) {}

    /** The same name as one that the process keeps. Only for names of classes, since it never frees them. */
    static Name declared(const std::string& name);

    const std::string& string() const {
        static const std::string empty;
        return shared == nullptr ? empty : *shared;
    }
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
    std::shared_ptr<const std::string> shared{};  ///< null: empty
};

}  // namespace cimhost

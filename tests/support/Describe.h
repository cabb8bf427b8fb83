#pragma once

#include <cmpift.h>

#include <optional>
#include <string>
#include <type_traits>
#include <vector>

// Describes the arguments of CMPI calls.

namespace testsupport {

/** Whether the type is a handle with a function table. */
template <class Type>
constexpr bool isHandle =
    std::is_same_v<Type, CMPIBroker> || std::is_same_v<Type, CMPIString> || std::is_same_v<Type, CMPIObjectPath> ||
    std::is_same_v<Type, CMPIInstance> || std::is_same_v<Type, CMPIDateTime> || std::is_same_v<Type, CMPIArray> ||
    std::is_same_v<Type, CMPIEnumeration> || std::is_same_v<Type, CMPIArgs> || std::is_same_v<Type, CMPIContext> ||
    std::is_same_v<Type, CMPIResult> || std::is_same_v<Type, CMPIError>;

template <class Type>
constexpr bool hasTable = std::is_pointer_v<Type>&& isHandle<std::remove_const_t<std::remove_pointer_t<Type>>>;

/** The value argument of a call whose type argument is not read yet. */
struct ValueArgument {
    const CMPIValue* value = nullptr;
    std::optional<std::size_t> position{};  ///< of its description
};

/** The descriptions of a call's arguments. Some types have none. */
class Description {
public:
    void add(const char* text);
    void add(const char** names);
    void add(const CMPIObjectPath* path);
    void add(const CMPIInstance* instance);
    void add(const CMPIString* string);
    void add(const CMPIValue* value);
    void add(CMPIType type);  ///< also describes a preceding value
    void add(CMPIBoolean flag) { strings.push_back(std::to_string(flag)); }
    void add(int number) { strings.push_back(std::to_string(number)); }
    void add(CMPICount number) { strings.push_back(std::to_string(number)); }
    void add(CMPIUint64 number) { strings.push_back(std::to_string(number)); }

    /** Other types: pointers for output, brokers, contexts and so on have no description. */
    template <class Other>
    void add(const Other& argument) {
        using Plain = std::remove_const_t<std::remove_pointer_t<Other>>;
        if constexpr (std::is_same_v<Plain, CMPIObjectPath> || std::is_same_v<Plain, CMPIInstance> ||
                      std::is_same_v<Plain, CMPIString>) {
            add(static_cast<const Plain*>(argument));
        } else if constexpr (std::is_enum_v<Other>) {
            add(static_cast<int>(argument));
        }
    }

    std::vector<std::string> strings;

private:
    ValueArgument pending;
};

/** Describes all arguments, without the object of the call. */
template <class First, class... Others>
std::vector<std::string> describeAll(const First& first, const Others&... others) {
    Description description;
    if constexpr (!hasTable<First>) {
        description.add(first);
    }
    (description.add(others), ...);
    return description.strings;
}

inline std::vector<std::string> describeAll() {
    return {};
}

}  // namespace testsupport

#pragma once

#include <string>
#include <utility>

#include "model/Value.h"

namespace agent_test {

/** Returns a plain value of a CIM type, such as plain(CMPI_uint32, std::uint32_t{7}). */
template <typename Element>
cimhost::Value plain(CMPIType type, Element element) {
    return cimhost::Value::of(type, cimhost::Scalar(std::move(element)));
}

inline cimhost::Value text(std::string value) {
    return plain(CMPI_string, std::move(value));
}

inline cimhost::Value reference(cimhost::ObjectPath path) {
    return plain(CMPI_ref, std::make_shared<const cimhost::ObjectPath>(std::move(path)));
}

inline cimhost::Value nullOf(CMPIType type) {
    return {type, false, true, {}};
}

/** Returns the string of a string value; otherwise a string that no test expects. */
inline std::string textIn(const cimhost::Value& value) {
    const std::string* found = std::get_if<std::string>(&value.single);
    return found != nullptr ? *found : "(no text)";
}

}  // namespace agent_test

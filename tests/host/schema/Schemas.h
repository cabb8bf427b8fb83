#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

#include "schema/Errors.h"
#include "schema/MofReader.h"
#include "schema/MofWriter.h"

namespace cimhost::test {

/** The schema of a MOF source. */
inline Schema schemaOf(const std::string& mof) {
    Schema schema;
    MofReader(schema).readSource(mof, "test.mof");
    return schema;
}

/** The message of the reader's error; empty if there is none. */
inline std::string refusalOf(const std::string& mof) {
    Schema schema;
    try {
        MofReader(schema).readSource(mof, "test.mof");
        return "";
    } catch (const LoadError& error) {
        return error.what();
    }
}

/** Type and content of a value, for comparison. */
inline std::string described(const Value& value) {
    return std::to_string(value.type) + (value.isArray ? "[] " : " ") + formatMof(value);
}

/** The single element of a value, as the C++ type of its CIM type. */
template <typename Element>
Element element(const Value& value) {
    return std::get<Element>(value.single);
}

}  // namespace cimhost::test

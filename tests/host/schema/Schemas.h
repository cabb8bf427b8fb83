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

/** A temporary directory, which the destructor removes. */
class TemporaryDirectory {
public:
    TemporaryDirectory() {
        std::string name = testing::TempDir() + "cimhost-XXXXXX";
        path = mkdtemp(name.data());
    }
    ~TemporaryDirectory() { std::filesystem::remove_all(path); }
    TemporaryDirectory(const TemporaryDirectory&) = delete;
    TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

    std::filesystem::path write(const std::string& name, const std::string& text) const {
        std::filesystem::create_directories((path / name).parent_path());
        std::ofstream(path / name) << text;
        return path / name;
    }

    std::filesystem::path path{};
};

}  // namespace cimhost::test

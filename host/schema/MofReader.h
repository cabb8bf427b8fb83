#pragma once

#include <filesystem>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "schema/Literal.h"
#include "schema/Schema.h"

namespace cimhost {

/**
 * Reads MOF: qualifier declarations, classes, instances, and files named by #pragma include, relative to the
 * including file. Each file is read once. Errors are reported as LoadError with file, line and column. After a syntax
 * error, nothing of the source is added to the schema; after other errors, the declarations before it are.
 */
class MofReader {
public:
    explicit MofReader(Schema& target) : schema(target) {}

    void readFile(const std::filesystem::path& file);

    /** @param sourceName instead of a file name in messages  @param directory of included files */
    void readSource(std::string_view source, const std::string& sourceName,
                    const std::filesystem::path& directory = {});

private:
    void readOnce(const std::filesystem::path& file);

    Schema& schema;  ///< not owned
    std::set<std::filesystem::path> filesRead;
};

/** Reads the values of an array in MOF's form, {1, 2} or {"a", "b"}. @throws ValueError for another source */
std::vector<Literal> readMofArray(std::string_view source);

}  // namespace cimhost

#pragma once

#include <filesystem>
#include <set>
#include <string>
#include <string_view>

#include "schema/Schema.h"

namespace cimhost {

/**
 * Reads MOF: qualifier declarations, classes, instances, and files named by #pragma include, relative to the
 * file that includes them. A file is read once, however often it is named. Any error is a LoadError with
 * file, line and column. A text with a syntax error adds nothing; after any other error, what stands before it is in
 * the schema.
 */
class MofReader {
public:
    explicit MofReader(Schema& target) : schema(target) {}

    void readFile(const std::filesystem::path& file);

    /** @param sourceName stands for the file in messages  @param directory where includes are looked for */
    void readText(std::string_view text, const std::string& sourceName, const std::filesystem::path& directory = {});

private:
    void readOnce(const std::filesystem::path& file);

    Schema& schema;  ///< not owned
    std::set<std::filesystem::path> filesRead;
};

}  // namespace cimhost

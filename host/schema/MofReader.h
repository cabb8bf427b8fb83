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
 * Reads MOF: qualifier declarations, classes, instances, and the files that #pragma include names relative to the
 * including file. Each file is read once. An error is a LoadError with file, line and column; if readFile() cannot read
 * its file, with the file only. If a source has a syntax error, none of its declarations is added to the schema; after
 * another error, the schema contains the declarations that precede it.
 */
class MofReader {
public:
    explicit MofReader(Schema& target) : schema(target) {}

    void readFile(const std::filesystem::path& file);

    /** @param sourceName replaces the file name in messages  @param directory base of included files */
    void readSource(std::string_view source, const std::string& sourceName,
                    const std::filesystem::path& directory = {});

private:
    void readOnce(const std::filesystem::path& file);

    Schema& schema;  ///< not owned
    std::set<std::filesystem::path> filesRead;
};

/** Reads the values of an array in MOF's form, {1, 2} or {"a", "b"}. @throws ValueError for another form */
std::vector<Literal> readMofArray(std::string_view source);

}  // namespace cimhost

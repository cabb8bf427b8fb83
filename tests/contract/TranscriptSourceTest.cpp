#include <algorithm>
#include <filesystem>
#include <map>
#include <regex>
#include <set>
#include <sstream>

#include "TranscriptFixture.h"
#include "support/Files.h"

// Checks that the line numbers of records belong to the sources that docs/log-records.md documents.

namespace contract {
namespace {

namespace fs = std::filesystem;

const fs::path root = fs::path(CONTRACT_GOLDEN) / "../../..";

/** A row of the table "Sources of line numbers". */
struct SourceRow {
    std::set<std::string> files;
    std::string source;               ///< path relative to the root; empty for the record's file
    std::set<std::string> functions;  ///< documented functions
    bool hasAllOthers;
};

std::vector<std::string> quotedIn(const std::string& cell) {
    static const std::regex quoted("`([^`]+)`");
    std::vector<std::string> found;
    for (std::sregex_iterator each(cell.begin(), cell.end(), quoted), end; each != end; ++each) {
        found.push_back((*each)[1]);
    }
    return found;
}

std::vector<std::string> linesOf(const fs::path& file) {
    std::istringstream content(testsupport::readFile(file));
    std::vector<std::string> lines;
    for (std::string line; std::getline(content, line);) {
        lines.push_back(line);
    }
    return lines;
}

std::vector<SourceRow> documentedRows() {
    static const std::regex row(R"(\| (`.+\.cpp`) \| (FILE|`.+\.h`) \| (.+) \|)");
    std::vector<SourceRow> rows;
    for (const std::string& line : linesOf(root / "docs/log-records.md")) {
        std::smatch cell;
        if (std::regex_match(line, cell, row)) {
            const auto files = quotedIn(cell[1]);
            const auto functions = quotedIn(cell[3]);
            rows.push_back({{files.begin(), files.end()},
                            cell[2] == "FILE" ? "" : quotedIn(cell[2]).at(0),
                            {functions.begin(), functions.end()},
                            cell[3].str().rfind("all", 0) == 0});
        }
    }
    return rows;
}

fs::path sourceNamed(const std::string& file) {
    for (const char* folder : {"cmpi", "elements", "provider", "store"}) {
        if (fs::exists(root / folder / file)) {
            return root / folder / file;
        }
    }
    ADD_FAILURE() << "no source " << file;
    return {};
}

/** Returns the documented sources for a function: more than one if the source depends on the type of a value. */
std::vector<fs::path> documentedSources(const std::vector<SourceRow>& rows, const LogRecord& record) {
    std::vector<fs::path> named;
    std::vector<fs::path> others;
    for (const SourceRow& row : rows) {
        if (row.files.count(record.file) == 1) {
            const fs::path source = row.source.empty() ? sourceNamed(record.file) : root / row.source;
            if (row.functions.count(record.function) == 1) {
                named.push_back(source);
            } else if (row.hasAllOthers) {
                others.push_back(source);
            }
        }
    }
    if (named.empty() && others.empty()) {
        return {sourceNamed(record.file)};
    }
    return named.empty() ? others : named;
}

/** Returns whether a line of a source sets the position of a record. */
bool reportsAt(const fs::path& source, int line) {
    static std::map<fs::path, std::vector<std::string>> known;
    static const std::regex place(R"(\b(at|here)\()");
    auto& lines = known[source];
    if (lines.empty()) {
        lines = linesOf(source);
    }
    const auto index = static_cast<std::size_t>(line - 1);
    return index < lines.size() && std::regex_search(lines[index], place);
}

TEST_F(TranscriptPropertyTest, EachLineNumberBelongsToATraceStatementInTheDocumentedSource) {
    const auto rows = documentedRows();
    ASSERT_GE(rows.size(), 9U);
    std::set<std::string> foundHeaders;
    forEachRecord([&](const LogRecord& record, const Line&) {
        if (record.file == markerFile) {
            return;
        }
        const auto sources = documentedSources(rows, record);
        const auto found = std::find_if(sources.begin(), sources.end(),
                                        [&](const fs::path& source) { return reportsAt(source, record.line); });
        ASSERT_NE(found, sources.end()) << record.function << " " << record.text;
        if (found->extension() == ".h") {
            foundHeaders.insert(found->filename());
        }
    });
    EXPECT_THAT(foundHeaders,
                testing::UnorderedElementsAre("ElementAdapterImpl.h", "ProductAdapterImpl.h", "RecordAdapterImpl.h",
                                              "RecordBaseImpl.h", "RecordElementImpl.h", "SettingAdapterImpl.h",
                                              "SettingElementImpl.h"));
}

}  // namespace
}  // namespace contract

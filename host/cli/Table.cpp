#include "cli/Table.h"

#include <algorithm>

namespace cimhost::text {

std::string aligned(const std::vector<Row>& rows, const std::string& indent) {
    std::vector<std::size_t> widths;
    for (const Row& row : rows) {
        widths.resize(std::max(widths.size(), row.size()));
        for (std::size_t i = 0; i < row.size(); ++i) {
            widths[i] = std::max(widths[i], row[i].size());
        }
    }
    std::string text;
    for (const Row& row : rows) {
        std::string line = indent;
        for (std::size_t i = 0; i < row.size(); ++i) {
            line += row[i];
            line += i + 1 < row.size() ? std::string(widths[i] - row[i].size() + 2, ' ') : "";
        }
        text += line + "\n";
    }
    return text;
}

}  // namespace cimhost::text

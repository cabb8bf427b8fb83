#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "KO/Utils.h"
#include "Target.h"
#include "cim/DateTime.h"
#include "framework/PropertyText.h"

// Property files: setting a value in any file changes only its line.

namespace {

using fuzz::require;
using fuzz::requireSame;
using KO::PropertyText;
using Lines = std::vector<std::string>;

Lines linesOf(std::string_view content) {
    Lines lines;
    while (!content.empty()) {
        const std::size_t end = std::min(content.find('\n'), content.size());
        lines.emplace_back(content.substr(0, end));
        content.remove_prefix(std::min(end + 1, content.size()));
    }
    return lines;
}

/** An input: key and value to set, each terminated by a null character, and the file. */
struct Input {
    std::string key;
    std::string value;
    std::string_view file;
};

Input split(std::string_view input) {
    const auto take = [&input] {
        const std::size_t end = std::min(input.find('\0'), input.size());
        std::string part(input.substr(0, end));
        input.remove_prefix(std::min(end + 1, input.size()));
        return part;
    };
    std::string key = take();
    std::string value = take();
    return {std::move(key), std::move(value), input};
}

void requireValue(const PropertyText& properties, const std::string& key, const std::string& value) {
    const auto found = properties.get(key);
    require(found.has_value(), "a key that was set exists");
    requireSame(*found, value, "value that was set");
}

/** The number of the only changed or added line. @throws Violation if other lines differ */
std::size_t changedLine(const Lines& before, const Lines& after) {
    std::size_t line = 0;
    while (line < before.size() && line < after.size() && before[line] == after[line]) {
        ++line;
    }
    for (std::size_t other = line + 1; other < after.size(); ++other) {
        require(other < before.size(), "at most one line is added");
        requireSame(after[other], before[other], "line that was not set");
    }
    require(after.size() >= before.size(), "no line is lost");
    return line;
}

void checkSetting(const Input& input, const std::string& key, const std::string& value) {
    PropertyText properties(input.file);
    const Lines before = linesOf(properties.text());
    const auto old = properties.get(key);
    properties.set(key, value);
    requireValue(properties, key, value);
    const std::string text = properties.text();
    const Lines after = linesOf(text);
    require(after.size() == before.size() + (old ? 0 : 1), "a new key adds a line");
    const std::size_t changed = changedLine(before, after);
    require(old || changed == before.size(), "a new key is at the end");

    PropertyText reread(text);
    requireSame(reread.text(), text, "file that is read and written unchanged");
    requireValue(reread, key, value);
    reread.set(key, value);
    requireSame(reread.text(), text, "file whose key is set to its value");
    if (old) {
        reread.set(key, *old);
        requireValue(PropertyText(reread.text()), key, *old);
    }
}

/** Requires that a string converts to a date and back unchanged, or to no date. */
void checkDate(const std::string& string) {
    const std::string date = KO::Utils::convertCIMDateTime(KO::Utils::convertStringToDateTime(string));
    require(date == string || date == cim::noDate, "a date converts back to its string");
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const Input input = split(fuzz::inputOf(data, size));
    std::string complete(input.file);
    complete += !complete.empty() && complete.back() != '\n' ? "\n" : "";
    requireSame(PropertyText(input.file).text(), complete, "file that is only read");
    checkSetting(input, input.key, input.value);
    checkSetting(input, "USER.AssetNumber", input.value);
    checkSetting(input, input.value, std::string(input.file));
    checkDate(input.value);
    return 0;
}

#include "Target.h"

#include "KO/Utils.h"
#include "framework/PropertyText.h"

#include <string>
#include <string_view>
#include <utility>
#include <vector>

// Property files: whatever the file holds and whatever is written, every other line stays as it is.

namespace {

using fuzz::require;
using fuzz::requireSame;
using KO::PropertyText;
using Lines = std::vector<std::string>;

Lines linesOf(std::string_view text) {
    Lines lines;
    while (!text.empty()) {
        const std::size_t end = std::min(text.find('\n'), text.size());
        lines.emplace_back(text.substr(0, end));
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return lines;
}

/** What the head of the input, up to the first bytes 0, says is to be set; the rest is the file. */
struct Input {
    std::string key;
    std::string value;
    std::string_view file;
};

Input split(std::string_view text) {
    const auto take = [&text] {
        const std::size_t end = std::min(text.find('\0'), text.size());
        std::string part(text.substr(0, end));
        text.remove_prefix(std::min(end + 1, text.size()));
        return part;
    };
    std::string key = take();
    std::string value = take();
    return {std::move(key), std::move(value), text};
}

void requireValue(const PropertyText& properties, const std::string& key, const std::string& value) {
    const auto found = properties.get(key);
    require(found.has_value(), "a key that was set is there");
    requireSame(*found, value, "value that was set");
}

/** The one line that is new: there is none besides, and the others are as they were. @return its number */
std::size_t changedLine(const Lines& before, const Lines& after) {
    std::size_t line = 0;
    while (line < before.size() && line < after.size() && before[line] == after[line]) {
        ++line;
    }
    for (std::size_t other = line + 1; other < after.size(); ++other) {
        require(other < before.size(), "one line is new at most");
        requireSame(after[other], before[other], "line that was not set");
    }
    require(after.size() >= before.size(), "no line is lost");
    return line;
}

void trySetting(const Input& input, const std::string& key, const std::string& value) {
    PropertyText properties(input.file);
    const Lines before = linesOf(properties.text());
    const auto old = properties.get(key);
    properties.set(key, value);
    requireValue(properties, key, value);
    const std::string text = properties.text();
    const Lines after = linesOf(text);
    require(after.size() == before.size() + (old ? 0 : 1), "a new key has a line of its own at the end");
    const std::size_t changed = changedLine(before, after);
    require(old || changed == before.size(), "a new key stands at the end");

    PropertyText again(text);
    requireSame(again.text(), text, "file that is read and written unchanged");
    requireValue(again, key, value);
    again.set(key, value);
    requireSame(again.text(), text, "file whose key is set to what it is");
    if (old) {
        again.set(key, *old);
        requireValue(PropertyText(again.text()), key, *old);
    }
}

/** A date comes back as the text that it was made from, or is none. */
void tryDate(const std::string& text) {
    const std::string date = KO::Utils::convertCIMDateTime(KO::Utils::convertStringToDateTime(text));
    require(date == text || date == "00000000000000.000000-000", "a date's text is the one it was made from");
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const Input input = split(fuzz::textOf(data, size));
    std::string whole(input.file);
    whole += !whole.empty() && whole.back() != '\n' ? "\n" : "";
    requireSame(PropertyText(input.file).text(), whole, "file that is only read");
    trySetting(input, input.key, input.value);
    trySetting(input, "USER.AssetNumber", input.value);
    trySetting(input, input.value, std::string(input.file));
    tryDate(input.value);
    return 0;
}

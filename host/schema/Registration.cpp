#include "schema/Registration.h"

#include <fstream>
#include <sstream>

#include "cim/Names.h"
#include "schema/Errors.h"

namespace cimhost {
namespace {

std::string trimmed(const std::string& string) {
    constexpr auto blanks = " \t\r\n\f\v";
    const std::size_t first = string.find_first_not_of(blanks);
    return first == std::string::npos ? "" : string.substr(first, string.find_last_not_of(blanks) - first + 1);
}

std::vector<std::string> words(const std::string& string) {
    std::istringstream stream(string);
    std::vector<std::string> found;
    for (std::string word; stream >> word;) {
        found.push_back(word);
    }
    return found;
}

/** Reads the lines of one file. */
class RegistrationReader {
public:
    explicit RegistrationReader(std::string name) : sourceName(std::move(name)) {}

    void readLine(const std::string& line) {
        ++lineNumber;
        const std::string content = trimmed(line);
        if (content.empty() || content.front() == '#') {
            return;
        }
        if (content.front() == '[') {
            startSection(content);
        } else {
            readKeyword(content);
        }
    }

    std::vector<ProviderRegistration> finish() {
        checkSection();
        return std::move(sections);
    }

private:
    [[noreturn]] void fail(const std::string& message) const {
        throw LoadError(sourceName + ":" + std::to_string(lineNumber) + ": " + message);
    }

    void startSection(const std::string& line) {
        checkSection();
        if (line.back() != ']') {
            fail("expected ] at the end of [CLASS]");
        }
        ProviderRegistration section;
        section.className = trimmed(line.substr(1, line.size() - 2));
        if (!cim::isName(section.className)) {
            fail("expected a class name in [ ]");
        }
        section.source = sourceName + ":" + std::to_string(lineNumber);
        sections.push_back(std::move(section));
    }

    void readKeyword(const std::string& line) {
        const std::size_t colon = line.find(':');
        if (colon == std::string::npos) {
            fail("expected [CLASS], \"keyword: value\" or #");
        }
        if (sections.empty()) {
            fail("expected [CLASS] before the first keyword");
        }
        apply(cim::foldedName(trimmed(line.substr(0, colon))), trimmed(line.substr(colon + 1)));
    }

    void apply(const std::string& keyword, const std::string& value) {
        struct Row {
            const char* keyword;
            std::string ProviderRegistration::*member;
        };
        constexpr Row rows[] = {{"provider", &ProviderRegistration::provider},
                                {"location", &ProviderRegistration::location},
                                {"group", &ProviderRegistration::group},
                                {"unload", &ProviderRegistration::unload}};
        ProviderRegistration& section = sections.back();
        for (const Row& row : rows) {
            if (keyword == row.keyword) {
                section.*row.member = oneWord(keyword, value);
            }
        }
        if (keyword == "type") {
            readTypes(section, value);
        } else if (keyword == "namespace") {
            const std::vector<std::string> names = words(value);
            section.nameSpaces.insert(section.nameSpaces.end(), names.begin(), names.end());
        }
    }

    std::string oneWord(const std::string& keyword, const std::string& value) const {
        if (words(value).size() != 1) {
            fail("expected one word after \"" + keyword + ":\"");
        }
        return value;
    }

    static void readTypes(ProviderRegistration& section, const std::string& value) {
        for (const std::string& type : words(value)) {
            section.instance = section.instance || cim::sameName(type, "instance");
            section.association = section.association || cim::sameName(type, "association");
        }
    }

    /** @throws LoadError if the last section lacks a provider, a library or namespaces */
    void checkSection() const {
        if (sections.empty()) {
            return;
        }
        const ProviderRegistration& section = sections.back();
        const auto require = [&](bool isPresent, const char* line) {
            if (!isPresent) {
                throw LoadError(section.source + ": the section [" + section.className + "] has no line \"" + line +
                                "\"");
            }
        };
        require(!section.provider.empty(), "provider: NAME");
        require(!section.location.empty(), "location: LIBRARY");
        require(!section.nameSpaces.empty(), "namespace: root/cimv2");
    }

    std::string sourceName;
    unsigned long lineNumber = 0;
    std::vector<ProviderRegistration> sections{};
};

}  // namespace

std::vector<ProviderRegistration> readRegistrationFile(const std::filesystem::path& file) {
    std::error_code error;
    if (!std::filesystem::exists(file, error)) {
        throw LoadError(file.string() + ": this file does not exist");
    }
    std::ifstream stream(file);
    if (!stream || std::filesystem::is_directory(file, error)) {
        throw LoadError(file.string() + ": this file cannot be read");
    }
    return readRegistrations(stream, file.string());
}

std::vector<ProviderRegistration> readRegistrations(std::istream& stream, const std::string& sourceName) {
    RegistrationReader reader(sourceName);
    for (std::string line; std::getline(stream, line);) {
        reader.readLine(line);
    }
    if (stream.bad()) {
        throw LoadError(sourceName + ": this file cannot be read");
    }
    return reader.finish();
}

}  // namespace cimhost

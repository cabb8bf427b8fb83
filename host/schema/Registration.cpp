#include "schema/Registration.h"

#include <algorithm>
#include <fstream>
#include <sstream>

#include "cim/Names.h"
#include "schema/Errors.h"

namespace cimhost {
namespace {

std::string trimmed(const std::string& text) {
    constexpr auto blanks = " \t\r\n\f\v";
    const std::size_t first = text.find_first_not_of(blanks);
    return first == std::string::npos ? "" : text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

std::vector<std::string> words(const std::string& text) {
    std::istringstream stream(text);
    std::vector<std::string> found;
    for (std::string word; stream >> word;) {
        found.push_back(word);
    }
    return found;
}

/** Reads one file: the stanzas so far, and the line it is at. */
class RegistrationReader {
public:
    explicit RegistrationReader(std::string name) : sourceName(std::move(name)) {}

    void readLine(const std::string& line) {
        ++lineNumber;
        const std::string text = trimmed(line);
        if (text.empty() || text.front() == '#') {
            return;
        }
        if (text.front() == '[') {
            startStanza(text);
        } else {
            readKeyword(text);
        }
    }

    std::vector<ProviderRegistration> finish() {
        checkStanza();
        return std::move(stanzas);
    }

private:
    [[noreturn]] void fail(const std::string& text) const {
        throw LoadError(sourceName + ":" + std::to_string(lineNumber) + ": " + text);
    }

    void startStanza(const std::string& text) {
        checkStanza();
        if (text.back() != ']') {
            fail("expected ] at the end of [CLASS]");
        }
        ProviderRegistration stanza;
        stanza.className = trimmed(text.substr(1, text.size() - 2));
        if (!cim::isName(stanza.className)) {
            fail("expected a class name in [ ]");
        }
        stanza.source = sourceName + ":" + std::to_string(lineNumber);
        stanzas.push_back(std::move(stanza));
    }

    void readKeyword(const std::string& text) {
        const std::size_t colon = text.find(':');
        if (colon == std::string::npos) {
            fail("expected [CLASS], \"keyword: value\" or #");
        }
        if (stanzas.empty()) {
            fail("expected [CLASS] before the first keyword");
        }
        apply(cim::foldedName(trimmed(text.substr(0, colon))), trimmed(text.substr(colon + 1)));
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
        ProviderRegistration& stanza = stanzas.back();
        for (const Row& row : rows) {
            if (keyword == row.keyword) {
                stanza.*row.member = oneWord(keyword, value);
            }
        }
        if (keyword == "type") {
            readTypes(stanza, value);
        } else if (keyword == "namespace") {
            const std::vector<std::string> names = words(value);
            stanza.nameSpaces.insert(stanza.nameSpaces.end(), names.begin(), names.end());
        }
    }

    std::string oneWord(const std::string& keyword, const std::string& value) const {
        if (words(value).size() != 1) {
            fail("expected one word after \"" + keyword + ":\"");
        }
        return value;
    }

    static void readTypes(ProviderRegistration& stanza, const std::string& value) {
        for (const std::string& type : words(value)) {
            stanza.instance = stanza.instance || cim::sameName(type, "instance");
            stanza.association = stanza.association || cim::sameName(type, "association");
        }
    }

    /** A stanza that names no provider, library, namespace or served type is of no use to anybody. */
    void checkStanza() const {
        if (stanzas.empty()) {
            return;
        }
        const ProviderRegistration& stanza = stanzas.back();
        const auto need = [&](bool there, const char* what) {
            if (!there) {
                throw LoadError(stanza.source + ": the stanza [" + stanza.className + "] has no line \"" + what + "\"");
            }
        };
        need(!stanza.provider.empty(), "provider: NAME");
        need(!stanza.location.empty(), "location: LIBRARY");
        need(!stanza.nameSpaces.empty(), "namespace: root/cimv2");
    }

    std::string sourceName;
    unsigned long lineNumber = 0;
    std::vector<ProviderRegistration> stanzas{};
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

std::vector<ProviderRegistration> readRegistrations(std::istream& text, const std::string& sourceName) {
    RegistrationReader reader(sourceName);
    for (std::string line; std::getline(text, line);) {
        reader.readLine(line);
    }
    if (text.bad()) {
        throw LoadError(sourceName + ": this file cannot be read");
    }
    return reader.finish();
}

}  // namespace cimhost

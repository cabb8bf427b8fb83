#include "configuration/Document.h"

#include "configuration/FileContent.h"
#include "configuration/Toml.h"
#include "configuration/TomlText.h"

#include <cstdlib>

namespace Agent {

namespace {

std::string invalid(const std::string& name, std::size_t line, std::string_view reason) {
    return name + " is not valid TOML (line " + std::to_string(line) + ": " + std::string(reason) +
           "); using the defaults";
}

}  // namespace

struct Document::Content {
    toml::table table;
};

Document::Document() : content(std::make_unique<Content>()) {}
Document::Document(Document&&) noexcept = default;
Document& Document::operator=(Document&&) noexcept = default;
Document::~Document() = default;

Document Document::read(const std::string& path) {
    const FileContent file = readFile(path);
    if (file.error == 0) {
        return parse(file.text, path);
    }
    Document document;
    if (!file.absent()) {
        document.whatIsWrong = path + " cannot be read (" + errorText(file.error) + "); using the defaults";
    }
    return document;
}

Document Document::readDefault() {
    const char* path = ::secure_getenv("OSTREL_CONFIG");
    return read(path != nullptr && *path != '\0' ? path : "/etc/ostrel/agent.toml");
}

Document Document::parse(std::string_view text, const std::string& name) {
    Document document;
    if (const std::optional<Objection> objection = objectionTo(text)) {
        document.whatIsWrong = invalid(name, objection->line, objection->reason);
        return document;
    }
    try {
        // The name is not for the parser: it would end the process where memory for a copy is lacking.
        document.content->table = toml::parse(text);
    } catch (const toml::parse_error& failure) {
        document.whatIsWrong = invalid(name, failure.source().begin.line, failure.description());
    }
    return document;
}

TableReader Document::root(Problems& problems) const {
    return TableReader(&content->table, "", problems);
}

}  // namespace Agent

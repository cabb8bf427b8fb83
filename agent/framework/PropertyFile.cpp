#include "KO/PropertyFile.h"

#include <utility>

#include "KO/Exceptions.h"
#include "KO/Strings.h"
#include "KO/Utils.h"
#include "configuration/FileContent.h"
#include "framework/FileAccess.h"
#include "framework/PropertyText.h"

namespace KO {

struct PropertyFile::Implementation {
    std::wstring path;
    std::optional<PropertyText> content;  ///< present while the file is open
    bool writable = false;
    bool changed = false;

    [[noreturn]] void fail(const char* what) const {
        throw FrameworkException(("Property file " + make_string(path) + what).c_str());
    }

    PropertyText& openContent() {
        if (!content) {
            fail(" is not open");
        }
        return *content;
    }
};

PropertyFile::PropertyFile(const File::Path& path) : implementation(std::make_unique<Implementation>()) {
    implementation->path = path.text();
}

PropertyFile::~PropertyFile() = default;

void PropertyFile::open(unsigned long mode) {
    const Agent::FileDescriptor file = openFile(implementation->path, mode);
    std::string text;
    if (const int error = Agent::readRest(file.get(), text)) {
        throwFileError("Cannot read ", make_string(implementation->path), error);
    }
    implementation->content.emplace(text);
    implementation->writable = mode == FILE_MODE_WRITE;
    implementation->changed = false;
}

void PropertyFile::close() {
    const std::optional<PropertyText> content = std::exchange(implementation->content, std::nullopt);
    if (content && std::exchange(implementation->changed, false)) {
        replaceFile(make_string(implementation->path), content->text());
    }
}

std::string Utils::ReadStringFromFile(PropertyFile& file, const std::string& key) {
    return file.implementation->openContent().get(key).value_or(std::string());
}

void Utils::WriteStringToFile(PropertyFile& file, const std::string& key, const std::string& value) {
    PropertyFile::Implementation& implementation = *file.implementation;
    PropertyText& content = implementation.openContent();
    if (!implementation.writable) {
        implementation.fail(" is open for reading only");
    }
    content.set(key, value);
    implementation.changed = true;
}

}  // namespace KO

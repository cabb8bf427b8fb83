#include "KO/File.h"

#include <sys/stat.h>

#include "KO/Strings.h"
#include "framework/FileAccess.h"

namespace KO {

struct File::Path::Implementation {
    std::wstring text;
};

File::Path::Path(const std::wstring& path) : implementation(std::make_unique<Implementation>()) {
    implementation->text = path;
}
File::Path::Path(const Path& other) : implementation(std::make_unique<Implementation>(*other.implementation)) {}
File::Path::~Path() = default;

File::Path& File::Path::operator=(const Path& other) {
    implementation->text = other.implementation->text;
    return *this;
}

std::wstring File::Path::text() const {
    return implementation->text;
}

struct File::Implementation {
    std::wstring path;
    Agent::FileDescriptor file;
};

File::File(const std::wstring& path) : implementation(std::make_unique<Implementation>()) {
    implementation->path = path;
}
File::~File() = default;

void File::open(unsigned long mode) {
    implementation->file = openFile(implementation->path, mode);
}
void File::close() {
    implementation->file = Agent::FileDescriptor();
}

bool File::exists(const std::wstring& path) {
    const std::string name = make_string(path);
    struct stat status {};
    return name.find('\0') == std::string::npos && ::stat(name.c_str(), &status) == 0;
}

}  // namespace KO

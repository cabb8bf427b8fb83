#include "AssetFileDouble.h"

#include <filesystem>

#include "KO/File.h"
#include "KO/Mutex.h"
#include "KO/PropertyFile.h"
#include "KO/Strings.h"
#include "KO/Utils.h"

namespace {

struct State {
    std::vector<std::string> calls;
    std::map<std::string, std::string> values;
    std::map<std::string, std::function<void()>> actions;
    bool locked = false;
};

/** Constructed on first use, since the element's lock is a static object. */
State& state() {
    static State& theState = *new State;
    return theState;
}

void note(const std::string& call) {
    state().calls.push_back(call + (state().locked ? " locked" : ""));
    const auto action = state().actions.find(call);
    if (action != state().actions.end()) {
        action->second();
    }
}

std::string fileName(const std::wstring& path) {
    return std::filesystem::path(path).filename().string();
}

}  // namespace

namespace assetFileDouble {

const std::vector<std::string>& calls() {
    return state().calls;
}

bool locked() {
    return state().locked;
}

std::map<std::string, std::string>& values() {
    return state().values;
}

void before(const std::string& call, std::function<void()> action) {
    state().actions[call] = std::move(action);
}

void forget() {
    state().calls.clear();
    state().values.clear();
    state().actions.clear();
}

}  // namespace assetFileDouble

namespace KO {

struct Mutex::Implementation {};
Mutex::Mutex() = default;
Mutex::~Mutex() = default;

void Mutex::lock(unsigned long timeout) {
    note("lock " + std::to_string(timeout));
    state().locked = true;
}

void Mutex::unlock() {
    note("unlock");
    state().locked = false;
}

struct File::Implementation {
    std::string name;
};

File::File(const std::wstring& path) : implementation(new Implementation{fileName(path)}) {
    note("File " + implementation->name);
}
File::~File() {
    note("~File");
}
void File::open(unsigned long mode) {
    note("File::open " + std::to_string(mode));
}
void File::close() {
    note("File::close");
}

struct PropertyFile::Implementation {};

PropertyFile::PropertyFile(const File::Path& path) {
    note("PropertyFile " + fileName(path.text()));
}
PropertyFile::~PropertyFile() {
    note("~PropertyFile");
}
void PropertyFile::open(unsigned long mode) {
    note("PropertyFile::open " + std::to_string(mode));
}
void PropertyFile::close() {
    note("PropertyFile::close");
}

std::string Utils::ReadStringFromFile(PropertyFile&, const std::string& key) {
    note("read text " + key);
    return state().values[key];
}

DateTime Utils::ReadDateFromFile(PropertyFile&, const std::string& key) {
    note("read date " + key);
    return convertStringToDateTime(state().values[key]);
}

void Utils::WriteStringToFile(PropertyFile&, const std::string& key, const std::string& value) {
    note("write text " + key + "=" + value);
}

void Utils::WriteDateToFile(PropertyFile&, const std::string& key, const DateTime& value) {
    note("write date " + key + "=" + convertCIMDateTime(value));
}

}  // namespace KO

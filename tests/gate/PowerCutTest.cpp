#include "GateFixture.h"
#include "durable/RecordFile.h"
#include "support/Files.h"

#include <dlfcn.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/uio.h>
#include <unistd.h>

#include <array>
#include <cstdarg>
#include <cstdio>
#include <functional>
#include <map>
#include <set>

// Power failures during changes. Records the operations on files, and at each of them builds every state that a file
// system may have after a power failure. Of the names that were not synced, any subset may have changed. Of the writes
// that were not synced, any first part may be there, or all with one of them as zeros.

extern const bool agentHasNoLog = true;

namespace gatetest {
namespace {

namespace fs = std::filesystem;
using testsupport::readFile;

enum class Kind { create, rename, remove, syncNames, truncate, write, sync };

/** An operation on a file of the data directory. */
struct Event {
    Kind kind;
    ino_t file;            ///< unless removed or the names were synced
    std::string name{};    ///< of a file that was created, renamed or removed
    std::string target{};  ///< new name of a renamed file
    std::string data{};
    std::size_t size = 0;  ///< after a truncation
};

/** Records operations during its lifetime. */
struct Recording {
    static inline std::vector<Event>* events = nullptr;

    Recording() { events = &recorded; }
    ~Recording() { events = nullptr; }
    Recording(const Recording&) = delete;
    Recording& operator=(const Recording&) = delete;

    std::vector<Event> recorded;
};

/** Returns the name of a file in the data directory, "/" for the directory itself, otherwise an empty string. */
std::string nameOf(const std::string& path) {
    const fs::path directory = agentEnvironment::dataDirectory();
    const fs::path file = fs::path(path).lexically_normal();
    if (file == directory || file == directory / "") {
        return "/";
    }
    return file.parent_path() == directory ? file.filename().string() : std::string();
}

std::string nameOf(int descriptor) {
    std::array<char, 4096> path{};
    const std::string link = "/proc/self/fd/" + std::to_string(descriptor);
    const ssize_t size = readlink(link.c_str(), path.data(), path.size());
    return size > 0 ? nameOf(std::string(path.data(), static_cast<std::size_t>(size))) : std::string();
}

ino_t inodeOf(const std::string& path) {
    struct stat status {};
    return stat(path.c_str(), &status) == 0 ? status.st_ino : 0;
}

ino_t inodeOf(int descriptor) {
    struct stat status {};
    return fstat(descriptor, &status) == 0 ? status.st_ino : 0;
}

void record(Event event) {
    if (Recording::events != nullptr) {
        Recording::events->push_back(std::move(event));
    }
}

bool isRecorded(const std::string& name) {
    return Recording::events != nullptr && !name.empty() && name != "owner";
}

/** Records that a file was opened. @param existed whether it was there before */
void recordOpening(const char* path, bool existed, bool truncates) {
    const std::string name = nameOf(std::string(path));
    if (!isRecorded(name) || inodeOf(std::string(path)) == 0) {
        return;
    }
    if (!existed) {
        record({Kind::create, inodeOf(std::string(path)), name});
    } else if (truncates) {
        record({Kind::truncate, inodeOf(std::string(path))});
    }
}

void recordWriting(int descriptor, std::string data) {
    if (Recording::events != nullptr && isRecorded(nameOf(descriptor))) {
        record({Kind::write, inodeOf(descriptor), {}, {}, std::move(data)});
    }
}

/** A file's data: the synced content, and the operations since. */
struct Data {
    std::string synced{};
    std::vector<Event> pending{};

    /** With the first operations since. @param hole an operation whose data are zeros; none if it is `count` */
    std::string with(std::size_t count, std::size_t hole) const {
        std::string content = synced;
        for (std::size_t index = 0; index < count; ++index) {
            const Event& event = pending[index];
            if (event.kind == Kind::truncate) {
                content.resize(event.size);
            } else {
                content += index == hole ? std::string(event.data.size(), '\0') : event.data;
            }
        }
        return content;
    }

    /** All contents that the file may have after a power failure. */
    std::set<std::string> possible() const {
        std::set<std::string> contents;
        for (std::size_t count = 0; count <= pending.size(); ++count) {
            contents.insert(with(count, count));
            contents.insert(with(pending.size(), count));
        }
        return contents;
    }
};

using Names = std::map<std::string, ino_t>;
using Files = std::map<std::string, std::string>;

/** The data directory on a disk. */
class Disk {
public:
    /** The files as they are, all synced. */
    Disk() {
        for (const auto& entry : fs::directory_iterator(agentEnvironment::dataDirectory())) {
            names[entry.path().filename()] = inodeOf(entry.path().string());
            data[inodeOf(entry.path().string())].synced = readFile(entry.path());
        }
    }

    void apply(const Event& event) {
        switch (event.kind) {
            case Kind::syncNames:
                names = namesWith(~0U);
                pendingNames.clear();
                break;
            case Kind::sync:
                data[event.file] = {data[event.file].with(data[event.file].pending.size(), ~std::size_t{0}), {}};
                break;
            case Kind::truncate:
            case Kind::write:
                data[event.file].pending.push_back(event);
                break;
            default:
                pendingNames.push_back(event);
                break;
        }
    }

    /** Calls `body` with all states that the directory may have after a power failure. */
    void eachState(const std::function<void(const Files&)>& body) const {
        ASSERT_LT(pendingNames.size(), 8U) << "too many to try all";
        for (unsigned int chosen = 0; chosen < 1U << pendingNames.size(); ++chosen) {
            const Names kept = namesWith(chosen);
            eachContent(kept, kept.begin(), {}, body);
        }
    }

private:
    Names namesWith(unsigned int chosen) const {
        Names kept = names;
        for (std::size_t index = 0; index < pendingNames.size(); ++index) {
            const Event& event = pendingNames[index];
            if ((chosen >> index & 1U) == 0) {
                continue;
            }
            if (event.kind == Kind::create) {
                kept[event.name] = event.file;
            } else {
                kept.erase(event.name);
            }
            if (event.kind == Kind::rename) {
                kept[event.target] = event.file;
            }
        }
        return kept;
    }

    void eachContent(const Names& kept, Names::const_iterator next, const Files& files,
                     const std::function<void(const Files&)>& body) const {
        if (next == kept.end()) {
            return body(files);
        }
        const auto found = data.find(next->second);
        const std::set<std::string> contents =
            found == data.end() ? std::set<std::string>{std::string()} : found->second.possible();
        for (const std::string& content : contents) {
            Files more = files;
            more[next->first] = content;
            eachContent(kept, std::next(next), more, body);
        }
    }

    Names names{};
    std::map<ino_t, Data> data{};
    std::vector<Event> pendingNames{};
};

class PowerCutTest : public GateTest {
protected:
    /** Returns the lease file after the recovery of a state of the directory. */
    const std::string& recovered(const Files& files) {
        const auto known = results.find(files);
        if (known != results.end()) {
            return known->second;
        }
        fs::remove_all(scratch.path() / "data");
        fs::create_directory(scratch.path() / "data");
        for (const auto& [name, content] : files) {
            testsupport::writeFile(scratch.path() / "data" / name, content);
        }
        const durable::RecordFile file = durable::recordFileIn(scratch.withSlash() + "data/", "Lease.dat");
        file.recover();
        const std::string savedLine = "saved copy of Lease.dat\n";  // the last line of a copy does not matter
        std::string content = file.content().value_or("(none)");
        if (content.size() > savedLine.size() && content.find(savedLine) == content.size() - savedLine.size()) {
            content.resize(content.size() - savedLine.size());
        }
        return results[files] = content;
    }

    /** Makes a change, and simulates a power failure before and after each of its operations. */
    void change(const std::function<void()>& request) {
        gate().instanceMI();
        Disk disk;
        const std::string before = readFile(dataFile("Lease.dat"));
        std::vector<Event> events;
        {
            const Recording recording;
            request();
            events = recording.recorded;
        }
        const std::string after = readFile(dataFile("Lease.dat"));
        ASSERT_FALSE(events.empty());
        for (const Event& event : events) {
            disk.eachState([&](const Files& files) {
                const std::string& content = recovered(files);
                EXPECT_TRUE(content == before || content == after) << content << testing::PrintToString(files);
            });
            disk.apply(event);
            ASSERT_FALSE(HasFailure());
        }
        disk.eachState([&](const Files& files) { EXPECT_EQ(recovered(files), after) << "acknowledged"; });
    }

    const testsupport::TempDirectory scratch{access("/dev/shm", W_OK) == 0 ? "/dev/shm" : "/tmp"};
    std::map<Files, std::string> results;
};

TEST_F(PowerCutTest, LeavesTheStateBeforeOrAfterEachChange) {
    const std::vector<NamedValue> values{named("Lessor", text("ACME Leasing")), named("LeaseTerm", uint32(36))};
    create("L1");
    const std::size_t none = results.size();
    change([&] { EXPECT_THAT(create("L2", values), isAnswered(1)); });
    change([&] { EXPECT_THAT(modify("L1", values), isDone()); });
    change([&] { EXPECT_THAT(create("L3"), isAnswered(1)); });
    change([&] { EXPECT_THAT(remove("L2"), isDone()); });
    EXPECT_GT(results.size(), none + 100) << "states were tried";
}

TEST_F(PowerCutTest, LeavesTheStateBeforeARefusedChange) {
    create("L1");
    remove("L1");
    change([&] {
        EXPECT_THAT(create("L2", {named("Lessor", text("ACME")), named("ElementName", text("Other"))}),
                    isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "read-only"));
    });
    EXPECT_EQ(readFile(dataFile("Lease.dat")), "0\n");
}

}  // namespace
}  // namespace gatetest

// Replace the C library's functions, also for the libraries under test.

namespace {

using namespace gatetest;

template <class Function>
Function* next(const char* name) {
    return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

FILE* openStream(const char* function, const char* path, const char* mode) {
    const bool existed = access(path, F_OK) == 0;
    FILE* stream = next<FILE*(const char*, const char*)>(function)(path, mode);
    if (stream != nullptr && *mode == 'w') {
        recordOpening(path, existed, true);
    }
    return stream;
}

int openFile(const char* function, const char* path, int flags, mode_t mode) {
    const bool existed = access(path, F_OK) == 0;
    const int descriptor = next<int(const char*, int, ...)>(function)(path, flags, mode);
    if (descriptor >= 0 && (flags & (O_CREAT | O_TRUNC)) != 0) {
        recordOpening(path, existed, (flags & O_TRUNC) != 0);
    }
    return descriptor;
}

mode_t modeIn(int flags, va_list rest) {
    return (flags & O_CREAT) != 0 ? va_arg(rest, mode_t) : 0;
}

}  // namespace

#define VISIBLE extern "C" __attribute__((visibility("default")))

VISIBLE FILE* fopen(const char* path, const char* mode) {
    return openStream("fopen", path, mode);
}

VISIBLE FILE* fopen64(const char* path, const char* mode) {
    return openStream("fopen64", path, mode);
}

VISIBLE int open(const char* path, int flags, ...) {
    va_list rest;
    va_start(rest, flags);
    const mode_t mode = modeIn(flags, rest);
    va_end(rest);
    return openFile("open", path, flags, mode);
}

VISIBLE int open64(const char* path, int flags, ...) {
    va_list rest;
    va_start(rest, flags);
    const mode_t mode = modeIn(flags, rest);
    va_end(rest);
    return openFile("open64", path, flags, mode);
}

VISIBLE ssize_t write(int file, const void* data, size_t size) {
    const ssize_t count = next<ssize_t(int, const void*, size_t)>("write")(file, data, size);
    if (count > 0) {
        recordWriting(file, std::string(static_cast<const char*>(data), static_cast<std::size_t>(count)));
    }
    return count;
}

VISIBLE ssize_t writev(int file, const struct iovec* parts, int count) {
    std::string data;
    for (int part = 0; part < count; ++part) {
        data.append(static_cast<const char*>(parts[part].iov_base), parts[part].iov_len);
    }
    const ssize_t written = next<ssize_t(int, const struct iovec*, int)>("writev")(file, parts, count);
    if (written > 0) {
        recordWriting(file, data.substr(0, static_cast<std::size_t>(written)));
    }
    return written;
}

VISIBLE int fsync(int file) {
    const std::string name = nameOf(file);
    if (isRecorded(name)) {
        record({name == "/" ? Kind::syncNames : Kind::sync, inodeOf(file)});
    }
    return 0;  // a real sync would only be slow
}

VISIBLE int rename(const char* from, const char* to) noexcept {
    const ino_t file = inodeOf(std::string(from));
    const int result = next<int(const char*, const char*)>("rename")(from, to);
    if (result == 0 && isRecorded(nameOf(std::string(to)))) {
        record({Kind::rename, file, nameOf(std::string(from)), nameOf(std::string(to))});
    }
    return result;
}

VISIBLE int unlink(const char* path) noexcept {
    const int result = next<int(const char*)>("unlink")(path);
    if (result == 0 && isRecorded(nameOf(std::string(path)))) {
        record({Kind::remove, 0, nameOf(std::string(path))});
    }
    return result;
}

VISIBLE int truncate(const char* path, off_t size) noexcept {
    const int result = next<int(const char*, off_t)>("truncate")(path, size);
    if (result == 0 && isRecorded(nameOf(std::string(path)))) {
        record({Kind::truncate, inodeOf(std::string(path)), {}, {}, {}, static_cast<std::size_t>(size)});
    }
    return result;
}

#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <functional>
#include <map>
#include <set>

#include "FileEvents.h"
#include "support/AgentEnvironment.h"
#include "support/Files.h"

// The states that a file system may have after a power failure: any subset of the changes of names that were not
// synced, and the first part of the writes that were not synced, or all of them with one write as zeros.

namespace gatetest {

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
        for (const auto& entry : std::filesystem::directory_iterator(agentEnvironment::dataDirectory())) {
            names[entry.path().filename()] = inodeOf(entry.path());
            data[inodeOf(entry.path())].synced = testsupport::readFile(entry.path());
        }
    }

    /** Regards a file's content as not synced. */
    void forget(const std::string& name) {
        Data& file = data.at(names.at(name));
        file = {{}, {{Kind::write, names.at(name), {}, {}, file.synced}}};
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

}  // namespace gatetest

#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <functional>
#include <map>
#include <set>

#include "FileEvents.h"
#include "support/AgentEnvironment.h"
#include "support/Files.h"

// Computes the states that a file system can have after a power failure. The disk can have any subset of the changes
// that were not synced: changes to names, and writes to each file. A write can be partial. A file can have its final
// size without the writes that extended it. A truncation takes effect before the writes that follow it.

namespace gatetest {

/** The number of bytes of each write that are on the disk. */
using WrittenSizes = std::vector<std::size_t>;

/** The writes to a file between two truncations. */
struct Writes {
    std::vector<Event> events{};

    /** Adds all contents that a file with the content `start` can have after the writes. */
    void addContents(const std::string& start, std::set<std::string>& contents) const {
        for (const WrittenSizes& sizes : possible()) {
            std::string content = start;
            std::size_t end = start.size();
            for (std::size_t index = 0; index < events.size(); ++index) {
                const Event& event = events[index];
                end = std::max(end, event.offset + event.data.size());
                if (sizes[index] != 0) {
                    content.resize(std::max(content.size(), event.offset + sizes[index]));
                    content.replace(event.offset, sizes[index], event.data, 0, sizes[index]);
                }
            }
            contents.insert(content);
            content.resize(end);  // with zeros
            contents.insert(content);
        }
    }

private:
    static constexpr std::size_t most = 10;  ///< the maximum number of writes of which all subsets are tried

    /**
     * Returns all subsets of up to `most` writes. Of any number of writes, returns the prefixes, all writes except one,
     * and single writes, and each of these with half of the last, missing or single write.
     */
    std::vector<WrittenSizes> possible() const {
        std::vector<WrittenSizes> all;
        const auto add = [&](auto sizeOf) {
            WrittenSizes sizes;
            for (std::size_t index = 0; index < events.size(); ++index) {
                sizes.push_back(sizeOf(index, events[index].data.size()));
            }
            all.push_back(sizes);
        };
        const std::size_t subsets = events.size() <= most ? std::size_t{1} << events.size() : 0;
        for (std::size_t chosen = 0; chosen < subsets; ++chosen) {
            add([&](std::size_t index, std::size_t size) { return (chosen >> index & 1U) != 0 ? size : 0; });
        }
        for (std::size_t one = 0; one <= events.size(); ++one) {
            for (const std::size_t divisor : {std::size_t{1}, std::size_t{2}, ~std::size_t{0}}) {
                const auto partOf = [&](std::size_t size) { return size / divisor; };
                add([&](std::size_t each, std::size_t size) {
                    return each == one ? partOf(size) : each < one ? size : 0;
                });
                add([&](std::size_t each, std::size_t size) { return each == one ? partOf(size) : size; });
                add([&](std::size_t each, std::size_t size) { return each == one ? partOf(size) : 0; });
            }
        }
        return all;
    }
};

/** A file's data: the synced content, and the operations since the sync. */
struct Data {
    std::string synced{};
    std::vector<Event> pending{};

    /** Returns the content after all pending operations. */
    std::string current() const {
        std::string content = synced;
        for (const Event& event : pending) {
            content.resize(event.kind == Kind::truncate ? event.offset : std::max(content.size(), event.offset));
            content.replace(event.offset, event.data.size(), event.data);
        }
        return content;
    }

    /** Returns all contents that the file can have after a power failure. */
    std::set<std::string> possible() const {
        std::set<std::string> contents{synced};
        std::set<std::string> starts{synced};
        Writes writes;
        const auto addContents = [&] {
            std::set<std::string> reached;
            for (const std::string& start : starts) {
                writes.addContents(start, reached);
            }
            contents.insert(reached.begin(), reached.end());
            return reached;
        };
        for (const Event& event : pending) {
            if (event.kind != Kind::truncate) {
                writes.events.push_back(event);
                continue;
            }
            const std::set<std::string> reached = addContents();
            starts.clear();
            for (std::string content : reached) {
                content.resize(event.offset);
                starts.insert(std::move(content));
            }
            writes.events.clear();
        }
        addContents();
        return contents;
    }
};

using Names = std::map<std::string, ino_t>;
using Files = std::map<std::string, std::string>;

/** The data directory on a disk. */
class Disk {
public:
    /** Starts with the current files, all of them synced. */
    Disk() {
        for (const auto& entry : std::filesystem::directory_iterator(agentEnvironment::dataDirectory())) {
            names[entry.path().filename()] = inodeOf(entry.path());
            data[inodeOf(entry.path())].synced = testsupport::readFile(entry.path());
        }
    }

    /** Marks a file's content as not synced. */
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
                data[event.file] = {data[event.file].current(), {}};
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

    /** Calls `body` with each state that the directory can have after a power failure. */
    void eachState(const std::function<void(const Files&)>& body) const {
        ASSERT_LT(pendingNames.size(), 8U) << "too many changes to names to try all subsets";
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

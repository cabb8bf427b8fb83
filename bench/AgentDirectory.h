#pragma once

#include <filesystem>

namespace bench {

/**
 * A temporary directory with an agent's configuration, in which the log goes nowhere, and its data. It is there, and
 * announced in the environment, before the agent's libraries are loaded; it is removed in the end.
 */
class AgentDirectory {
public:
    AgentDirectory();
    ~AgentDirectory();
    AgentDirectory(const AgentDirectory&) = delete;
    AgentDirectory& operator=(const AgentDirectory&) = delete;

    std::filesystem::path data() const { return root / "data"; }

    /** Where the floor writes what the provider writes to its data directory. */
    std::filesystem::path floorData() const { return root / "floor"; }

    /** Removes the record files; the asset file stays. */
    void removeRecords() const;

private:
    void writeConfiguration(const std::filesystem::path& file) const;

    std::filesystem::path root;
};

}  // namespace bench

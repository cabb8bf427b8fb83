#pragma once

#include <filesystem>

namespace bench {

/**
 * A temporary directory with an agent's data and a configuration that disables the log. Construct it before the agent's
 * libraries are loaded, since it sets OSTREL_CONFIG, which they read.
 */
class AgentDirectory {
public:
    AgentDirectory();
    ~AgentDirectory();
    AgentDirectory(const AgentDirectory&) = delete;
    AgentDirectory& operator=(const AgentDirectory&) = delete;

    std::filesystem::path data() const { return root / "data"; }

    /** The data directory of the baseline. */
    std::filesystem::path baselineData() const { return root / "baseline"; }

    /** Removes the record files, not the asset file. */
    void removeRecords() const;

private:
    void writeConfiguration(const std::filesystem::path& file) const;

    std::filesystem::path root;
};

}  // namespace bench

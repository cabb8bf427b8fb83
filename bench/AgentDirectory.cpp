#include "AgentDirectory.h"

#include <cstdlib>
#include <fstream>
#include <stdexcept>
#include <string>

#include "Rows.h"

namespace bench {

namespace fs = std::filesystem;

AgentDirectory::AgentDirectory() {
    std::string pattern = (fs::temp_directory_path() / "bench-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) {
        throw std::runtime_error("cannot create a temporary directory");
    }
    root = pattern;
    fs::create_directory(data());
    fs::create_directory(baselineData());
    const fs::path configuration = root / "agent.toml";
    writeConfiguration(configuration);
    std::ofstream(data() / "asset.dat") << assetFileContent();
    setenv("OSTREL_CONFIG", configuration.c_str(), 1);
}

AgentDirectory::~AgentDirectory() {
    std::error_code ignored;
    fs::remove_all(root, ignored);
}

void AgentDirectory::removeRecords() const {
    for (const fs::path& directory : {data(), baselineData()}) {
        fs::remove(directory / LeaseRow::fileName);
        fs::remove(directory / WarrantyRow::fileName);
    }
}

/** The operator << writes paths in quotes, as TOML requires. */
void AgentDirectory::writeConfiguration(const fs::path& file) const {
    std::ofstream stream(file);
    stream << "[directories]\ndata = " << data() << "\ninstall = " << root << "\n[product]\nname = \"" << names::agent
           << "\"\nversion = \"" << names::agentVersion << "\"\nbuild_number = \"" << names::agentBuild
           << "\"\nidentifying_number = \"" << names::agentNumber << "\"\nvendor = \"" << names::vendor
           << "\"\n[log]\ndestination = \"none\"\n[instrumentation]\ndiscover = false\n"
           << "[[instrumentation.node]]\ntype = 1\npath = \"" << names::systemNode << "\"\nproperties = { 36 = \""
           << names::vendor << "\" }\n"
           << "[[instrumentation.node]]\ntype = 40\npath = \"" << names::computerNode << "\"\nproperties = { 39 = \""
           << names::computerModel << " - Tower\", 108 = \"" << names::computer << "\" }\n";
}

}  // namespace bench

#include <algorithm>
#include <array>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include "KO/NodeLexicon.h"
#include "MemoryFile.h"
#include "Target.h"
#include "cim/Utf8.h"
#include "framework/NodeTree.h"

// Strings of the firmware: any string results in nodes with readable names. Readable names are not changed.

namespace {

namespace fs = std::filesystem;
using fuzz::require;
using fuzz::requireSame;

constexpr const char* separator = " - ";

/** The directory of the kernel's DMI files. The input has the content of three of them. */
class DmiDirectory {
public:
    DmiDirectory() {
        std::string pattern = (fs::temp_directory_path() / "dmi-XXXXXX").string();
        require(mkdtemp(pattern.data()) != nullptr, "a temporary directory can be created");
        directory = pattern;
        for (std::size_t index = 0; index < names.size(); ++index) {
            fs::create_symlink(files[index].path(), directory / names[index]);
        }
    }

    ~DmiDirectory() {
        std::error_code ignored;
        fs::remove_all(directory, ignored);
    }

    DmiDirectory(const DmiDirectory&) = delete;
    DmiDirectory& operator=(const DmiDirectory&) = delete;

    std::vector<KO::Node> discover(std::string_view vendor, std::string_view product, std::string_view chassis) {
        files[0].fill(vendor);
        files[1].fill(product);
        files[2].fill(chassis);
        Agent::Problems problems;
        const KO::NodeTree tree = KO::discoverComputer(directory.string() + "/", "host", problems);
        require(problems.empty(), "all files can be read");
        return tree.nodes();
    }

private:
    static constexpr std::array<const char*, 3> names{"sys_vendor", "product_name", "chassis_type"};

    std::array<fuzz::MemoryFile, names.size()> files{};
    fs::path directory{};
};

/** @throws Violation unless the value has only printable characters and single blanks between them */
void requireReadable(std::string_view value, const std::string& what) {
    require(!value.empty() && value.front() != ' ' && value.back() != ' ', what + " has no blanks at its ends");
    require(value.find("  ") == std::string_view::npos, what + " has single blanks only");
    while (!value.empty()) {
        const cim::Utf8Character character = cim::firstCharacter(value);
        const bool isControl = character.codePoint < ' ' || (character.codePoint >= 0x7f && character.codePoint < 0xa0);
        require(character.valid && !isControl, what + " has no control characters and is UTF-8");
        value.remove_prefix(character.length);
    }
}

/** Splits a product name at its first dash into model and suffix. */
std::pair<std::string, std::string> partsOf(const std::string& product) {
    const std::size_t dash = product.find('-');
    require(dash != std::string::npos && dash > 0, "a product name has a dash");
    requireSame(product.substr(dash - 1, 3), std::string(separator), "separator of model and suffix");
    const std::string model = product.substr(0, dash - 1);
    const std::string suffix = product.substr(dash + 2);
    requireReadable(model, "model");
    requireReadable(suffix, "suffix");
    return {model, suffix};
}

/** Removes the part of an input up to its first null character, and returns the part without that character. */
std::string_view takePart(std::string_view& input) {
    const std::size_t end = std::min(input.find('\0'), input.size());
    const std::string_view part = input.substr(0, end);
    input.remove_prefix(std::min(end + 1, input.size()));
    return part;
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static DmiDirectory directory;
    std::string_view input = fuzz::inputOf(data, size);
    const std::string_view vendorFile = takePart(input);
    const std::string_view chassisFile = takePart(input);
    const auto nodes = directory.discover(vendorFile, input, chassisFile);
    require(nodes.size() == 2, "there is a system and a computer");
    require(nodes[0].properties == nodes[1].properties, "both have the same properties");

    const std::string vendor = nodes[0].properties.at(KO::NodeLexicon::PROPERTY_VENDOR);
    const std::string product = nodes[0].properties.at(KO::NodeLexicon::PROPERTY_PRODUCT_NAME);
    requireReadable(vendor, "vendor");
    const auto [model, suffix] = partsOf(product);

    const auto again = directory.discover(vendor, model, chassisFile);
    requireSame(again[0].properties.at(KO::NodeLexicon::PROPERTY_VENDOR), vendor, "vendor read again");
    requireSame(again[0].properties.at(KO::NodeLexicon::PROPERTY_PRODUCT_NAME), product, "model read again");
    return 0;
}

#include "MemoryFile.h"
#include "Target.h"

#include "KO/NodeLexicon.h"
#include "cim/Utf8.h"
#include "framework/ComputerDiscovery.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

// What firmware says of the machine: whatever that is, nodes have readable names, and no more is changed once it is so.

namespace {

namespace fs = std::filesystem;
using fuzz::require;
using fuzz::requireSame;

constexpr const char* separator = " - ";

/** The directory of the kernel's DMI files, of which the input tells the content of three. */
class DmiDirectory {
public:
    DmiDirectory() {
        std::string pattern = (fs::temp_directory_path() / "dmi-XXXXXX").string();
        require(mkdtemp(pattern.data()) != nullptr, "a temporary directory can be made");
        folder = pattern;
        for (std::size_t index = 0; index < names.size(); ++index) {
            fs::create_symlink(files[index].path(), folder / names[index]);
        }
    }

    ~DmiDirectory() {
        std::error_code ignored;
        fs::remove_all(folder, ignored);
    }

    DmiDirectory(const DmiDirectory&) = delete;
    DmiDirectory& operator=(const DmiDirectory&) = delete;

    std::vector<KO::Node> discover(std::string_view vendor, std::string_view product, std::string_view chassis) {
        files[0].fill(vendor);
        files[1].fill(product);
        files[2].fill(chassis);
        Agent::Problems problems;
        const KO::NodeTree tree = KO::discoverComputer(folder.string() + "/", "host", problems);
        require(problems.empty(), "all files can be read");
        return tree.nodes();
    }

private:
    static constexpr std::array<const char*, 3> names{"sys_vendor", "product_name", "chassis_type"};

    std::array<fuzz::MemoryFile, names.size()> files{};
    fs::path folder{};
};

/** Characters that can be shown, and single blanks between them. */
void requireTidy(std::string_view text, const std::string& what) {
    require(!text.empty() && text.front() != ' ' && text.back() != ' ', what + " has a text without outer blanks");
    require(text.find("  ") == std::string_view::npos, what + " has single blanks only");
    while (!text.empty()) {
        const cim::Utf8Character character = cim::firstCharacter(text);
        const bool isControl = character.codePoint < ' ' || (character.codePoint >= 0x7f && character.codePoint < 0xa0);
        require(character.valid && !isControl, what + " has no controls and is UTF-8");
        text.remove_prefix(character.length);
    }
}

/** The model and the suffix; the first dash stands between them. */
std::pair<std::string, std::string> partsOf(const std::string& product) {
    const std::size_t dash = product.find('-');
    require(dash != std::string::npos && dash > 0, "a product name has a dash");
    requireSame(product.substr(dash - 1, 3), std::string(separator), "what stands between model and suffix");
    const std::string model = product.substr(0, dash - 1);
    const std::string suffix = product.substr(dash + 2);
    requireTidy(model, "model");
    requireTidy(suffix, "suffix");
    return {model, suffix};
}

std::string_view takeLine(std::string_view& text) {
    const std::size_t end = std::min(text.find('\0'), text.size());
    const std::string_view line = text.substr(0, end);
    text.remove_prefix(std::min(end + 1, text.size()));
    return line;
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static DmiDirectory directory;
    std::string_view input = fuzz::textOf(data, size);
    const std::string_view vendorFile = takeLine(input);
    const std::string_view chassisFile = takeLine(input);
    const auto nodes = directory.discover(vendorFile, input, chassisFile);
    require(nodes.size() == 2, "there are a system and a computer");
    require(nodes[0].properties == nodes[1].properties, "both have the same properties");

    const std::string vendor = nodes[0].properties.at(KO::NodeLexicon::PROPERTY_VENDOR);
    const std::string product = nodes[0].properties.at(KO::NodeLexicon::PROPERTY_PRODUCT_NAME);
    requireTidy(vendor, "vendor");
    const auto [model, suffix] = partsOf(product);

    const auto again = directory.discover(vendor, model, chassisFile);
    requireSame(again[0].properties.at(KO::NodeLexicon::PROPERTY_VENDOR), vendor, "vendor read again");
    requireSame(again[0].properties.at(KO::NodeLexicon::PROPERTY_PRODUCT_NAME), product, "model read again");
    return 0;
}

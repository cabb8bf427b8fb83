#include "schema/MofReader.h"

#include <fstream>
#include <sstream>
#include <stdexcept>
#include <system_error>

#include "schema/Errors.h"
#include "schema/MofBuilder.h"
#include "schema/MofGrammar.h"

namespace cimhost {
namespace {

namespace mof = grammar::mof;
namespace peg = tao::pegtl;
using grammar::children;
using grammar::Node;

/** @throws std::invalid_argument if the file does not exist or cannot be read */
std::string contentOf(const std::filesystem::path& file) {
    std::error_code error;
    if (!std::filesystem::exists(file, error)) {
        throw std::invalid_argument(file.string() + ": this file does not exist");
    }
    std::ifstream stream(file, std::ios::binary);
    std::ostringstream content;
    if (std::filesystem::is_directory(file, error) || !stream ||
        (stream.peek() != EOF && !(content << stream.rdbuf()))) {
        throw std::invalid_argument(file.string() + ": this file cannot be read");
    }
    return content.str();
}

/** Parses an input, which must outlive the tree. @tparam Rule matches all of it  @throws tao::pegtl::parse_error */
template <typename Rule>
std::unique_ptr<Node> parsed(peg::memory_input<>& input) {
    return peg::parse_tree::parse<Rule, Node, mof::Selected, peg::nothing, mof::Control>(input);
}

}  // namespace

void MofReader::readFile(const std::filesystem::path& file) {
    try {
        readOnce(file);
    } catch (const std::invalid_argument& error) {
        throw LoadError(error.what());
    }
}

void MofReader::readOnce(const std::filesystem::path& file) {
    std::error_code error;
    std::filesystem::path same = std::filesystem::canonical(file, error);
    if (!error && !filesRead.insert(std::move(same)).second) {
        return;
    }
    readSource(contentOf(file), file.string(), file.parent_path());
}

void MofReader::readSource(std::string_view source, const std::string& sourceName,
                           const std::filesystem::path& directory) {
    try {
        peg::memory_input<> input(source.data(), source.size(), sourceName);
        const auto root = parsed<mof::File>(input);
        buildMof(schema, *root, [&](const std::string& file) { readOnce(directory / file); });
    } catch (const peg::parse_error& error) {
        throw errorAt(error.positions().front(), std::string(error.message()));
    }
}

std::vector<Literal> readMofArray(std::string_view source) {
    peg::memory_input<> input(source.data(), source.size(), "");
    try {
        const auto root = parsed<mof::LoneArray>(input);
        std::vector<Literal> literals;
        for (const Node* constant : children<mof::Constant>(*root->children.front())) {
            literals.push_back(constantLiteral(*constant));
        }
        return literals;
    } catch (const peg::parse_error& error) {
        throw ValueError("character " + std::to_string(error.positions().front().column) + ": " +
                         std::string(error.message()));
    }
}

}  // namespace cimhost

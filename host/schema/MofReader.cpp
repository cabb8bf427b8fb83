#include "schema/MofReader.h"

#include <fstream>
#include <sstream>
#include <stdexcept>
#include <system_error>

#include "schema/Errors.h"
#include "schema/MofBuilder.h"
#include "schema/MofMessages.h"

namespace cimhost {
namespace {

namespace mof = grammar::mof;
namespace peg = tao::pegtl;

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

std::string message(const peg::parse_error& error) {
    const peg::position& where = error.positions().front();
    return where.source + ":" + std::to_string(where.line) + ":" + std::to_string(where.column) + ": " +
           std::string(error.message());
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

void MofReader::readSource(std::string_view mof, const std::string& sourceName,
                           const std::filesystem::path& directory) {
    try {
        peg::memory_input<> input(mof.data(), mof.size(), sourceName);
        const auto root =
            peg::parse_tree::parse<mof::File, grammar::Node, mof::Selected, peg::nothing, mof::Control>(input);
        MofBuilder builder(schema, [&](const std::string& file) { readOnce(directory / file); });
        builder.build(*root);
    } catch (const peg::parse_error& error) {
        throw LoadError(message(error));
    }
}

}  // namespace cimhost

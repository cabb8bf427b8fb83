#include "framework/NodeTree.h"

#include <algorithm>
#include <string_view>

namespace KO {

namespace {

constexpr std::string_view hexDigits = "0123456789ABCDEF";

bool isPlain(char byte) {
    return (byte >= 'A' && byte <= 'Z') || (byte >= 'a' && byte <= 'z') || (byte >= '0' && byte <= ':') ||
           byte == '.' || byte == '/' || byte == '-';
}

}  // namespace

void NodeTree::put(Node node) {
    const auto place = std::find_if(allNodes.begin(), allNodes.end(),
                                    [&node](const Node& present) { return present.path == node.path; });
    if (place == allNodes.end()) {
        allNodes.push_back(std::move(node));
    } else {
        *place = std::move(node);
    }
}

std::string pathToText(const std::string& path) {
    std::string text;
    for (const char byte : path) {
        if (isPlain(byte)) {
            text += byte;
        } else {
            const auto number = static_cast<unsigned char>(byte);
            text += '%';
            text += hexDigits[number >> 4U];
            text += hexDigits[number & 15U];
        }
    }
    return text;
}

std::string textToPath(const std::string& text) {
    std::string path;
    for (std::size_t index = 0; index < text.size(); ++index) {
        if (text[index] != '%' || index + 2 >= text.size()) {
            path += text[index];
            continue;
        }
        const std::size_t high = hexDigits.find(text[index + 1]);
        const std::size_t low = hexDigits.find(text[index + 2]);
        if (high == std::string_view::npos || low == std::string_view::npos) {
            return text;
        }
        path += static_cast<char>(high * 16 + low);
        index += 2;
    }
    return pathToText(path) == text ? path : text;
}

}  // namespace KO

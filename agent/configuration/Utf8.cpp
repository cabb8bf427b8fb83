#include "configuration/Utf8.h"

namespace Agent {

namespace {

/** What a first byte announces. */
struct Form {
    std::size_t length;
    std::uint32_t least;  ///< the smallest code point that needs this length
    unsigned char mask;   ///< bits of the first byte that tell the form
    unsigned char value;  ///< and what they must be
};

constexpr Form forms[] = {{1, 0, 0x80, 0x00}, {2, 0x80, 0xE0, 0xC0}, {3, 0x800, 0xF0, 0xE0}, {4, 0x10000, 0xF8, 0xF0}};

const Form* formOf(unsigned char first) {
    for (const Form& form : forms) {
        if ((first & form.mask) == form.value) {
            return &form;
        }
    }
    return nullptr;
}

bool isCodePoint(std::uint32_t number) {
    return number <= 0x10FFFF && (number < 0xD800 || number > 0xDFFF);
}

}  // namespace

Utf8Character firstCharacter(std::string_view text) {
    const auto first = static_cast<unsigned char>(text.front());
    const Utf8Character broken{first, 1, false};
    const Form* form = formOf(first);
    if (form == nullptr || text.size() < form->length) {
        return broken;
    }
    std::uint32_t codePoint = first & static_cast<unsigned char>(~form->mask);
    for (std::size_t index = 1; index < form->length; ++index) {
        const auto byte = static_cast<unsigned char>(text[index]);
        if ((byte & 0xC0U) != 0x80U) {
            return broken;
        }
        codePoint = (codePoint << 6U) | (byte & 0x3FU);
    }
    if (codePoint < form->least || !isCodePoint(codePoint)) {
        return broken;
    }
    return {codePoint, form->length, true};
}

}  // namespace Agent

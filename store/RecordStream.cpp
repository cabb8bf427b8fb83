#include "RecordStream.h"

#include <algorithm>
#include <cctype>

namespace KO::LeaseWarrantyProvider {

namespace {

constexpr const char* emptyValue = "*";

/** Reads into a scratch value, since a failed extraction would overwrite a number with 0. */
template <class Value>
bool extractOrKeep(std::istream& stream, Value& value) {
    Value read{};
    if (!(stream >> read)) {
        return false;
    }
    value = read;
    return true;
}

std::string replaced(std::string text, char from, char to) {
    std::replace(text.begin(), text.end(), from, to);
    return text;
}

}  // namespace

bool extract(std::istream& stream, unsigned int& number) {
    if (std::isdigit((stream >> std::ws).peek()) == 0) {
        stream.setstate(std::ios::failbit);
    }
    return extractOrKeep(stream, number);
}

bool extract(std::istream& stream, bool& flag) {
    return extractOrKeep(stream, flag);
}

bool extract(std::istream& stream, std::string& word) {
    return extractOrKeep(stream, word);
}

std::string escaped(const std::string& text, TextForm form) {
    switch (form) {
        case TextForm::date:
            return text.size() < dateLength ? defaultDate : text;
        case TextForm::value:
            if (text.size() <= 1) {
                return emptyValue;
            }
            break;
        case TextForm::identifier:
            break;
    }
    return replaced(text, ' ', '_');
}

std::string unescaped(const std::string& line, TextForm form) {
    if (form == TextForm::date) {
        return line;
    }
    if (form == TextForm::value && line == emptyValue) {
        return {};
    }
    return replaced(line, '_', ' ');
}

void endLine(std::ostream& stream) {
    stream << '\n' << std::flush;
}

}  // namespace KO::LeaseWarrantyProvider

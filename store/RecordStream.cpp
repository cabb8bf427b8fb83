#include "RecordStream.h"

#include <algorithm>
#include <iterator>

#include "cim/DateTime.h"

namespace KO::LeaseWarrantyProvider {

namespace {

constexpr const char* emptyValue = "*";

/** Reads into a temporary, since a failed extraction sets a number to 0. */
template <class Value>
bool extractOrKeep(std::istream& stream, Value& value) {
    Value read{};
    if (!(stream >> read)) {
        return false;
    }
    value = read;
    return true;
}

}  // namespace

bool extract(std::istream& stream, unsigned int& number) {
    // Stream extraction would convert a negative number by wrapping around.
    if ((stream >> std::ws).peek() == '-') {
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

void writeEscaped(std::ostream& stream, const std::string& text, TextForm form) {
    if (form == TextForm::date && text.size() < cim::noDate.size()) {
        stream << cim::noDate;
        return;
    }
    if (form == TextForm::value && text.size() <= 1) {
        stream << emptyValue;
        return;
    }
    const char blank = form == TextForm::date ? ' ' : '_';
    const std::ostream::sentry ready(stream);
    using Target = std::ostreambuf_iterator<char>;
    if (ready && std::replace_copy(text.begin(), text.end(), Target(stream), ' ', blank).failed()) {
        stream.setstate(std::ios::badbit);
    }
}

std::string unescaped(const std::string& line, TextForm form) {
    if (form == TextForm::date) {
        return line;
    }
    if (form == TextForm::value && line == emptyValue) {
        return {};
    }
    std::string text = line;
    std::replace(text.begin(), text.end(), '_', ' ');
    return text;
}

void endLine(std::ostream& stream) {
    stream << '\n' << std::flush;
}

}  // namespace KO::LeaseWarrantyProvider

#pragma once

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

/** Record files read and written with no more than the format asks for: streams, escapes, a flush a line. */
namespace bench {

constexpr const char* noDateInFile = "00000000000000.000000-000";

inline std::string replaced(std::string text, char from, char to) {
    std::replace(text.begin(), text.end(), from, to);
    return text;
}

/** Writes the fields of a row, one a line, each line flushed, as the provider does. */
class FieldWriter {
public:
    explicit FieldWriter(std::ofstream& itsStream) : stream(itsStream) {}

    void identifier(const std::string& text) { line(replaced(text, ' ', '_')); }
    void value(const std::string& text) { line(text.size() <= 1 ? "*" : replaced(text, ' ', '_')); }
    void date(const std::string& text) { line(text.empty() ? noDateInFile : text); }
    void number(unsigned int number) { line(number); }
    void flag(bool flag) { line(flag ? '1' : '0'); }

private:
    template <class Value>
    void line(const Value& value) {
        stream << value << '\n' << std::flush;
    }

    std::ofstream& stream;
};

/** Reads what FieldWriter writes. */
class FieldReader {
public:
    explicit FieldReader(std::ifstream& itsStream) : stream(itsStream) {}

    void identifier(std::string& text) {
        stream >> text;
        std::replace(text.begin(), text.end(), '_', ' ');
    }
    void value(std::string& text) {
        identifier(text);
        if (text == "*") {
            text.clear();
        }
    }
    void date(std::string& text) {
        stream >> text;
        if (text == noDateInFile) {
            text.clear();
        }
    }
    void number(unsigned int& number) { stream >> number; }
    void flag(bool& flag) { stream >> flag; }

private:
    std::ifstream& stream;
};

template <class Row>
void writeRows(const std::filesystem::path& file, const std::vector<Row>& rows) {
    std::ofstream stream(file, std::ios::trunc);
    stream << rows.size() << '\n' << std::flush;
    FieldWriter writer(stream);
    for (const Row& row : rows) {
        Row::eachField(row, writer);
    }
}

template <class Row>
std::vector<Row> readRows(const std::filesystem::path& file) {
    std::ifstream stream(file);
    std::size_t count = 0;
    stream >> count;
    std::vector<Row> rows(count);
    FieldReader reader(stream);
    for (Row& row : rows) {
        Row::eachField(row, reader);
    }
    return rows;
}

}  // namespace bench

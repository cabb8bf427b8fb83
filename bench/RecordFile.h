#pragma once

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <string>
#include <string_view>
#include <vector>

#include "cim/DateTime.h"

/** Reads and writes record files with only the work that the format requires: streams, escapes, a flush per line. */
namespace bench {

inline std::string replaced(std::string value, char from, char to) {
    std::replace(value.begin(), value.end(), from, to);
    return value;
}

/** Writes each field of a row to a line and flushes it, as the provider does. */
class FieldWriter {
public:
    explicit FieldWriter(std::ofstream& itsStream) : stream(itsStream) {}

    void identifier(const std::string& id) { line(replaced(id, ' ', '_')); }
    void value(const std::string& value) { line(value.size() <= 1 ? "*" : replaced(value, ' ', '_')); }
    void date(const std::string& date) { line(date.empty() ? cim::noDate : std::string_view(date)); }
    void number(unsigned int number) { line(number); }
    void flag(bool flag) { line(flag ? '1' : '0'); }

private:
    template <class Value>
    void line(const Value& field) {
        stream << field << '\n' << std::flush;
    }

    std::ofstream& stream;
};

/** Reads the format of FieldWriter. */
class FieldReader {
public:
    explicit FieldReader(std::ifstream& itsStream) : stream(itsStream) {}

    void identifier(std::string& id) {
        stream >> id;
        std::replace(id.begin(), id.end(), '_', ' ');
    }
    void value(std::string& value) {
        identifier(value);
        if (value == "*") {
            value.clear();
        }
    }
    void date(std::string& date) {
        stream >> date;
        if (date == cim::noDate) {
            date.clear();
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

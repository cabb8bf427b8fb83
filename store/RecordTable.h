#pragma once

#include <cstddef>
#include <cstdio>
#include <fstream>
#include <locale>
#include <new>
#include <string>
#include <vector>

#include "RecordStream.h"

namespace KO::LeaseWarrantyProvider {

/** Capacity that is reserved before the file is read. */
constexpr std::size_t reservedRecords = 10;

/**
 * Returns whether `count` objects of `size` bytes fit into physical memory; true if its size is unknown. Ignores the
 * limits of the process.
 */
bool memoryCanHold(std::size_t count, std::size_t size);

/** Throws std::bad_alloc if the objects do not fit into physical memory. */
void requireMemory(std::size_t count, std::size_t size);

/** Returns the path of a file in the agent's data directory. */
std::string dataFilePath(const char* fileName);

/** Opens a record file in the classic locale, since the global locale may group digits. */
template <class Stream>
void openRecordFile(Stream& stream, const std::string& path, std::ios::openmode mode) {
    stream.imbue(std::locale::classic());
    stream.open(path, mode);
}

/**
 * Implements loadRecords. If the file declares more than reservedRecords records, reserves memory for `reserve` times
 * that number.
 */
template <class Unit, class Fields>
void readRecords(const std::string& path, unsigned int& count, std::vector<Unit>& table, const Fields& fields,
                 std::size_t reserve) {
    table.reserve(reservedRecords);
    std::ifstream stream;
    openRecordFile(stream, path, std::ios::in);
    if (!stream.good()) {
        return;
    }
    unsigned int declared = 0;
    extract(stream, declared);
    if (declared == 0) {
        return;
    }
    requireMemory(declared, sizeof(Unit));
    if (declared > reservedRecords) {
        table.reserve(reserve * declared);
    }
    stream.exceptions(std::ios::badbit);
    Unit scratch;
    bool isAtEnd = false;
    for (unsigned int record = 0; record < declared; ++record) {
        stream >> scratch;
        if (!isAtEnd && !stream.good()) {  // all further records are copies of this one
            isAtEnd = true;
            requireMemory(declared - record, sizeof(Unit) + bytesOfStrings(scratch, fields));
        }
        table.push_back(scratch);
    }
    count = declared;
}

/**
 * Reads a record file into an empty table.
 *
 * Trusts the count in the first line: if the file is shorter, creates the declared number of records, and a missing
 * field keeps the value of the preceding record. A count that is not a number makes the file unreadable. Reserves
 * memory for twice the number of records or, if that fails, for the number of records.
 *
 * @param count receives the number of records; unchanged, like the table, if the file is unreadable
 * @param fields the table of RecordField of the records
 * @throws std::bad_alloc if the declared records, or the copies of the last one read, do not fit into memory or an
 *         allocation fails
 * @throws std::ios_base::failure if the file cannot be read to its end. In both cases the table may contain some
 *         records.
 */
template <class Unit, class Fields>
void loadRecords(const std::string& path, unsigned int& count, std::vector<Unit>& table, const Fields& fields) {
    try {
        readRecords(path, count, table, fields, 2);
    } catch (const std::bad_alloc&) {
        std::vector<Unit>().swap(table);
        readRecords(path, count, table, fields, 1);
    }
}

/**
 * Rewrites a record file in place: the count, then each record in use. If the process is out of memory, fails before it
 * opens the file.
 * @return false if the file cannot be opened for writing; write errors are ignored
 */
template <class Unit>
bool writeRecords(const std::string& path, unsigned int count, const std::vector<Unit>& table) {
    char buffer[BUFSIZ];  // opening truncates the file; do not allocate after that
    std::ofstream stream;
    stream.rdbuf()->pubsetbuf(buffer, sizeof buffer);
    openRecordFile(stream, path, std::ios::out | std::ios::trunc);
    if (!stream.good()) {
        return false;
    }
    stream << count;
    endLine(stream);
    for (const Unit& unit : table) {
        if (unit.inUse) {
            stream << unit;
        }
    }
    return true;
}

}  // namespace KO::LeaseWarrantyProvider

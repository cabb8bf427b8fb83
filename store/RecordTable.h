#pragma once

#include "RecordStream.h"

#include <cstddef>
#include <cstdio>
#include <fstream>
#include <locale>
#include <new>
#include <string>
#include <vector>

namespace KO::LeaseWarrantyProvider {

/** Room made for records before any is known. */
constexpr std::size_t reservedRecords = 10;

/**
 * Whether a number of objects of a size fits into the physical memory of this machine; true when that is unknown.
 * Limits of the process are not considered.
 */
bool memoryCanHold(std::size_t count, std::size_t size);

/** Throws std::bad_alloc when memory cannot hold the objects. */
void requireMemory(std::size_t count, std::size_t size);

/** The path of a file of the agent's data directory. */
std::string dataFilePath(const char* fileName);

/** Opens a record file in the classic locale: the process's own locale may group digits. */
template <class Stream>
void openRecordFile(Stream& stream, const std::string& path, std::ios::openmode mode) {
    stream.imbue(std::locale::classic());
    stream.open(path, mode);
}

/** loadRecords, with memory reserved for a multiple of the declared records if they are more than reservedRecords. */
template <class Unit>
void readRecords(const std::string& path, unsigned int& count, std::vector<Unit>& table, std::size_t reserve) {
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
        if (!isAtEnd && !stream.good()) {  // from here on all are copies
            isAtEnd = true;
            requireMemory(declared - record, sizeof(Unit) + bytesOfTexts(scratch));
        }
        table.push_back(scratch);
    }
    count = declared;
}

/**
 * Reads a record file into an empty table.
 *
 * The count at the head is believed: a shorter file yields the declared number of records, a missing
 * field keeping the value of the record before. A count that is no number makes the file unreadable. Memory is
 * reserved for twice the records, and only for the records where that is refused.
 *
 * @param count receives the number of records; unchanged, like the table, for an unreadable file
 * @throws std::bad_alloc when memory cannot hold the declared records, or the copies of the last one among them, or
 *         when the process is refused memory; std::ios_base::failure when the file cannot be read to its end. The
 *         table may then hold some records
 */
template <class Unit>
void loadRecords(const std::string& path, unsigned int& count, std::vector<Unit>& table) {
    try {
        readRecords(path, count, table, 2);
    } catch (const std::bad_alloc&) {
        std::vector<Unit>().swap(table);
        readRecords(path, count, table, 1);
    }
}

/**
 * Rewrites a record file in place: the count, then each record in use.
 * Lack of memory shows before the file is touched.
 * @return false when the file cannot be opened for writing; a write that fails is not noticed
 */
template <class Unit>
bool writeRecords(const std::string& path, unsigned int count, const std::vector<Unit>& table) {
    char buffer[BUFSIZ];  // opening empties the file: from then on nothing may be allocated
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

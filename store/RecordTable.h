#pragma once

#include "RecordStream.h"

#include <cstddef>
#include <cstdio>
#include <fstream>
#include <locale>
#include <string>
#include <vector>

namespace KO::LeaseWarrantyProvider {

/** Room made for records before any is known. */
constexpr std::size_t reservedRecords = 10;

/**
 * Whether this machine's physical memory could hold so many objects of a size at all; true when that
 * cannot be found out. What the process may use of it is not looked at.
 */
bool memoryCanHold(std::size_t count, std::size_t size);

/** The path of a file of the agent's data directory. */
std::string dataFilePath(const char* fileName);

/** Opens a record file in the classic locale: the process's own locale may group digits. */
template <class Stream>
void openRecordFile(Stream& stream, const std::string& path, std::ios::openmode mode) {
    stream.imbue(std::locale::classic());
    stream.open(path, mode);
}

/**
 * Reads a record file into an empty table.
 *
 * The count at the head is believed: a shorter file yields the declared number of records, a missing
 * field keeping the value of the record before. Only a count whose records, or whose copies of the last one, the
 * machine's memory cannot hold, or that is no number, makes the file unreadable.
 *
 * @param count receives the number of records; left as it was, like the table, for an unreadable file
 * @throws std::bad_alloc when the process is refused the memory, std::ios_base::failure when the file cannot be read to
 *         its end; the table may then hold some records
 */
template <class Unit>
void loadRecords(const std::string& path, unsigned int& count, std::vector<Unit>& table) {
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
    const std::size_t room = std::size_t{2} * declared;
    if (declared > reservedRecords) {
        if (!memoryCanHold(room, sizeof(Unit))) {
            return;
        }
        table.reserve(room);
    }
    stream.exceptions(std::ios::badbit);
    Unit scratch;
    bool isAtEnd = false;
    for (unsigned int record = 0; record < declared; ++record) {
        stream >> scratch;
        if (!isAtEnd && !stream.good()) {  // from here on all are copies
            isAtEnd = true;
            if (!memoryCanHold(declared - record, sizeof(Unit) + bytesOfTexts(scratch))) {
                std::vector<Unit>().swap(table);
                table.reserve(reservedRecords);
                return;
            }
        }
        table.push_back(scratch);
    }
    count = declared;
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

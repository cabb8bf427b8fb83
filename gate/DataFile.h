#pragma once

#include "Schema.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace gate {

/** What a file of records held, and when it had been written last. */
struct FileState {
    std::string text;           ///< nothing where it cannot be read, and for a property file
    std::int64_t modified = 0;  ///< some count of time

    bool operator==(const FileState& other) const { return modified == other.modified && text == other.text; }
};

/**
 * The file in which a class's instances are kept. The provider writes it and tells nobody when it cannot: the gate
 * looks at it before a change and after.
 */
struct DataFile {
    const char* className;
    const char* fileName;
    std::size_t linesPerRecord;  ///< of a file of records; 0 for a property file

    /** Whether instances can be created and deleted. */
    bool keepsRecords() const { return linesPerRecord != 0; }

    /**
     * CMPI_RC_ERR_FAILED with the reason, when the file could not be written now: the provider empties a file of
     * records before it sees that there is no room for it.
     * @param growth how many bytes the file will need in addition, at most
     */
    void requireWritable(std::size_t growth) const;

    FileState state() const;

    /**
     * How many records with that identifier are in the text of a file, 0 for a property file. CMPI_RC_ERR_FAILED when
     * the text is not whole.
     */
    std::size_t recordsIn(std::string_view text, const std::string& identifier) const;

    /** Whether the text of a file of records has the number of lines that its head tells. */
    bool isWhole(std::string_view text) const;

    /** recordsIn() of the file as it is, but none for one that is not whole. */
    std::optional<std::size_t> recordsIfWhole(const std::string& identifier) const;
};

/** The file of a class; null for a class whose instances are not kept in one and cannot be changed. */
const DataFile* dataFileOf(const Class& kept);

}  // namespace gate

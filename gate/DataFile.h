#pragma once

#include "Schema.h"

#include <cstddef>
#include <optional>
#include <string>

namespace gate {

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

    /**
     * How many records the file has with that identifier, 0 for a property file. CMPI_RC_ERR_FAILED when the file is
     * not whole, that is, when it has not the number of lines that its head tells.
     */
    std::size_t recordsOf(const std::string& identifier) const;

    /** All that the file holds; nothing where it cannot be read. */
    std::string text() const;

    /** recordsOf(), but none for a file that is not whole. */
    std::optional<std::size_t> recordsIfWhole(const std::string& identifier) const;
};

/** The file of a class; null for a class whose instances are not kept in one and cannot be changed. */
const DataFile* dataFileOf(const Class& kept);

}  // namespace gate

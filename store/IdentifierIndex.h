#pragma once

#include <cstddef>
#include <functional>
#include <limits>
#include <new>
#include <string>
#include <vector>

namespace KO::LeaseWarrantyProvider {

/**
 * Finds the records of a table by identifier in constant time on average: a hash table whose chains are in table order.
 * Needs two to four words per record. An identifier may occur more than once. Deleted records are removed from their
 * chain when another record is appended to it.
 */
template <class Unit>
class IdentifierIndex {
public:
    static constexpr std::size_t none = std::numeric_limits<std::size_t>::max();

    /** Adds the records that were appended to the table. If the process is out of memory, the index is incomplete. */
    void update(const std::vector<Unit>& table) noexcept;

    /**
     * Returns the position of the first record in use, at or after `from`, whose identifier is equal byte for byte;
     * `none` if there is none. Searches the table itself if the index is incomplete.
     */
    std::size_t find(const std::vector<Unit>& table, const std::string& identifier, std::size_t from) const;

private:
    void append(const std::vector<Unit>& table);
    void rebuild(const std::vector<Unit>& table);
    std::size_t chainOf(const std::string& identifier) const {
        return std::hash<std::string>()(identifier) % heads.size();
    }

    std::vector<std::size_t> heads{};  ///< first position of each chain
    std::vector<std::size_t> links{};  ///< per record, the next position in its chain
};

template <class Unit>
void IdentifierIndex<Unit>::update(const std::vector<Unit>& table) noexcept {
    try {
        if (links.size() + 1 == table.size() && table.size() <= heads.size()) {
            append(table);
        } else if (links.size() != table.size()) {
            rebuild(table);
        }
    } catch (const std::bad_alloc&) {
        return;
    }
}

template <class Unit>
void IdentifierIndex<Unit>::append(const std::vector<Unit>& table) {
    const std::size_t position = links.size();
    links.push_back(none);
    std::size_t* end = &heads[chainOf(table[position].InstanceID)];
    while (*end != none) {
        std::size_t& next = links[*end];
        if (table[*end].inUse) {
            end = &next;
        } else {
            *end = next;
        }
    }
    *end = position;
}

/** Reserves space for twice the records. Starts with the last record, so that each becomes the head of its chain. */
template <class Unit>
void IdentifierIndex<Unit>::rebuild(const std::vector<Unit>& table) {
    links.clear();
    heads.assign(2 * table.size() + 1, none);
    links.reserve(heads.size());
    links.resize(table.size());
    for (std::size_t position = table.size(); position-- > 0;) {
        if (!table[position].inUse) {
            continue;
        }
        std::size_t& head = heads[chainOf(table[position].InstanceID)];
        links[position] = head;
        head = position;
    }
}

template <class Unit>
std::size_t IdentifierIndex<Unit>::find(const std::vector<Unit>& table, const std::string& identifier,
                                        std::size_t from) const {
    const auto matches = [&](std::size_t position) {
        return table[position].inUse && table[position].InstanceID == identifier;
    };
    std::size_t position = from;
    if (links.size() != table.size()) {
        while (position < table.size() && !matches(position)) {
            ++position;
        }
        return position < table.size() ? position : none;
    }
    // If the preceding record has the same identifier and is still in use, the search continues at its link in the
    // chain instead of at the head.
    const bool continues = from > 0 && from <= table.size() && matches(from - 1);
    position = heads.empty() ? none : continues ? links[from - 1] : heads[chainOf(identifier)];
    while (position != none && (position < from || !matches(position))) {
        position = links[position];
    }
    return position;
}

}  // namespace KO::LeaseWarrantyProvider

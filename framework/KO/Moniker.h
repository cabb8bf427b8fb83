#pragma once

#include <memory>
#include <string>

#include "Export.h"

namespace KO {

/**
 * The identity of an object, independent of CIM object paths and managed elements: an ordered list of key names and
 * values, both strings, with a selection. A copy is independent and has the same selection.
 */
class KO_EXPORT Moniker {
public:
    /** Creates a moniker without keys and without a selection. */
    Moniker();
    Moniker(const Moniker& other);
    Moniker& operator=(const Moniker& other);
    ~Moniker();

    /** Returns the number of keys. */
    unsigned int getKeyCount() const;

    /**
     * Selects the key at an index, counted from 0.
     * @return false if there is no such key; the selection is then unchanged
     */
    bool selectKey(unsigned int index);

    /** Reads the selected key's name. @return false, with the name unchanged, if no key is selected */
    bool getName(std::string& name) const;

    /** Reads the selected key's value. @return false, with the value unchanged, if no key is selected */
    bool getValue(std::string& value) const;

    /** Appends a key and keeps the selection. */
    void addKey(std::string name, const std::string& value);

private:
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO

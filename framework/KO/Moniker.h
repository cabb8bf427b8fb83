#pragma once

#include "Export.h"

#include <memory>
#include <string>

namespace KO {

/**
 * An ordered list of key names and values, both text, with a selection: an object's identity in a
 * form that neither CIM object paths nor managed elements own. Copies are independent; a copy
 * starts with its original's selection.
 */
class KO_EXPORT Moniker {
public:
    /** An empty moniker with nothing selected. */
    Moniker();
    Moniker(const Moniker& other);
    Moniker& operator=(const Moniker& other);
    ~Moniker();

    /** How many keys there are. */
    unsigned int getKeyCount() const;

    /**
     * Selects the key at an index, counted from 0.
     * @return false when there is no such key; the selection is then unchanged
     */
    bool selectKey(unsigned int index);

    /** Reads the selected key's name. @return false, name untouched, when no key is selected */
    bool getName(std::string& name) const;

    /** Reads the selected key's value. @return false, value untouched, when no key is selected */
    bool getValue(std::string& value) const;

    /** Appends a key. The selection stays where it was. */
    void addKey(std::string name, const std::string& value);

private:
    struct Implementation;
    std::unique_ptr<Implementation> implementation;
};

}  // namespace KO

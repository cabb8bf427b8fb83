#pragma once

#include "ElementAdapter.h"
#include "PropertyTable.h"

#include <cmpidt.h>

#include <string>

namespace KO::LeaseWarrantyProvider {

/** One key of a class: its name, and how its value is read into a text. Without a value the text stays as it was. */
template <class Element>
struct KeyRow {
    const char* name;
    void (*read)(const Element& element, std::string& text);
};

/** The row of a key whose value a getter gives. */
template <class Element, auto getter>
constexpr KeyRow<Element> key(const char* name) {
    return {name, [](const Element& element, std::string& text) {
                PropertyTableDetail::Traits<getter>::get(element, getter, text);
            }};
}

/** A key that narrows a request, and the filter of the element that it becomes. */
template <class Element>
struct KeyFilter {
    const char* name;
    typename Element::FilterType type;
};

/**
 * The adapter of a CIM class that describes an installed product, identified by keys such as name,
 * vendor and version: the design that CMPIOstrelAgent and CMPIAssetIDDetail share. It stands where
 * its element stands.
 *
 * Traits gives:
 *   Element              the managed element
 *   className            the CIM class
 *   constructor, destructor   their names in the log
 *   traceSource          trace source
 *   keys                 table of KeyRow, in the order in which a path carries them
 *   filters              table of KeyFilter, in the order in which a path's keys are looked at
 *   properties           table of PropertyRow, in the order in which an instance is filled
 *   modify(element, instance)   of a class that can be modified
 */
template <class Traits>
class ProductAdapter : public ElementAdapter<Traits> {
public:
    using ElementAdapter<Traits>::ElementAdapter;

    /** What the path's keys select, or all if it has none. May throw what the element's filters throw. */
    ProductAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext, const CMPIObjectPath* path);

    /** Makes filters of the path's keys. May throw what the element's filters throw. */
    void setObjectPath(const CMPIObjectPath* path);

    /**
     * Path of the current instance; null when it cannot be made. A key without a value has that of the key
     * before it.
     */
    CMPIObjectPath* getObjectPath();

    /** The current instance; null when it cannot be made. */
    CMPIInstance* getCMPIInstance(const char** properties);

    /** Writes the instance's modifiable properties; a null instance changes nothing. */
    template <class ModifiablePolicy = Traits>
    void modifyCMPIInstance(const CMPIInstance* referenceInstance, const char** properties);

private:
    using ElementAdapter<Traits>::broker;
    using ElementAdapter<Traits>::nameSpace;
    using ElementAdapter<Traits>::element;

    static void narrow(typename Traits::Element& element, const CMPIObjectPath* path);
};

}  // namespace KO::LeaseWarrantyProvider

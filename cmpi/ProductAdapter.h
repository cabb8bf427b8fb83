#pragma once

#include <cmpidt.h>

#include <string>

#include "ElementAdapter.h"
#include "PropertyTable.h"

namespace KO::LeaseWarrantyProvider {

/** A key of a class: its name and its getter. The getter leaves the string unchanged if there is no value. */
template <class Element>
struct KeyRow {
    const char* name;
    void (*read)(const Element& element, std::string& text);
};

/** Returns the row of a key that a getter reads. */
template <class Element, auto getter>
constexpr KeyRow<Element> key(const char* name) {
    return {name, [](const Element& element, std::string& text) {
                PropertyTableDetail::Traits<getter>::get(element, getter, text);
            }};
}

/** A key that selects instances, and the element's filter for it. */
template <class Element>
struct KeyFilter {
    const char* name;
    typename Element::FilterType type;
};

/**
 * Adapter of a CIM class that describes an installed product, with keys such as name, vendor and version. Base of
 * CMPIOstrelAgent and CMPIAssetIDDetail.
 *
 * Traits defines:
 *   Element              the managed element
 *   className            the CIM class
 *   constructor, destructor   their names in the log
 *   traceSource          trace source
 *   keys                 table of KeyRow, in the order of a path's keys
 *   filters              table of KeyFilter, in the order in which a path's keys are compared
 *   properties           table of PropertyRow, in the order in which instances are filled
 *   modify(element, instance)   only for a class that can be modified
 */
template <class Traits>
class ProductAdapter : public ElementAdapter<ProductAdapter<Traits>, Traits> {
public:
    /** A path selects the instances that match its keys, or all instances if it has no keys. */
    using ElementAdapter<ProductAdapter, Traits>::ElementAdapter;

    /**
     * Returns the path of the current instance; null if the broker cannot create it. A key without a value repeats the
     * value of the preceding key.
     */
    CMPIObjectPath* getObjectPath();

    /** Writes the instance's modifiable properties. A null instance changes nothing. */
    template <class ModifiablePolicy = Traits>
    void modifyCMPIInstance(const CMPIInstance* referenceInstance, const char** properties);

private:
    friend class ElementAdapter<ProductAdapter, Traits>;
    using ElementAdapter<ProductAdapter, Traits>::broker;
    using ElementAdapter<ProductAdapter, Traits>::nameSpace;
    using ElementAdapter<ProductAdapter, Traits>::element;

    static void narrow(typename Traits::Element& element, const CMPIObjectPath* path);
};

}  // namespace KO::LeaseWarrantyProvider

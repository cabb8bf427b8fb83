#pragma once

#include "ElementAdapter.h"

#include <cmpidt.h>

namespace KO::LeaseWarrantyProvider {

/**
 * The adapter of a CIM class whose instances are records with the one key "InstanceID": the design
 * that CMPILease and CMPIWarranty share. It stands where its element stands.
 *
 * Traits gives:
 *   Element                      the managed element
 *   className                    the CIM class
 *   constructor, destructor      their names in the log
 *   tracesCreation               whether a creation's result is traced
 *   modifyPropertiesLabel        label of the property list in the trace of a modification
 *   traceSource, properties      trace source and table of PropertyRow of the class
 */
template <class Traits>
class RecordAdapter : public ElementAdapter<Traits> {
public:
    /** For creation, and as the end of an association: all records. */
    using ElementAdapter<Traits>::ElementAdapter;

    /**
     * For every other request: the record that the path's key names, or all if it has no key that can be
     * read. When the adapter ends and anything was changed, the data file is written back; that may throw.
     */
    RecordAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext, const CMPIObjectPath* path);

    /** Narrows the element to the record that the path's key names. A key that cannot be read narrows nothing. */
    void setObjectPath(const CMPIObjectPath* path);

    /** Path of the current record; without key when the adapter stands on none, null when it cannot be made. */
    CMPIObjectPath* getObjectPath();

    /** Instance of the current record with every property that is present; null when it cannot be made. */
    CMPIInstance* getCMPIInstance(const char** properties);

    /**
     * Makes a record with the path's key and default values, and stands on it. Throws what the element's
     * creation throws, as when the key is taken.
     * @return its instance; null when the path has no key that is text, and nothing was made, or when the
     *     instance of the new record cannot be made
     */
    CMPIInstance* createCMPIInstance(const CMPIObjectPath* desiredObjectPath);

    /**
     * Writes the instance's modifiable properties into the current record; a null instance changes nothing.
     * Throws what the element's setters throw, as when no record is current.
     */
    void modifyCMPIInstance(const CMPIInstance* referenceInstance, const char** properties);

    /** Removes the current record. Throws what the element's removal throws, as when no key named a record. */
    void deleteCMPIInstance();

private:
    using ElementAdapter<Traits>::broker;
    using ElementAdapter<Traits>::nameSpace;
    using ElementAdapter<Traits>::element;

    static void narrow(typename Traits::Element& element, const CMPIObjectPath* path);
};

}  // namespace KO::LeaseWarrantyProvider

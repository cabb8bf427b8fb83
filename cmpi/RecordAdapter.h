#pragma once

#include <cmpidt.h>

#include "ElementAdapter.h"

namespace KO::LeaseWarrantyProvider {

/**
 * Adapter of a CIM class whose instances are records with the single key "InstanceID". Base of CMPILease and
 * CMPIWarranty.
 *
 * Traits defines:
 *   Element                      the managed element
 *   className                    the CIM class
 *   constructor, destructor      their names in the log
 *   tracesCreation               whether a successful creation is traced
 *   modifyPropertiesLabel        label of the property list in the trace of a modification
 *   traceSource, properties      trace source and table of PropertyRow of the class
 */
template <class Traits>
class RecordAdapter : public ElementAdapter<RecordAdapter<Traits>, Traits> {
public:
    /**
     * The constructor with a namespace selects all records, for CreateInstance and for the ends of associations. The
     * constructor with a path selects the record with the path's key, or all records if the path has no readable key.
     * The destructor writes the data file if anything changed, and may throw.
     */
    using ElementAdapter<RecordAdapter, Traits>::ElementAdapter;

    /** The path of the current record; without a key if there is no record; null if the broker cannot create a path. */
    CMPIObjectPath* getObjectPath();

    /**
     * Creates a record with the path's key and default values, and makes it current. Throws the exceptions of the
     * element's create(), for example if the key exists.
     * @return the new instance; null if the path has no string key, in which case no record is created, or if the
     *         broker cannot create the instance
     */
    CMPIInstance* createCMPIInstance(const CMPIObjectPath* desiredObjectPath);

    /**
     * Writes the instance's modifiable properties to the current record. A null instance changes nothing. Throws the
     * exceptions of the element's setters, for example if there is no current record.
     */
    void modifyCMPIInstance(const CMPIInstance* referenceInstance, const char** properties);

    /**
     * Removes the current record. Throws the exceptions of the element's remove(), for example if the path has no
     * readable key.
     */
    void deleteCMPIInstance();

private:
    friend class ElementAdapter<RecordAdapter, Traits>;
    using ElementAdapter<RecordAdapter, Traits>::broker;
    using ElementAdapter<RecordAdapter, Traits>::nameSpace;
    using ElementAdapter<RecordAdapter, Traits>::element;

    static void narrow(typename Traits::Element& element, const CMPIObjectPath* path);
};

}  // namespace KO::LeaseWarrantyProvider

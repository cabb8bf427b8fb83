#pragma once

#include "CMPIComputerSystem.h"

#include <cmpidt.h>

#include <string>

namespace KO::LeaseWarrantyProvider {

/**
 * The adapter of an association between a computer system, its "Antecedent", and a lease or warranty,
 * its "Dependent": the design that CMPILeaseSetting and CMPIWarrantySetting share.
 *
 * The class of the request's path decides what it is. Of the association: a list of association
 * instances. Of the computer system: the computer's lease or warranty, or all of them for a path without
 * keys. Of the lease or warranty: all computers that the object manager knows but the last, whichever of
 * them it belongs to. With a path of any other class it yields nothing.
 *
 * Traits gives:
 *   Element, Setting                    adapter of the lease or warranty, and element of the association
 *   associationClass, elementClass      the CIM classes
 *   associationClassId, elementClassId  their class ids
 *   constructor, destructor, locate     names in the log; locateElement is traced as `locate`
 *   traceSource                         trace source
 *   elementMoniker(setting, moniker)    the setting's way from computer to lease or warranty
 */
template <class Traits>
class SettingAdapter {
public:
    /** Positioned by the path's class. May throw what its parts throw, as when there is no computer system. */
    SettingAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext, const CMPIObjectPath* path);
    ~SettingAdapter() noexcept(false);
    SettingAdapter(const SettingAdapter&) = delete;
    SettingAdapter& operator=(const SettingAdapter&) = delete;

    /**
     * Whether the walk goes on. As the computer end looks one ahead, a walk over computers leaves out
     * the last one. An association list pairs the first computer with every lease or warranty; these then
     * stay at their end, so that each further computer but the last follows with a "Dependent" without
     * keys, and so does the first where there is no lease or warranty and it is not the last.
     */
    operator bool();

    /** Moves on: in an association list to the next lease or warranty, after the last to the next computer. */
    void operator++();

    /** Path of the current association instance; null when it cannot be made. */
    CMPIObjectPath* getObjectPath();

    /** The current association instance; null when it cannot be made. */
    CMPIInstance* getCMPIInstance(const char** properties);

    /** Path of the current far end; null when there is none. */
    CMPIObjectPath* getAssociatorNames();

    /** The current far end; null when there is none. */
    CMPIInstance* getAssociator(const char** properties);

    /** Path of the computer of a lease or warranty; without keys if that path has none. */
    CMPIObjectPath* locateComputer(const CMPIObjectPath* elementPath);

protected:
    /** Path that a computer's lease or warranty would have; without keys if the computer's path has none. */
    CMPIObjectPath* locateElement(const CMPIObjectPath* computerPath);

private:
    enum class Mode { computerSource, elementSource, associationList, inert };

    Mode mode() const;
    void position(const CMPIObjectPath* path);

    template <class Translate>
    CMPIObjectPath* locate(const char* className, const CMPIObjectPath* source, Translate translate);

    const CMPIBroker* broker;
    const CMPIContext* context;
    std::string nameSpace;
    unsigned int requestedClassId = 0;
    CMPILAWComputerSystem computer;
    typename Traits::Element element;
    typename Traits::Setting setting{};
};

}  // namespace KO::LeaseWarrantyProvider

#pragma once

#include <cmpidt.h>

#include <string>

#include "CMPIComputerSystem.h"

namespace KO::LeaseWarrantyProvider {

/**
 * Adapter of an association between a computer system ("Antecedent") and a lease or warranty ("Dependent"). Base of
 * CMPILeaseSetting and CMPIWarrantySetting.
 *
 * The class of the request's path selects the result:
 * - the association: association instances
 * - the computer system: its lease or warranty, or all leases or warranties if the path has no keys
 * - the lease or warranty: every computer of the object manager except the last, whether or not the lease or warranty
 *   belongs to it
 * - any other class: nothing
 *
 * Traits defines:
 *   Element, Setting                    adapter of the lease or warranty, and element of the association
 *   associationClass, elementClass      the CIM classes
 *   associationClassId, elementClassId  their class ids
 *   constructor, destructor, locate     names in the log; locateElement is traced as `locate`
 *   traceSource                         trace source
 *   elementMoniker(setting, moniker)    translates a computer's moniker to that of its lease or warranty
 */
template <class Traits>
class SettingAdapter {
public:
    /**
     * Selects the results by the path's class. Throws the exceptions of its members, for example if there is no
     * computer system.
     */
    SettingAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext, const CMPIObjectPath* path);
    ~SettingAdapter() noexcept(false);
    SettingAdapter(const SettingAdapter&) = delete;
    SettingAdapter& operator=(const SettingAdapter&) = delete;

    /**
     * Returns whether to continue the iteration. The computer adapter looks one instance ahead, so an iteration over
     * computers skips the last one. An association list pairs the first computer with every lease or warranty. It then
     * pairs each further computer except the last with a "Dependent" without keys. If there is no lease or warranty, it
     * also pairs the first computer with such a "Dependent", unless the first computer is also the last.
     */
    operator bool();

    /**
     * Moves to the next result. An association list moves to the next lease or warranty; after the last one, to the
     * next computer.
     */
    void operator++();

    /** Returns the path of the current association instance; null if the broker cannot create it. */
    CMPIObjectPath* getObjectPath();

    /** Returns the current association instance; null if the broker cannot create it. */
    CMPIInstance* getCMPIInstance(const char** properties);

    /** Returns the path of the current associated object; null if there is none. */
    CMPIObjectPath* getAssociatorNames();

    /** Returns the current associated instance; null if there is none. */
    CMPIInstance* getAssociator(const char** properties);

    /** Returns the path of the computer of a lease or warranty; without keys if the given path has none. */
    CMPIObjectPath* locateComputer(const CMPIObjectPath* elementPath);

protected:
    /**
     * Returns the path of a computer's lease or warranty, whether or not it exists; without keys if the computer's path
     * has none.
     */
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

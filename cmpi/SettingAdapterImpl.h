#pragma once

// Definitions of SettingAdapter. Included by the source file of each adapter and nowhere else, so that
// each adapter's code and trace buffers stand in its own unit.

#include "KO/ClassIds.h"
#include "KO/Moniker.h"
#include "KO/ProviderUtilities.h"
#include "SettingAdapter.h"
#include "Trace.h"

namespace KO::LeaseWarrantyProvider {

namespace {

constexpr const char* computerClass = "VELKO_ComputerSystem";
constexpr const char* computerRole = "Antecedent";
constexpr const char* elementRole = "Dependent";

}  // namespace

template <class Policy>
SettingAdapter<Policy>::SettingAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                       const CMPIObjectPath* path)
    : broker(requestBroker),
      context(requestContext),
      nameSpace(ProviderUtilities::getNamespace(path)),
      computer(broker, context, nameSpace),
      element(broker, context, nameSpace) {
    const Traced traced(at(Policy::unit, Level::error, Policy::constructor), label::broker, broker, label::context,
                        context, label::objectPath, path);
    requestedClassId = ProviderUtilities::getClassId(path);
    traceVariable(at(Policy::unit, Level::flow, Policy::constructor), "requestedClassId", requestedClassId);
    position(path);
}

template <class Policy>
SettingAdapter<Policy>::~SettingAdapter() noexcept(false) {
    traceMethod(at(Policy::unit, Level::flow, Policy::destructor));
}

template <class Policy>
typename SettingAdapter<Policy>::Mode SettingAdapter<Policy>::mode() const {
    switch (requestedClassId) {
        case ClassId::computerSystem:
            return Mode::computerSource;
        case Policy::elementClassId:
            return Mode::elementSource;
        case Policy::associationClassId:
            return Mode::associationList;
        default:
            return Mode::inert;
    }
}

template <class Policy>
void SettingAdapter<Policy>::position(const CMPIObjectPath* path) {
    switch (mode()) {
        case Mode::elementSource:
            computer.setObjectPath(locateComputer(path));
            break;
        case Mode::associationList:
            computer.setObjectPath(ProviderUtilities::createObjectPath(broker, computerClass, nameSpace));
            break;
        case Mode::computerSource:
            element.setObjectPath(locateElement(path));
            break;
        case Mode::inert:
            break;
    }
}

template <class Policy>
SettingAdapter<Policy>::operator bool() {
    const Traced traced(at(Policy::unit));
    switch (mode()) {
        case Mode::elementSource:
            return computer;
        case Mode::associationList:
            return computer || element;
        case Mode::computerSource:
            return element;
        case Mode::inert:
            break;
    }
    return false;
}

template <class Policy>
void SettingAdapter<Policy>::operator++() {
    const Traced traced(at(Policy::unit));
    switch (mode()) {
        case Mode::elementSource:
            ++computer;
            break;
        case Mode::associationList:
            ++element;
            if (!element) {
                ++computer;
            }
            break;
        case Mode::computerSource:
            ++element;
            break;
        case Mode::inert:
            break;
    }
}

template <class Policy>
CMPIObjectPath* SettingAdapter<Policy>::getObjectPath() {
    const Traced traced(at(Policy::unit));
    CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, Policy::associationClass, nameSpace);
    if (path != nullptr) {
        ProviderUtilities::setKeyProperty(path, computerRole, computer.getObjectPath());
        ProviderUtilities::setKeyProperty(path, elementRole, element.getObjectPath());
    }
    return path;
}

template <class Policy>
CMPIInstance* SettingAdapter<Policy>::getCMPIInstance(const char** properties) {
    const Traced traced(at(Policy::unit, Level::error), label::properties, properties);
    CMPIObjectPath* path = getObjectPath();
    CMPIInstance* instance = ProviderUtilities::createInstance(broker, path);
    if (instance == nullptr) {
        return nullptr;
    }
    for (const char* role : {computerRole, elementRole}) {
        CMPIObjectPath* end = nullptr;
        if (ProviderUtilities::getKeyProperty(path, role, &end)) {
            ProviderUtilities::setProperty(instance, role, end);
        }
    }
    return instance;
}

template <class Policy>
CMPIObjectPath* SettingAdapter<Policy>::getAssociatorNames() {
    const Traced traced(at(Policy::unit));
    switch (mode()) {
        case Mode::computerSource:
            return element.getObjectPath();
        case Mode::elementSource:
            return computer.getObjectPath();
        default:
            return nullptr;
    }
}

template <class Policy>
CMPIInstance* SettingAdapter<Policy>::getAssociator(const char** properties) {
    const Traced traced(at(Policy::unit, Level::error), label::properties, properties);
    switch (mode()) {
        case Mode::computerSource:
            return element.getCMPIInstance(properties);
        case Mode::elementSource:
            return computer.getCMPIInstance(properties);
        default:
            return nullptr;
    }
}

/** A path of the class with the keys that the source path's keys translate to. */
template <class Policy>
template <class Translate>
CMPIObjectPath* SettingAdapter<Policy>::locate(const char* className, const CMPIObjectPath* source,
                                               Translate translate) {
    CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, className, nameSpace);
    if (ProviderUtilities::getKeyCount(source) > 0) {
        Moniker sourceMoniker;
        ProviderUtilities::transformObjectPathToMoniker(source, sourceMoniker);
        Moniker moniker = translate(sourceMoniker);
        ProviderUtilities::transformMonikerToObjectPath(moniker, &path);
    }
    return path;
}

template <class Policy>
CMPIObjectPath* SettingAdapter<Policy>::locateElement(const CMPIObjectPath* computerPath) {
    const Traced traced(at(Policy::unit, Level::error, Policy::locate), label::objectPath, computerPath);
    return locate(Policy::elementClass, computerPath,
                  [&](Moniker& moniker) { return Policy::elementMoniker(setting, moniker); });
}

template <class Policy>
CMPIObjectPath* SettingAdapter<Policy>::locateComputer(const CMPIObjectPath* elementPath) {
    const Traced traced(at(Policy::unit, Level::error), label::objectPath, elementPath);
    return locate(computerClass, elementPath, [&](Moniker& moniker) { return setting.getComputerMoniker(moniker); });
}

}  // namespace KO::LeaseWarrantyProvider

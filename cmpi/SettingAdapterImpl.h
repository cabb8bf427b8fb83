#pragma once

// Definitions of SettingAdapter. Included only by the source file of each adapter, so that its code and trace buffers
// belong to that translation unit.

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

template <class Traits>
SettingAdapter<Traits>::SettingAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                       const CMPIObjectPath* path)
    : broker(requestBroker),
      context(requestContext),
      nameSpace(ProviderUtilities::getNamespace(path)),
      computer(broker, context, nameSpace),
      element(broker, context, nameSpace) {
    const Traced traced(at(Traits::traceSource, Level::error, Traits::constructor), label::broker, broker,
                        label::context, context, label::objectPath, path);
    requestedClassId = ProviderUtilities::getClassId(path);
    traceVariable(at(Traits::traceSource, Level::flow, Traits::constructor), "requestedClassId", requestedClassId);
    position(path);
}

template <class Traits>
SettingAdapter<Traits>::~SettingAdapter() noexcept(false) {
    traceMethod(at(Traits::traceSource, Level::flow, Traits::destructor));
}

template <class Traits>
typename SettingAdapter<Traits>::Mode SettingAdapter<Traits>::mode() const {
    switch (requestedClassId) {
        case ClassId::computerSystem:
            return Mode::computerSource;
        case Traits::elementClassId:
            return Mode::elementSource;
        case Traits::associationClassId:
            return Mode::associationList;
        default:
            return Mode::inert;
    }
}

template <class Traits>
void SettingAdapter<Traits>::position(const CMPIObjectPath* path) {
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

template <class Traits>
SettingAdapter<Traits>::operator bool() {
    const Traced traced(at(Traits::traceSource));
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

template <class Traits>
void SettingAdapter<Traits>::operator++() {
    const Traced traced(at(Traits::traceSource));
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

template <class Traits>
CMPIObjectPath* SettingAdapter<Traits>::getObjectPath() {
    const Traced traced(at(Traits::traceSource));
    CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, Traits::associationClass, nameSpace);
    if (path != nullptr) {
        ProviderUtilities::setKeyProperty(path, computerRole, computer.getObjectPath());
        ProviderUtilities::setKeyProperty(path, elementRole, element.getObjectPath());
    }
    return path;
}

template <class Traits>
CMPIInstance* SettingAdapter<Traits>::getCMPIInstance(const char** properties) {
    const Traced traced(at(Traits::traceSource, Level::error), label::properties, properties);
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

template <class Traits>
CMPIObjectPath* SettingAdapter<Traits>::getAssociatorNames() {
    const Traced traced(at(Traits::traceSource));
    switch (mode()) {
        case Mode::computerSource:
            return element.getObjectPath();
        case Mode::elementSource:
            return computer.getObjectPath();
        default:
            return nullptr;
    }
}

template <class Traits>
CMPIInstance* SettingAdapter<Traits>::getAssociator(const char** properties) {
    const Traced traced(at(Traits::traceSource, Level::error), label::properties, properties);
    switch (mode()) {
        case Mode::computerSource:
            return element.getCMPIInstance(properties);
        case Mode::elementSource:
            return computer.getCMPIInstance(properties);
        default:
            return nullptr;
    }
}

/** Returns a path of the class whose keys are the translated keys of the source path. */
template <class Traits>
template <class Translate>
CMPIObjectPath* SettingAdapter<Traits>::locate(const char* className, const CMPIObjectPath* source,
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

template <class Traits>
CMPIObjectPath* SettingAdapter<Traits>::locateElement(const CMPIObjectPath* computerPath) {
    const Traced traced(at(Traits::traceSource, Level::error, Traits::locate), label::objectPath, computerPath);
    return locate(Traits::elementClass, computerPath,
                  [&](Moniker& moniker) { return Traits::elementMoniker(setting, moniker); });
}

template <class Traits>
CMPIObjectPath* SettingAdapter<Traits>::locateComputer(const CMPIObjectPath* elementPath) {
    const Traced traced(at(Traits::traceSource, Level::error), label::objectPath, elementPath);
    return locate(computerClass, elementPath, [&](Moniker& moniker) { return setting.getComputerMoniker(moniker); });
}

}  // namespace KO::LeaseWarrantyProvider

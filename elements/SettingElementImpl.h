#pragma once

// Definitions of SettingElement. Included only by the source file of each setting element, so that its code and trace
// buffers belong to that translation unit.

#include <exception>
#include <new>
#include <string>

#include "KO/Exceptions.h"
#include "SettingElement.h"

namespace KO::LeaseWarrantyProvider {

namespace {

constexpr const char* computerKey = "Name";
constexpr const char* elementKey = "InstanceID";

/**
 * Runs a moniker operation and propagates only InstrumentationException and FrameworkException. Converts std::bad_alloc
 * to a FrameworkException whose message needs no allocation. Terminates the process on any other exception.
 */
template <class Operation>
Moniker throwingOnlyDeclared(Operation operation) {
    try {
        return operation();
    } catch (const InstrumentationException&) {
        throw;
    } catch (const FrameworkException&) {
        throw;
    } catch (const std::bad_alloc&) {
        throw FrameworkException("out of memory");
    } catch (...) {
        std::terminate();
    }
}

/** Returns the value of the moniker's first key with that name. */
std::string keyValue(const CallSite& site, Moniker& moniker, const std::string& wanted, const char* keyMissing) {
    const unsigned int count = moniker.getKeyCount();
    for (unsigned int index = 0; index < count; ++index) {
        std::string name;
        std::string value;
        if (moniker.selectKey(index) && (moniker.getName(name), name == wanted)) {
            moniker.getValue(value);
            return value;
        }
    }
    fail<FrameworkException>(here(site), keyMissing);
}

Moniker singleKeyMoniker(const char* name, const std::string& value) {
    Moniker moniker;
    moniker.addKey(name, value);
    return moniker;
}

/** Moves the cursor to the computer node with that name, or to the end. */
void selectComputer(const CallSite& site, Instrumentation& instrumentation, const std::string& wanted) {
    instrumentation.selectNode(NodeLexicon::NT_COMPUTER);
    for (; instrumentation; ++instrumentation) {
        std::string name;
        if (!instrumentation.getProperty(NodeLexicon::PROPERTY_NAME, name)) {
            fail<InstrumentationException>(here(site), "Name Property on Computer Node not available.");
        }
        if (name == wanted) {
            return;
        }
    }
}

}  // namespace

template <class Traits>
SettingElement<Traits>::SettingElement() {
    traceMethod(at(Traits::traceSource, Level::flow, Traits::constructor));
}

template <class Traits>
SettingElement<Traits>::~SettingElement() noexcept(false) {
    traceMethod(at(Traits::traceSource, Level::flow, Traits::destructor));
}

template <class Traits>
Moniker SettingElement<Traits>::getElementMoniker(Moniker& computerMoniker) {
    const CallSite site = at(Traits::traceSource, Level::error, Traits::toElement);
    const auto work = [&] {
        return toElement(at(Traits::traceSource, Level::flow, Traits::toElement), computerMoniker);
    };
    if constexpr (Traits::toElementExits) {
        const Traced traced(site, label::monikerComputer, &computerMoniker);
        return throwingOnlyDeclared(work);
    } else {
        traceLine(site, MT_ENTERING, label::monikerComputer, &computerMoniker);
        return throwingOnlyDeclared(work);
    }
}

template <class Traits>
Moniker SettingElement<Traits>::getComputerMoniker(Moniker& elementMoniker) {
    const Traced traced(at(Traits::traceSource, Level::error), Traits::elementLabel, &elementMoniker);
    const CallSite site = at(Traits::traceSource);
    return throwingOnlyDeclared([&] { return toComputer(site, elementMoniker); });
}

template <class Traits>
Moniker SettingElement<Traits>::toElement(const CallSite& site, Moniker& computerMoniker) {
    const std::string name = keyValue(site, computerMoniker, computerKey, "Could not find 'Name' Key in Moniker");
    traceVariable(here(site), computerKey, name);
    selectComputer(site, instrumentation, name);
    const std::string instanceId = instrumentation.convertPathToString(instrumentation.getPathToNode());
    element.setFilter(Traits::Element::InstanceIDFilter, instanceId);
    traceVariable(here(site), elementKey, instanceId);
    return singleKeyMoniker(elementKey, instanceId);
}

template <class Traits>
Moniker SettingElement<Traits>::toComputer(const CallSite& site, Moniker& elementMoniker) {
    const std::string instanceId =
        keyValue(site, elementMoniker, elementKey, "Could not find 'InstanceID' Key in Moniker");
    instrumentation.selectNode(instrumentation.convertStringToPath(instanceId));
    std::string name;
    if (!instrumentation.getProperty(NodeLexicon::PROPERTY_NAME, name)) {
        fail<InstrumentationException>(here(site), "Name Property on computer not available.");
    }
    traceVariable(here(site), computerKey, name);
    return singleKeyMoniker(computerKey, name);
}

}  // namespace KO::LeaseWarrantyProvider

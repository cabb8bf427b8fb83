#pragma once

// What the two setting elements share. Included by their source files and nowhere else, so that each
// element's code and trace buffers stand in its own unit.

#include "Exceptions.h"
#include "KO/Instrumentation.h"
#include "KO/Moniker.h"
#include "Trace.h"

#include <exception>
#include <string>

namespace KO::LeaseWarrantyProvider {

namespace {

constexpr const char* computerKey = "Name";
constexpr const char* elementKey = "InstanceID";

/** Runs a moniker operation. Nothing but the two exception classes that it declares may leave it. */
template <class Operation>
Moniker throwingOnlyDeclared(Operation operation) {
    try {
        return operation();
    } catch (const InstrumentationException&) {
        throw;
    } catch (const FrameworkException&) {
        throw;
    } catch (...) {
        std::terminate();
    }
}

/** The value of a moniker's first key of that name. */
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
    fail<FrameworkException>(site, keyMissing);
}

Moniker singleKeyMoniker(const char* name, const std::string& value) {
    Moniker moniker;
    moniker.addKey(name, value);
    return moniker;
}

/** Stands the cursor on the computer node of that name, or on none. */
void selectComputer(const CallSite& site, Instrumentation& instrumentation, const std::string& wanted) {
    instrumentation.selectNode(NodeLexicon::NT_COMPUTER);
    for (; instrumentation; ++instrumentation) {
        std::string name;
        if (!instrumentation.getProperty(NodeLexicon::PROPERTY_NAME, name)) {
            fail<InstrumentationException>(site, "Name Property on Computer Node not available.");
        }
        if (name == wanted) {
            return;
        }
    }
}

/** From a computer to its lease or warranty. */
template <class Element>
Moniker elementMoniker(const CallSite& site, Instrumentation& instrumentation, Element& element,
                       Moniker& computerMoniker) {
    const std::string name = keyValue(site, computerMoniker, computerKey, "Could not find 'Name' Key in Moniker");
    traceVariable(site, computerKey, name);
    selectComputer(site, instrumentation, name);
    const std::string instanceId = instrumentation.convertPathToString(instrumentation.getPathToNode());
    element.setFilter(Element::InstanceIDFilter, instanceId);
    traceVariable(site, elementKey, instanceId);
    return singleKeyMoniker(elementKey, instanceId);
}

/** From a lease or warranty to its computer. */
Moniker computerMoniker(const CallSite& site, Instrumentation& instrumentation, Moniker& elementMoniker) {
    const std::string instanceId =
        keyValue(site, elementMoniker, elementKey, "Could not find 'InstanceID' Key in Moniker");
    instrumentation.selectNode(instrumentation.convertStringToPath(instanceId));
    std::string name;
    if (!instrumentation.getProperty(NodeLexicon::PROPERTY_NAME, name)) {
        fail<InstrumentationException>(site, "Name Property on computer not available.");
    }
    traceVariable(site, computerKey, name);
    return singleKeyMoniker(computerKey, name);
}

}  // namespace

}  // namespace KO::LeaseWarrantyProvider

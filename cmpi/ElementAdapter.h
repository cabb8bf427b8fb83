#pragma once

#include <cmpidt.h>

#include <string>

namespace KO::LeaseWarrantyProvider {

/**
 * Base of RecordAdapter and ProductAdapter. Owns the managed element, whose current object is the current instance.
 *
 * Adapter is the derived class. Its narrow(element, path) sets the element's filters from the path's keys; its
 * getObjectPath() returns the path of the current instance.
 *
 * Traits defines Element, traceSource, properties, and the names of the constructor and the destructor in the log.
 */
template <class Adapter, class Traits>
class ElementAdapter {
public:
    /** Starts at the first object of the element. */
    ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext, std::string requestNameSpace);

    /** Starts at the first object that the path's keys select. Throws the exceptions of the element's setFilter. */
    ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext, const CMPIObjectPath* path);

    /** Destroys the element, whose destructor may throw. */
    ~ElementAdapter() noexcept(false);
    ElementAdapter(const ElementAdapter&) = delete;
    ElementAdapter& operator=(const ElementAdapter&) = delete;

    /** Returns whether there is a current instance. */
    operator bool();

    /** Moves to the next instance that the path selects. */
    void operator++();

    /** Sets the element's filters from the path's keys. Throws the exceptions of the element's setFilter. */
    void setObjectPath(const CMPIObjectPath* path);

    /** Returns the current instance with every property that has a value; null if the broker cannot create it. */
    CMPIInstance* getCMPIInstance(const char** properties);

protected:
    using Element = typename Traits::Element;

    const CMPIBroker* broker;
    const CMPIContext* context;
    std::string nameSpace;
    Element element{};
};

}  // namespace KO::LeaseWarrantyProvider

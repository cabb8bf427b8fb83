#pragma once

#include <cmpidt.h>

#include <string>

namespace KO::LeaseWarrantyProvider {

/**
 * Base of RecordAdapter and ProductAdapter: owns the managed element and has the element's position.
 *
 * Traits defines Element, traceSource, and the names of the constructor and the destructor in the log.
 */
template <class Traits>
class ElementAdapter {
public:
    /** Starts at the first object of the element. */
    ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext, std::string requestNameSpace);

    /** Destroys the element, whose destructor may throw. */
    ~ElementAdapter() noexcept(false);
    ElementAdapter(const ElementAdapter&) = delete;
    ElementAdapter& operator=(const ElementAdapter&) = delete;

    /** Returns whether there is a current instance. */
    operator bool();

    /** Moves to the next instance that the path selects. */
    void operator++();

protected:
    using Element = typename Traits::Element;

    /** Starts at the first object that the path's keys select. `narrow` sets the element's filters from the keys. */
    ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext, const CMPIObjectPath* path,
                   void (*narrow)(Element& element, const CMPIObjectPath* path));

    const CMPIBroker* broker;
    const CMPIContext* context;
    std::string nameSpace;
    Element element{};
};

}  // namespace KO::LeaseWarrantyProvider

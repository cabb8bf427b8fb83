#pragma once

#include <cmpidt.h>

#include <string>

namespace KO::LeaseWarrantyProvider {

/**
 * What the adapters over one managed element have in common: they hold the element, and stand where it
 * stands. Base of RecordAdapter and ProductAdapter.
 *
 * Traits gives Element, traceSource, and the constructor's and destructor's names in the log.
 */
template <class Traits>
class ElementAdapter {
public:
    /** Stands on the first of all that the element has. */
    ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext, std::string requestNameSpace);

    /** Destroys the element, which may throw where its destructor does. */
    ~ElementAdapter() noexcept(false);
    ElementAdapter(const ElementAdapter&) = delete;
    ElementAdapter& operator=(const ElementAdapter&) = delete;

    /** Whether the adapter stands on an instance. */
    operator bool();

    /** Moves to the next instance that the path selects. */
    void operator++();

protected:
    using Element = typename Traits::Element;

    /** Stands on the first of what the path's keys select: narrow makes filters of the element of them. */
    ElementAdapter(const CMPIBroker* requestBroker, const CMPIContext* requestContext, const CMPIObjectPath* path,
                   void (*narrow)(Element& element, const CMPIObjectPath* path));

    const CMPIBroker* broker;
    const CMPIContext* context;
    std::string nameSpace;
    Element element{};
};

}  // namespace KO::LeaseWarrantyProvider

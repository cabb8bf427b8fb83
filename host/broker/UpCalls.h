#pragma once

#include <optional>
#include <string>
#include <vector>

#include "model/PropertyList.h"
#include "model/Status.h"
#include "model/Value.h"

namespace cimhost {

/** The entries of a request's context, such as CMPIInvocationFlags and CMPIPrincipal. */
using ContextEntries = std::vector<NamedValue>;

/** Names that narrow down an association operation; none where the caller gave none. */
struct AssociationFilter {
    std::optional<std::string> associationClass{};  ///< not for references, where the result class is the association's
    std::optional<std::string> resultClass{};
    std::optional<std::string> role{};
    std::optional<std::string> resultRole{};  ///< not for references
};

/**
 * Where the broker sends what providers ask the object manager for. Each operation answers that it is not
 * supported unless a subclass does better. Called on the thread of the provider that asks, possibly on several
 * at a time and from inside a request; an exception becomes the status CMPI_RC_ERR_FAILED with its text.
 */
class UpCalls {
public:
    virtual ~UpCalls() = default;

    virtual Answer<std::vector<Instance>> enumerateInstances(const ContextEntries& context, const ObjectPath& path,
                                                             const PropertyList& properties);
    virtual Answer<std::vector<ObjectPath>> enumerateInstanceNames(const ContextEntries& context,
                                                                   const ObjectPath& path);
    virtual Answer<Instance> getInstance(const ContextEntries& context, const ObjectPath& path,
                                         const PropertyList& properties);
    virtual Answer<ObjectPath> createInstance(const ContextEntries& context, const ObjectPath& path,
                                              const Instance& instance);
    virtual Status modifyInstance(const ContextEntries& context, const ObjectPath& path, const Instance& instance,
                                  const PropertyList& properties);
    virtual Status deleteInstance(const ContextEntries& context, const ObjectPath& path);
    virtual Answer<std::vector<Instance>> execQuery(const ContextEntries& context, const ObjectPath& path,
                                                    const std::string& query, const std::string& language);

    virtual Answer<std::vector<Instance>> associators(const ContextEntries& context, const ObjectPath& path,
                                                      const AssociationFilter& filter, const PropertyList& properties);
    virtual Answer<std::vector<ObjectPath>> associatorNames(const ContextEntries& context, const ObjectPath& path,
                                                            const AssociationFilter& filter);
    virtual Answer<std::vector<Instance>> references(const ContextEntries& context, const ObjectPath& path,
                                                     const AssociationFilter& filter, const PropertyList& properties);
    virtual Answer<std::vector<ObjectPath>> referenceNames(const ContextEntries& context, const ObjectPath& path,
                                                           const AssociationFilter& filter);

    /** @param output receives the method's output parameters */
    virtual Answer<Value> invokeMethod(const ContextEntries& context, const ObjectPath& path, const std::string& method,
                                       const std::vector<NamedValue>& input, std::vector<NamedValue>& output);
    virtual Status setProperty(const ContextEntries& context, const ObjectPath& path, const std::string& name,
                               const Value& value);
    virtual Answer<Value> getProperty(const ContextEntries& context, const ObjectPath& path, const std::string& name);
};

}  // namespace cimhost

#pragma once

#include <cmpidt.h>

#include <string>

#include "broker/Profile.h"
#include "broker/UpCalls.h"
#include "model/PropertyList.h"
#include "model/ResultEvent.h"
#include "model/Status.h"
#include "model/Value.h"

namespace cimhost {

/** The operations that this host asks of providers. */
enum class Operation {
    enumerateInstances,
    enumerateInstanceNames,
    getInstance,
    createInstance,
    modifyInstance,
    deleteInstance,
    execQuery,
    associators,
    associatorNames,
    references,
    referenceNames
};

/** "EnumerateInstances" and so on, for messages. */
const char* nameOf(Operation operation);

/** Whether it is one of the last four, which association providers serve. */
bool isAssociationOperation(Operation operation);

/** One CIM operation; what it does not use is left as it is. */
struct Request {
    Operation operation = Operation::enumerateInstances;
    ObjectPath path{};
    PropertyList properties{};
    Instance instance{};         ///< of createInstance and modifyInstance, handed over as it is
    AssociationFilter filter{};  ///< of the association operations
    ContextEntries context{};
    std::string language{};  ///< of execQuery, as the query is
    std::string query{};
};

/** Everything that one provider did in answer to a request. */
struct RawAnswer {
    Status status{};                      ///< as the provider answered it; CMPI_RC_ERR_FAILED when an exception left it
    bool hasMessage = false;              ///< whether the status carried a message, even an empty one
    bool threw = false;                   ///< whether an exception left the provider
    bool releasedPath = false;            ///< whether the provider released a path that the manager keeps
    Manager manager = Manager::standard;  ///< the object manager that asked, whose rules say what the answer means
    ResultEvents events{};                ///< what it returned, in order, also before a failure

    int doneCount() const { return cimhost::doneCount(events); }
};

}  // namespace cimhost

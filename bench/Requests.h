#pragma once

#include "broker/Broker.h"
#include "model/ResultEvent.h"
#include "model/Status.h"
#include "model/Value.h"

#include <cmpift.h>

#include <cstddef>
#include <optional>
#include <string>

/** Requests to a provider through its function tables, timed and checked. */
namespace bench {

/** The two interfaces of a provider; they belong to it. Null for one that it has not. */
struct Interfaces {
    CMPIInstanceMI* instances = nullptr;
    CMPIAssociationMI* associations = nullptr;
};

/** What an operation is called with; all of it belongs to the request. */
struct CallArguments {
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    const CMPIInstance* instance;  ///< null for a request that has none
};

/** One call into a function table. */
using Operation = CMPIStatus (*)(const Interfaces& interfaces, const CallArguments& arguments);

/** A request and what a right answer to it is made of. */
struct Request {
    Operation operation;
    cimhost::ObjectPath path;
    std::optional<cimhost::Instance> instance;  ///< of a modification
    std::size_t answers;                        ///< instances or paths that are returned
    bool ends;                                  ///< whether the provider says that it is done
};

/** What became of a request. */
struct Outcome {
    double seconds = 0;  ///< processor time, user and system, from the call into the function table to its return
    cimhost::Status status{};
    cimhost::ResultEvents events{};
};

/** The processor time that this thread has used, in seconds. */
double processorSeconds();

/** Runs a request in a scope of its own. Making its arguments and freeing what the provider made are not timed. */
Outcome perform(cimhost::Broker& broker, const Request& request, const Interfaces& interfaces);

/** @throws std::runtime_error when the status is not OK, or the number of answers is not what is expected */
void requireAnswered(const Request& request, const Outcome& outcome);

/**
 * Compares answers as a whole: order, classes, namespaces, keys, properties with types and values.
 * @throws std::runtime_error with the first difference
 */
void requireSame(const cimhost::ResultEvents& answers, const cimhost::ResultEvents& expected);

/** @name Requests */
///@{
cimhost::ObjectPath classPath(const std::string& className);
cimhost::NamedValue textValue(const std::string& name, const std::string& text);

Request enumInstances(const std::string& className, std::size_t answers);
Request enumInstanceNames(const std::string& className, std::size_t answers);
Request getInstance(cimhost::ObjectPath path);
Request createInstance(cimhost::ObjectPath path);
Request modifyInstance(cimhost::ObjectPath path, cimhost::NamedValue property);
Request deleteInstance(cimhost::ObjectPath path);
Request associators(cimhost::ObjectPath path, std::size_t answers);
Request associatorNames(cimhost::ObjectPath path, std::size_t answers);
///@}

}  // namespace bench

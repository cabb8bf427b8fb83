#pragma once

#include <cmpift.h>

#include <cstddef>
#include <string>

#include "broker/Broker.h"
#include "model/Request.h"
#include "model/ResultEvent.h"
#include "model/Status.h"

/** Timed requests to a provider's function tables. */
namespace bench {

/** The interfaces of a provider, which owns them. A member is null if the provider has no such interface. */
struct Interfaces {
    CMPIInstanceMI* instances = nullptr;
    CMPIAssociationMI* associations = nullptr;
};

/** A request and the response that it must have. */
struct ExpectedRequest {
    cimhost::Request request;
    std::size_t results = 0;  ///< number of instances or paths
    int rc = CMPI_RC_OK;
};

/** The response to a request, and its time. */
struct TimedResponse {
    double seconds = 0;  ///< processor time, user and system, from the call into the function table to its return
    cimhost::Status status{};
    cimhost::ResultEvents events{};
};

/** The processor time that this thread has used, in seconds. */
double processorSeconds();

/** Performs a request. The measured time excludes creating the arguments and freeing the provider's objects. */
TimedResponse perform(cimhost::Broker& broker, const cimhost::Request& request, const Interfaces& interfaces);

/**
 * Checks the status and the number of results. If a read or a creation succeeded, also checks that the provider called
 * returnDone last.
 * @throws std::runtime_error with the difference
 */
void requireExpected(const ExpectedRequest& expected, const TimedResponse& response);

/**
 * Compares results: order, classes, namespaces, keys, properties with types and values.
 * @throws std::runtime_error with the first difference
 */
void requireSame(const cimhost::ResultEvents& results, const cimhost::ResultEvents& expected);

/** @name Paths and values of requests */
///@{
cimhost::ObjectPath classPath(const std::string& className);
cimhost::ObjectPath recordPath(const std::string& className, const std::string& instanceId);
cimhost::ObjectPath computerPath(const std::string& name);
cimhost::NamedValue namedString(const std::string& name, const std::string& value);

/** The path of the only instance of a product class. */
template <class Row>
cimhost::ObjectPath productPath(const Row& row) {
    cimhost::ObjectPath path = classPath(Row::className);
    for (const auto& key : Row::keys) {
        path.keys.push_back(namedString(key.name, row.*key.member));
    }
    return path;
}

/** A creation that sets only the keys. */
cimhost::Request creation(const cimhost::ObjectPath& path);

/** A modification of one property. */
cimhost::Request modification(const cimhost::ObjectPath& path, cimhost::NamedValue property);

/** The filter for the association between computers and leases. */
cimhost::AssociationFilter leaseSettings();
///@}

}  // namespace bench

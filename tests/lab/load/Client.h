#pragma once

#include <vector>

#include "lab/load/ExpectedState.h"
#include "lab/load/InitialState.h"
#include "lab/load/Report.h"

namespace cimhost::lab {

/**
 * A client that sends requests about its own instances, one after the other, and checks each response. Sometimes it
 * requests an instance that does not exist, or creates one that exists. The manager, the plan and the initial state are
 * shared and must outlive it.
 */
class Client {
public:
    /** @param itsNumber from 1 */
    Client(ObjectManager& itsManager, const Plan& itsPlan, const InitialState& itsInitial, unsigned itsNumber);

    void run(std::size_t requests);

    const Statistics& statistics() const { return found; }

    /** The expected state of its instances, by class of the plan. */
    const std::vector<ExpectedState>& states() const { return known; }

private:
    /** The current request. */
    struct CurrentRequest {
        std::size_t index = 0;  ///< of its class
        OperationKind kind = OperationKind::get;
        std::string description{};
        Statistics::Time time{};
    };

    void sendOne();
    CheckResult send();
    CheckResult create();
    CheckResult createAgain();
    CheckResult modify();
    CheckResult modifyOwn(const std::string& id);
    CheckResult remove();
    CheckResult removeOwn(const std::string& id);
    CheckResult get();
    CheckResult enumerate();
    CheckResult associate();
    CheckResult requestMissing(const Request& request);

    Response perform(const Request& request);

    /** Checks the status of a response. Returns "died" if the response would have crashed the provider's process. */
    static CheckResult checkResponse(const Response& response, int code);

    const LoadClass& aClass() const { return plan.classes[current.index]; }
    ExpectedState& state() { return known[current.index]; }
    std::string newId();
    std::string missingId();  ///< of the instance that the client deleted last, or of one that it never creates
    bool probes() { return state().isEmpty() || (plan.probes && random.oneIn(16)); }
    std::vector<NamedValue> someValues();

    ObjectManager& manager;
    const Plan& plan;
    const InitialState& initial;
    unsigned number;
    std::string prefix;  ///< of its identifiers
    Random random;
    Statistics found;
    std::vector<ExpectedState> known;
    std::size_t idCount = 0;  ///< number of identifiers, of all classes
    std::string lastRemoved{};
    std::size_t requestCount = 0;  ///< number of requests
    CurrentRequest current{};
};

}  // namespace cimhost::lab

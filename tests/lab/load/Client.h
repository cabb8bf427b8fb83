#pragma once

#include <vector>

#include "lab/load/Baseline.h"
#include "lab/load/ExpectedState.h"
#include "lab/load/Report.h"

namespace cimhost::lab {

/**
 * One of the clients: sends one request after the other about instances of its own, and knows what every answer must
 * be. Once in a while it asks for what is not there, and creates what is there already. The manager, the plan and the
 * baseline are shared and must outlive it.
 */
class Client {
public:
    /** @param itsNumber from 1 */
    Client(ObjectManager& itsManager, const Plan& itsPlan, const Baseline& itsBaseline, unsigned itsNumber);

    void run(std::size_t requests);

    const Statistics& statistics() const { return found; }

    /** What it was told, by class of the plan. */
    const std::vector<ExpectedState>& states() const { return known; }

private:
    /** The request being made: which class it is about, what it turned out to be. */
    struct Turn {
        std::size_t index = 0;  ///< of the class
        OperationKind kind = OperationKind::get;
        std::string request{};
        Statistics::Time time{};
    };

    void take();
    Verdict act();
    Verdict create();
    Verdict createAgain();
    Verdict modify();
    Verdict modifyOwn(const std::string& id);
    Verdict remove();
    Verdict removeOwn(const std::string& id);
    Verdict get();
    Verdict enumerate();
    Verdict associate();
    Verdict askForMissing(const Request& request);

    Response ask(const Request& request);

    /** Checks the status of a response; "died" when the provider process would have ended. */
    static Verdict judge(const Response& response, int code);

    const LoadClass& aClass() const { return plan.classes[turn.index]; }
    ExpectedState& state() { return known[turn.index]; }
    std::string newId();
    std::string missingId();  ///< what it deleted last, or never makes; good for every class
    bool probes() { return state().isEmpty() || (plan.probes && random.oneIn(16)); }
    std::vector<NamedValue> someValues();

    ObjectManager& manager;
    const Plan& plan;
    const Baseline& baseline;
    unsigned number;
    std::string prefix;  ///< of its identifiers
    Random random;
    Statistics found;
    std::vector<ExpectedState> known;
    std::size_t made = 0;  ///< identifiers, in all classes together
    std::string lastRemoved{};
    std::size_t asked = 0;  ///< requests
    Turn turn{};
};

}  // namespace cimhost::lab

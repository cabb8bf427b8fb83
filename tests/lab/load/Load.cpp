#include "lab/load/Load.h"

#include <future>
#include <memory>

#include "lab/load/Client.h"
#include "lab/load/InitialState.h"
#include "lab/load/Requests.h"
#include "schema/ObjectPathText.h"

namespace cimhost::lab {
namespace {

using Clients = std::vector<std::unique_ptr<Client>>;

Clients makeClients(ObjectManager& manager, const Plan& plan, const InitialState& initial) {
    Clients clients;
    for (unsigned number = 1; number <= plan.clients; ++number) {
        clients.push_back(std::make_unique<Client>(manager, plan, initial, number));
    }
    return clients;
}

/** Runs all clients concurrently. @return the time in seconds */
double runClients(const Clients& clients, std::size_t requests) {
    std::promise<void> start;
    const std::shared_future<void> started = start.get_future().share();
    std::vector<std::future<void>> running;
    for (std::size_t i = 0; i < clients.size(); ++i) {
        const std::size_t share = requests / clients.size() + (i < requests % clients.size() ? 1 : 0);
        running.push_back(std::async(std::launch::async, [client = clients[i].get(), share, started] {
            started.wait();
            client->run(share);
        }));
    }
    const auto begin = std::chrono::steady_clock::now();
    start.set_value();
    for (std::future<void>& each : running) {
        each.get();
    }
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - begin).count();
}

/** The expected state of a class according to all clients. */
ExpectedState stateOf(const Clients& clients, std::size_t index) {
    ExpectedState all;
    for (const auto& client : clients) {
        all.add(client->states()[index]);
    }
    return all;
}

/** The checks at the end, when no client is running. */
class Inspection {
public:
    Inspection(ObjectManager& itsManager, const InitialState& itsInitial, Statistics& itsStatistics)
        : manager(itsManager), initial(itsInitial), statistics(itsStatistics) {}

    /** Checks the instances of a class. */
    void inspect(const LoadClass& known, const std::set<std::string>& others, const ExpectedState& state) {
        const Request request = Request::enumerateInstances(known.path);
        const Response response = manager.perform(request);
        CheckResult mismatch = checkStatus(response.status, CMPI_RC_OK);
        if (!mismatch) {
            mismatch = checkListing({known, others, state, initial.prefix, initial.prefix}, response.instances, true);
        }
        note(request, std::move(mismatch));
    }

    /** Deletes the instances of the state, and the doubtful ones, which may exist. */
    void clear(const LoadClass& known, ExpectedState& state) {
        const std::map<std::string, ExpectedState::Values> instances = state.instances();
        for (const auto& [id, values] : instances) {
            const Request request = Request::deleteInstance(known.instancePath(id));
            note(request, checkStatus(manager.perform(request).status, CMPI_RC_OK));
            state.removed(id);
        }
        for (const std::string& id : state.doubted()) {
            manager.perform(Request::deleteInstance(known.instancePath(id)));
        }
    }

private:
    void note(const Request& request, CheckResult mismatch) {
        ++number;
        if (mismatch) {
            const std::string description =
                std::string(nameOf(request.operation)) + " " + formatObjectPath(request.path);
            statistics.note({std::nullopt, number, description, std::move(*mismatch)});
        }
    }

    ObjectManager& manager;
    const InitialState& initial;
    Statistics& statistics;
    std::size_t number = 0;
};

void inspectAll(ObjectManager& manager, const Plan& plan, const InitialState& initial, const Clients& clients,
                Statistics& statistics) {
    Inspection inspection(manager, initial, statistics);
    for (std::size_t i = 0; i < plan.classes.size(); ++i) {
        ExpectedState state = stateOf(clients, i);
        inspection.inspect(plan.classes[i], initial.ids[i], state);
        if (!plan.keeps) {
            inspection.clear(plan.classes[i], state);
            inspection.inspect(plan.classes[i], initial.ids[i], state);
        }
    }
}

}  // namespace

void requireFeasible(const Plan& plan) {
    if (plan.mix.weight(OperationKind::associate) > 0 && !plan.source) {
        throw PlanError("the mix has associations, but there is no instance to start from; name it with --source");
    }
    for (const LoadClass& each : plan.classes) {
        if (plan.mix.weight(OperationKind::modify) > 0 && each.modifiable.empty()) {
            throw PlanError("class " + each.path.className +
                            " has no property that a load can modify; omit modify from the mix");
        }
    }
}

StatusOr<Report> runLoad(ObjectManager& manager, const Plan& plan) {
    requireFeasible(plan);
    const StatusOr<InitialState> initial = readInitialState(manager, plan);
    if (!initial.ok()) {
        return {initial.status, {}};
    }
    const Clients clients = makeClients(manager, plan, initial.value);
    const double seconds = runClients(clients, plan.requests);
    Statistics statistics(plan.shown);
    for (const auto& client : clients) {
        statistics.add(client->statistics());
    }
    inspectAll(manager, plan, initial.value, clients, statistics);
    Report report = reportOf(statistics, seconds);
    report.clients = plan.clients;
    report.seed = plan.seed;
    return {{}, std::move(report)};
}

}  // namespace cimhost::lab

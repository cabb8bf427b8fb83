#include "lab/load/Load.h"

#include <future>
#include <memory>

#include "lab/load/Baseline.h"
#include "lab/load/Client.h"
#include "lab/load/Requests.h"
#include "schema/ObjectPathText.h"

namespace cimhost::lab {
namespace {

using Clients = std::vector<std::unique_ptr<Client>>;

Clients makeClients(ObjectManager& manager, const Plan& plan, const Baseline& baseline) {
    Clients clients;
    for (unsigned number = 1; number <= plan.clients; ++number) {
        clients.push_back(std::make_unique<Client>(manager, plan, baseline, number));
    }
    return clients;
}

/** Runs all clients at a time. @return the seconds that it took */
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

/** What all clients together were told of a class. */
ExpectedState stateOf(const Clients& clients, std::size_t index) {
    ExpectedState all;
    for (const auto& client : clients) {
        all.add(client->states()[index]);
    }
    return all;
}

/** Looks at the end, alone, at what is there. */
class Inspection {
public:
    Inspection(ObjectManager& itsManager, const Baseline& itsBaseline, Statistics& itsStatistics)
        : manager(itsManager), baseline(itsBaseline), statistics(itsStatistics) {}

    /** Whether a class holds what the state says. */
    void inspect(const LoadClass& known, const std::set<std::string>& others, const ExpectedState& state) {
        const Request request = Request::enumerateInstances(known.path);
        const Response response = manager.perform(request);
        Verdict verdict = checkStatus(response.status, CMPI_RC_OK);
        if (!verdict) {
            verdict = checkListing({known, others, state, baseline.prefix, baseline.prefix}, response.instances, true);
        }
        note(request, std::move(verdict));
    }

    /** Deletes what the state has, and what it may have. */
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
    void note(const Request& request, Verdict verdict) {
        ++number;
        if (verdict) {
            const std::string text = std::string(nameOf(request.operation)) + " " + formatObjectPath(request.path);
            statistics.note({std::nullopt, number, text, std::move(*verdict)});
        }
    }

    ObjectManager& manager;
    const Baseline& baseline;
    Statistics& statistics;
    std::size_t number = 0;
};

void inspectAll(ObjectManager& manager, const Plan& plan, const Baseline& baseline, const Clients& clients,
                Statistics& statistics) {
    Inspection inspection(manager, baseline, statistics);
    for (std::size_t i = 0; i < plan.classes.size(); ++i) {
        ExpectedState state = stateOf(clients, i);
        inspection.inspect(plan.classes[i], baseline.ids[i], state);
        if (!plan.keeps) {
            inspection.clear(plan.classes[i], state);
            inspection.inspect(plan.classes[i], baseline.ids[i], state);
        }
    }
}

}  // namespace

void requireFeasible(const Plan& plan) {
    if (plan.mix.weight(OperationKind::associate) > 0 && !plan.source) {
        throw PlanError("there are associations in the mix, but no instance whose associations to ask for");
    }
    for (const LoadClass& each : plan.classes) {
        if (plan.mix.weight(OperationKind::modify) > 0 && each.modifiable.empty()) {
            throw PlanError("class " + each.path.className + " has no property with the qualifier Write that a load " +
                            "has values for; leave modify out of the mix");
        }
    }
}

StatusOr<Report> runLoad(ObjectManager& manager, const Plan& plan) {
    requireFeasible(plan);
    const StatusOr<Baseline> baseline = takeBaseline(manager, plan);
    if (!baseline.ok()) {
        return {baseline.status, {}};
    }
    const Clients clients = makeClients(manager, plan, baseline.value);
    const double seconds = runClients(clients, plan.requests);
    Statistics statistics(plan.shown);
    for (const auto& client : clients) {
        statistics.add(client->statistics());
    }
    inspectAll(manager, plan, baseline.value, clients, statistics);
    Report report = reportOf(statistics, seconds);
    report.clients = plan.clients;
    report.seed = plan.seed;
    return {{}, std::move(report)};
}

}  // namespace cimhost::lab

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
Ledger ledgerOf(const Clients& clients, std::size_t index) {
    Ledger all;
    for (const auto& client : clients) {
        all.add(client->ledgers()[index]);
    }
    return all;
}

/** Looks at the end, alone, at what is there. */
class Inspection {
public:
    Inspection(ObjectManager& itsManager, const Baseline& itsBaseline, Tally& itsTally)
        : manager(itsManager), baseline(itsBaseline), tally(itsTally) {}

    /** Whether a class holds what the ledger says. */
    void inspect(const LoadClass& known, const std::set<std::string>& others, const Ledger& ledger) {
        const Request request = Request::enumerateInstances(known.path);
        const Response response = manager.perform(request);
        Verdict verdict = checkStatus(response.status, CMPI_RC_OK);
        if (!verdict) {
            verdict = checkListing({known, others, ledger, baseline.prefix, baseline.prefix}, response.instances, true);
        }
        note(request, std::move(verdict));
    }

    /** Deletes what the ledger has, and what it may have. */
    void clear(const LoadClass& known, Ledger& ledger) {
        const std::map<std::string, Ledger::Values> instances = ledger.instances();
        for (const auto& [id, values] : instances) {
            const Request request = Request::deleteInstance(known.instancePath(id));
            note(request, checkStatus(manager.perform(request).status, CMPI_RC_OK));
            ledger.removed(id);
        }
        for (const std::string& id : ledger.doubted()) {
            manager.perform(Request::deleteInstance(known.instancePath(id)));
        }
    }

private:
    void note(const Request& request, Verdict verdict) {
        ++number;
        if (verdict) {
            const std::string text = std::string(nameOf(request.operation)) + " " + formatObjectPath(request.path);
            tally.note({std::nullopt, number, text, std::move(*verdict)});
        }
    }

    ObjectManager& manager;
    const Baseline& baseline;
    Tally& tally;
    std::size_t number = 0;
};

void inspectAll(ObjectManager& manager, const Plan& plan, const Baseline& baseline, const Clients& clients,
                Tally& tally) {
    Inspection inspection(manager, baseline, tally);
    for (std::size_t i = 0; i < plan.classes.size(); ++i) {
        Ledger ledger = ledgerOf(clients, i);
        inspection.inspect(plan.classes[i], baseline.ids[i], ledger);
        if (!plan.keeps) {
            inspection.clear(plan.classes[i], ledger);
            inspection.inspect(plan.classes[i], baseline.ids[i], ledger);
        }
    }
}

}  // namespace

void requireFeasible(const Plan& plan) {
    if (plan.mix.weight(Deed::associate) > 0 && !plan.source) {
        throw PlanError("there are associations in the mix, but no instance whose associations to ask for");
    }
    for (const LoadClass& each : plan.classes) {
        if (plan.mix.weight(Deed::modify) > 0 && each.modifiable.empty()) {
            throw PlanError("class " + each.path.className + " has no property with the qualifier Write that a load " +
                            "has values for; leave modify out of the mix");
        }
    }
}

Answer<Report> runLoad(ObjectManager& manager, const Plan& plan) {
    requireFeasible(plan);
    const Answer<Baseline> baseline = takeBaseline(manager, plan);
    if (!baseline.ok()) {
        return {baseline.status, {}};
    }
    const Clients clients = makeClients(manager, plan, baseline.value);
    const double seconds = runClients(clients, plan.requests);
    Tally tally(plan.shown);
    for (const auto& client : clients) {
        tally.add(client->tally());
    }
    inspectAll(manager, plan, baseline.value, clients, tally);
    Report report = reportOf(tally, seconds);
    report.clients = plan.clients;
    report.seed = plan.seed;
    return {{}, std::move(report)};
}

}  // namespace cimhost::lab

#include "broker/Broker.h"

#include <algorithm>
#include <iterator>
#include <utility>
#include <vector>

#include "broker/ErrorTranslation.h"
#include "cim/Names.h"

namespace cimhost {
namespace {

/** An arena that a thread has entered. */
struct Scope {
    const Broker* broker;
    Arena* arena;
};

/** The scopes of this thread, the innermost last. */
std::vector<Scope>& scopes() {
    thread_local std::vector<Scope> ofThread;
    return ofThread;
}

/** Supports no operation. */
class NoUpCalls : public UpCalls {
public:
    Response perform(Request request) override { return notSupported(request.operation); }
};

BrokerOptions completed(BrokerOptions options) {
    if (options.tables == nullptr) {
        options.tables = &standardTables();
    }
    if (options.upCalls == nullptr) {
        static NoUpCalls none;
        options.upCalls = &none;
    }
    return options;
}

/** CMPIBroker has pointers to non-const tables, although no caller writes to the tables. */
CMPIBroker handleOf(Broker& broker, const BrokerOptions& options) {
    auto& tables = const_cast<FunctionTables&>(*options.tables);
    return {&broker, &tables.broker, &tables.encapsulation, &tables.threads,
            options.hasMemoryTable ? &tables.memory : nullptr};
}

}  // namespace

const FunctionTables& standardTables() {
    static const FunctionTables tables{
        brokerTable,   encapsulationTable, threadTable,      memoryTable, stringTable,  objectPathTable, instanceTable,
        dateTimeTable, arrayTable,         enumerationTable, argsTable,   contextTable, resultTable,     errorTable};
    return tables;
}

Response notSupported(Operation operation) {
    return Response::failed(
        {CMPI_RC_ERR_NOT_SUPPORTED, std::string(nameOf(operation)) + " is not supported by this object manager."});
}

Broker::Broker(BrokerOptions itsOptions)
    : options(completed(std::move(itsOptions))), brokerHandle(handleOf(*this, options)), outside(tables()) {}

Broker& Broker::of(const CMPIBroker* handle) {
    if (handle == nullptr || handle->hdl == nullptr) {
        throw Failure(CMPI_RC_ERR_INVALID_HANDLE);
    }
    return *static_cast<Broker*>(handle->hdl);
}

std::shared_ptr<const ClassInfo> Broker::classInfo(const std::string& className) const {
    return options.classInfo ? options.classInfo(className) : nullptr;
}

bool Broker::isA(const std::string& className, const std::string& ancestor) const {
    if (cim::sameName(className, ancestor)) {
        return true;
    }
    const auto known = classInfo(className);
    return known && std::any_of(known->superclasses.begin(), known->superclasses.end(),
                                [&](const std::string& each) { return cim::sameName(each, ancestor); });
}

void Broker::log(const LogRecord& record) const {
    if (options.log) {
        options.log(record);
    }
}

Arena& Broker::arena() {
    const auto& all = scopes();
    const auto found =
        std::find_if(all.rbegin(), all.rend(), [this](const Scope& scope) { return scope.broker == this; });
    return found == all.rend() ? outside : *found->arena;
}

Arena* Broker::arenaOfThread() {
    return scopes().empty() ? nullptr : scopes().back().arena;
}

void Broker::enter(Arena& arena) {
    scopes().push_back({this, &arena});
}

void Broker::leave(const Arena& arena) {
    auto& all = scopes();
    const auto found =
        std::find_if(all.rbegin(), all.rend(), [&](const Scope& scope) { return scope.arena == &arena; });
    if (found != all.rend()) {
        all.erase(std::next(found).base());
    }
}

CMPIContext* Broker::prepareThread(const ContextEntries& entries) {
    auto arena = std::make_unique<Arena>(tables(), &outside);
    auto* context = arena->make<CMPIContext>(entries);
    const std::lock_guard<std::mutex> lock(mutex);
    threads.emplace(context, std::move(arena));
    return context;
}

bool Broker::attachThread(const CMPIContext* context) {
    const std::lock_guard<std::mutex> lock(mutex);
    const auto found = threads.find(context);
    if (found == threads.end()) {
        return false;
    }
    enter(*found->second);
    return true;
}

bool Broker::detachThread(const CMPIContext* context) {
    const std::lock_guard<std::mutex> lock(mutex);
    const auto found = threads.find(context);
    if (found == threads.end()) {
        return false;
    }
    leave(*found->second);
    threads.erase(found);
    return true;
}

}  // namespace cimhost

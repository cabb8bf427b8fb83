#include "Subject.h"

#include "LeaseBase.h"
#include "RecordFile.h"
#include "WarrantyBase.h"
#include "cim/Names.h"
#include "schema/MofReader.h"
#include "support/AgentEnvironment.h"
#include "support/Files.h"
#include "support/Values.h"

#include <fstream>
#include <iterator>
#include <memory>

namespace fuzz {

namespace {

using namespace KO::LeaseWarrantyProvider;

constexpr const char* computerClass = "VELKO_ComputerSystem";

/** The records in use of a store. */
template <class RecordStore>
std::vector<testsupport::ModelRecord> recordsOf() {
    std::vector<testsupport::ModelRecord> records;
    for (const auto& unit : RecordStore::cache().table) {
        if (unit.inUse) {
            records.push_back(modelOf<RecordStore>(unit));
        }
    }
    return records;
}

template <class RecordStore>
unsigned int countOf() {
    return RecordStore::cache().count();
}

/** A table as when the library comes into the process. */
template <class RecordStore>
void reload() {
    auto& cache = RecordStore::cache();
    std::destroy_at(&cache);
    new (&cache) RecordCache<RecordStore>;
}

/** What the object manager knows of computers: that of the agent; none; two, one without a name; or it fails. */
class Computers : public cimhost::UpCalls {
public:
    void choose(std::size_t itsKind) { kind = itsKind % 4; }

    cimhost::Response perform(cimhost::Request request) override {
        if (request.operation != cimhost::Operation::enumerateInstances) {
            return cimhost::notSupported(request.operation);
        }
        const cimhost::ObjectPath& path = request.path;
        if (kind == 3 || !cim::sameName(path.className, computerClass)) {
            return cimhost::Response::failed({CMPI_RC_ERR_FAILED, "no computers"});
        }
        std::vector<cimhost::Instance> found;
        if (kind != 1) {
            found.push_back(computer(path.nameSpace, testsupport::text("testhost")));
        }
        if (kind == 2) {
            found.push_back(computer(path.nameSpace, cimhost::Value::stringWithoutCharacters()));
        }
        return cimhost::Response::ofInstances(std::move(found));
    }

private:
    static cimhost::Instance computer(const std::string& nameSpace, const cimhost::Value& name) {
        return {{"", nameSpace, computerClass, {{"Name", name}}}, {{"Name", name}}};
    }

    std::size_t kind = 0;
};

cimhost::ClassInfoLookup classes() {
    static const cimhost::ClassInfoLookup known = [] {
        cimhost::Schema schema;
        cimhost::MofReader(schema).readFile(SCHEMA_MOF);
        return cimhost::classInfos(schema);
    }();
    return known;
}

/** The object manager with nothing but its broker. It stays, because what is tried may keep the broker. */
struct Manager {
    static Manager& only() {
        static Manager& manager = *new Manager;
        return manager;
    }

    Computers computers{};
    cimhost::Broker broker{{classes(), &computers, {}, nullptr, true}};
    Interfaces interfaces = openInterfaces(broker.handle());
};

/** The instance that the action passes; null where it passes none. */
const CMPIInstance* instanceOf(const Call& call, cimhost::RequestScope& scope) {
    return call.instance ? scope.instance(*call.instance) : nullptr;
}

CMPIStatus perform(const Interfaces& interfaces, const Call& call, cimhost::RequestScope& scope,
                   const CMPIContext* context, const CMPIResult* result) {
    CMPIInstanceMI* const instances = interfaces.instances;
    CMPIAssociationMI* const associations = interfaces.associations;
    const CMPIObjectPath* path = scope.objectPath(call.path);
    cimhost::Request request;
    request.properties = call.properties;
    request.filter = call.filter;
    switch (call.action) {
        case Action::cleanup:
            return instances->ft->cleanup(instances, context, 0);
        case Action::associationCleanup:
            return associations->ft->cleanup(associations, context, 0);
        case Action::execQuery:
            return instances->ft->execQuery(instances, context, result, path, "WQL", nullptr);
        default:
            request.operation = static_cast<cimhost::Operation>(call.action);
            return cimhost::isAssociationOperation(request.operation)
                       ? cimhost::callOperation(associations, request, context, result, path)
                       : cimhost::callOperation(instances, request, context, result, path, instanceOf(call, scope));
    }
}

}  // namespace

std::optional<std::string> dataFile(const std::string& name) {
    std::ifstream stream(agentEnvironment::dataDirectory() / name, std::ios::binary);
    return stream
               ? std::optional<std::string>({std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()})
               : std::nullopt;
}

void writeDataFile(const std::string& name, const std::string& content) {
    std::ofstream(agentEnvironment::dataDirectory() / name, std::ios::binary) << content;
}

const Store& leaseStore() {
    static const Store store{"VELKO_Lease", "Lease.dat", testsupport::leaseFields, recordsOf<LeaseStoreTraits>,
                             countOf<LeaseStoreTraits>};
    return store;
}

const Store& warrantyStore() {
    static const Store store{"VELKO_Warranty", "Warranty.dat", testsupport::warrantyFields,
                             recordsOf<WarrantyStoreTraits>, countOf<WarrantyStoreTraits>};
    return store;
}

const Store* storeOf(const std::string& className) {
    for (const Store* store : {&leaseStore(), &warrantyStore()}) {
        if (cim::sameName(className, store->className)) {
            return store;
        }
    }
    return nullptr;
}

Subject::Subject(std::size_t computers) {
    Manager::only().computers.choose(computers);
    agentEnvironment::clear();
    restart();
}

void Subject::restart() {
    reload<LeaseStoreTraits>();
    reload<WarrantyStoreTraits>();
}

cimhost::ProviderResponse Subject::make(const Call& call) {
    if (call.action == Action::restart) {
        restart();
        return {};
    }
    Manager& manager = Manager::only();
    return cimhost::runCall(manager.broker, {},
                            [&](cimhost::RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
                                return perform(manager.interfaces, call, scope, context, result);
                            });
}

}  // namespace fuzz

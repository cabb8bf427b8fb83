#include "SystemUnderTest.h"

#include <fstream>
#include <iterator>
#include <memory>

#include "LeaseBase.h"
#include "RecordFile.h"
#include "WarrantyBase.h"
#include "cim/Names.h"
#include "schema/MofReader.h"
#include "support/AgentEnvironment.h"
#include "support/Files.h"
#include "support/Values.h"

namespace fuzz {

namespace {

using namespace KO::LeaseWarrantyProvider;

constexpr const char* computerClass = "VELKO_ComputerSystem";

/** The records in use of a store. */
template <class RecordStore>
std::vector<testsupport::ModelRecord> recordsOf() {
    std::vector<testsupport::ModelRecord> records;
    for (const auto& unit : RecordBase<RecordStore>::cache.table) {
        if (unit.inUse) {
            records.push_back(modelOf<RecordStore>(unit));
        }
    }
    return records;
}

template <class RecordStore>
unsigned int countOf() {
    return RecordBase<RecordStore>::cache.count();
}

/** Creates a table again, as when the library is loaded. */
template <class RecordStore>
void reload() {
    auto& cache = RecordBase<RecordStore>::cache;
    std::destroy_at(&cache);
    new (&cache) RecordCache<RecordStore>;
}

/** Responds to enumerations of computers. */
class Computers : public cimhost::UpCalls {
public:
    void choose(std::size_t itsKind) { kind = itsKind % SystemUnderTest::kindsOfComputers; }

    cimhost::Response perform(cimhost::Request request) override {
        if (request.operation != cimhost::Operation::enumerateInstances) {
            return cimhost::notSupported(request.operation);
        }
        const cimhost::ObjectPath& path = request.path;
        if (kind == 3 || !cim::sameName(path.className, computerClass)) {
            return cimhost::Response::failed({CMPI_RC_ERR_FAILED, "There are no computers."});
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

cimhost::ClassInfoLookup schemaClasses() {
    static const cimhost::ClassInfoLookup known = [] {
        cimhost::Schema schema;
        cimhost::MofReader(schema).readFile(SCHEMA_MOF);
        return cimhost::classInfos(schema);
    }();
    return known;
}

/** The broker. It is never destroyed, because the system under test may keep a pointer to it. */
struct Manager {
    static Manager& only() {
        static Manager& manager = *new Manager;
        return manager;
    }

    /** Terminates the provider, and opens it again without data files. */
    void restartWithoutFiles() {
        {
            cimhost::RequestScope scope(broker);
            const CMPIContext* context = scope.context({});
            interfaces.instances->ft->cleanup(interfaces.instances, context, 1);
            interfaces.associations->ft->cleanup(interfaces.associations, context, 1);
        }
        agentEnvironment::clear();
        interfaces = openInterfaces(broker.handle());
    }

    Computers computers{};
    cimhost::Broker broker{{schemaClasses(), &computers, {}, nullptr, true}};
    Interfaces interfaces = openInterfaces(broker.handle());
};

/** The instance of a call; null if it has none. */
const CMPIInstance* instanceOf(const Call& call, cimhost::RequestScope& scope) {
    return call.hasInstance ? scope.instance(call.request.instance) : nullptr;
}

CMPIStatus callFunction(const Interfaces& interfaces, const Call& call, cimhost::RequestScope& scope,
                        const CMPIContext* context, const CMPIResult* result) {
    CMPIInstanceMI* const instances = interfaces.instances;
    CMPIAssociationMI* const associations = interfaces.associations;
    if (call.event) {
        return *call.event == Event::cleanup ? instances->ft->cleanup(instances, context, 0)
                                             : associations->ft->cleanup(associations, context, 0);
    }
    const CMPIObjectPath* path = scope.objectPath(call.request.path);
    if (call.performs(cimhost::Operation::execQuery)) {
        return instances->ft->execQuery(instances, context, result, path, "WQL", nullptr);
    }
    return cimhost::isAssociationOperation(call.request.operation)
               ? cimhost::callOperation(associations, call.request, context, result, path)
               : cimhost::callOperation(instances, call.request, context, result, path, instanceOf(call, scope));
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

SystemUnderTest::SystemUnderTest(std::size_t computers) {
    Manager::only().computers.choose(computers);
    Manager::only().restartWithoutFiles();
    restart();
}

void SystemUnderTest::restart() {
    reload<LeaseStoreTraits>();
    reload<WarrantyStoreTraits>();
}

cimhost::ProviderResponse SystemUnderTest::perform(const Call& call) {
    if (call.event == Event::restart) {
        restart();
        return {};
    }
    Manager& manager = Manager::only();
    return cimhost::runCall(manager.broker, {},
                            [&](cimhost::RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
                                return callFunction(manager.interfaces, call, scope, context, result);
                            });
}

}  // namespace fuzz

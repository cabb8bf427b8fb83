#include "Subject.h"

#include "LeaseBase.h"
#include "RecordFile.h"
#include "WarrantyBase.h"
#include "broker/PropertyLists.h"
#include "operations/ClassShapes.h"
#include "schema/MofReader.h"
#include "schema/Names.h"
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

const char* charactersOf(const std::optional<std::string>& text) {
    return text ? text->c_str() : nullptr;
}

/** What the object manager knows of computers: that of the agent; none; two, one without a name; or it fails. */
class Computers : public cimhost::UpCalls {
public:
    void choose(std::size_t itsKind) { kind = itsKind % 4; }

    cimhost::Answer<std::vector<cimhost::Instance>> enumerateInstances(const cimhost::ContextEntries&,
                                                                       const cimhost::ObjectPath& path,
                                                                       const cimhost::PropertyList&) override {
        if (kind == 3 || !cimhost::sameName(path.className, computerClass)) {
            return {{CMPI_RC_ERR_FAILED, "no computers"}, {}};
        }
        std::vector<cimhost::Instance> found;
        if (kind != 1) {
            found.push_back(computer(path.nameSpace, testsupport::text("testhost")));
        }
        if (kind == 2) {
            found.push_back(computer(path.nameSpace, cimhost::hollowText(false)));
        }
        return {{}, std::move(found)};
    }

private:
    static cimhost::Instance computer(const std::string& nameSpace, const cimhost::Value& name) {
        return {{"", nameSpace, computerClass, {{"Name", name}}}, {{"Name", name}}};
    }

    std::size_t kind = 0;
};

cimhost::ClassShapeLookup shapes() {
    static const cimhost::ClassShapeLookup known = [] {
        cimhost::Schema schema;
        cimhost::MofReader(schema).readFile(SCHEMA_MOF);
        return cimhost::classShapes(schema);
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
    cimhost::Broker broker{{shapes(), &computers, {}, nullptr, {}}};
    Interfaces interfaces = openInterfaces(broker.handle());
};

/** What a function of the tables is called with. */
struct Arguments {
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    const CMPIInstance* instance;
    const char** properties;
};

CMPIStatus callInstances(CMPIInstanceMI* mi, const Call& call, const Arguments& with) {
    const CMPIInstanceMIFT& table = *mi->ft;
    switch (call.action) {
        case Action::enumerateInstances:
            return table.enumerateInstances(mi, with.context, with.result, with.path, with.properties);
        case Action::enumerateInstanceNames:
            return table.enumerateInstanceNames(mi, with.context, with.result, with.path);
        case Action::getInstance:
            return table.getInstance(mi, with.context, with.result, with.path, with.properties);
        case Action::createInstance:
            return table.createInstance(mi, with.context, with.result, with.path, with.instance);
        case Action::modifyInstance:
            return table.modifyInstance(mi, with.context, with.result, with.path, with.instance, with.properties);
        case Action::deleteInstance:
            return table.deleteInstance(mi, with.context, with.result, with.path);
        case Action::execQuery:
            return table.execQuery(mi, with.context, with.result, with.path, "WQL", nullptr);
        default:
            return table.cleanup(mi, with.context, 0);
    }
}

CMPIStatus callAssociations(CMPIAssociationMI* mi, const Call& call, const Arguments& with) {
    const CMPIAssociationMIFT& table = *mi->ft;
    const char* association = charactersOf(call.filter.associationClass);
    const char* resultClass = charactersOf(call.filter.resultClass);
    const char* role = charactersOf(call.filter.role);
    const char* resultRole = charactersOf(call.filter.resultRole);
    switch (call.action) {
        case Action::associators:
            return table.associators(mi, with.context, with.result, with.path, association, resultClass, role,
                                     resultRole, with.properties);
        case Action::associatorNames:
            return table.associatorNames(mi, with.context, with.result, with.path, association, resultClass, role,
                                         resultRole);
        case Action::references:
            return table.references(mi, with.context, with.result, with.path, resultClass, role, with.properties);
        case Action::referenceNames:
            return table.referenceNames(mi, with.context, with.result, with.path, resultClass, role);
        default:
            return table.cleanup(mi, with.context, 0);
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
        if (cimhost::sameName(className, store->className)) {
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

cimhost::RawAnswer Subject::make(const Call& call) {
    if (call.action == Action::restart) {
        restart();
        return {};
    }
    Manager& manager = Manager::only();
    return cimhost::runCall(
        manager.broker, {}, [&](cimhost::RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
            cimhost::CPropertyList properties(call.properties);
            const CMPIInstance* instance = call.instance ? scope.instance(*call.instance) : nullptr;
            const Arguments arguments{context, result, scope.objectPath(call.path), instance, properties.get()};
            return call.action >= Action::associators
                       ? callAssociations(manager.interfaces.associations, call, arguments)
                       : callInstances(manager.interfaces.instances, call, arguments);
        });
}

}  // namespace fuzz

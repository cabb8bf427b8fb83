#include "Cases.h"

#include <utility>

namespace bench {

const std::vector<std::size_t> readSizes{10, 100, 1000, 10000, 100000};
const std::vector<std::size_t> writeSizes{10, 100, 1000, 10000};

namespace {

/** What the gate adds is told by the smaller tables. */
constexpr std::size_t largestGated = 1000;

/** A case whose floor has a table of that many rows. What the provider is loaded with is left open. */
template <class Row>
Case floorCase(std::string operation, std::size_t size, Request request) {
    Case one;
    one.operation = std::move(operation);
    one.className = Row::className;
    one.size = size;
    one.request = std::move(request);
    one.floor = [size](const Workbench&, const CMPIBroker* broker) {
        return makeFloor(broker, makeRows<Row>(size), {});
    };
    return one;
}

/** A case whose provider and floor have a table of that many rows. */
template <class Row>
Case readCase(std::string operation, std::size_t size, Request request) {
    Case one = floorCase<Row>(std::move(operation), size, std::move(request));
    one.provider = [size](Workbench& bench) { return bench.loaded<Row>(size); };
    if (size <= largestGated) {
        one.twice = [size](Workbench& bench) { return bench.loadedTwice<Row>(size); };
    }
    return one;
}

/** A case whose request changes the table: each request finds the table and its file as they were made. */
template <class Row>
Case writeCase(std::string operation, std::size_t size, Request request) {
    Case one = floorCase<Row>(std::move(operation), size, std::move(request));
    one.changedFile = Row::fileName;
    one.provider = [size](Workbench& bench) { return bench.load(makeRows<Row>(size)); };
    one.floor = [size](const Workbench& bench, const CMPIBroker* broker) {
        return makeFloor(broker, makeRows<Row>(size), bench.agent().floorData() / Row::fileName);
    };
    return one;
}

template <class Row>
cimhost::ObjectPath recordPath(const std::string& instanceId) {
    cimhost::ObjectPath path = classPath(Row::className);
    path.keys.push_back(textValue("InstanceID", instanceId));
    return path;
}

template <class Row>
void addReads(std::vector<Case>& cases, std::size_t size) {
    const auto got = [&](std::size_t index) { return getInstance(recordPath<Row>(instanceIdOf(index, size))); };
    cases.push_back(readCase<Row>("EnumInstances", size, enumInstances(Row::className, size)));
    cases.push_back(readCase<Row>("EnumInstanceNames", size, enumInstanceNames(Row::className, size)));
    cases.push_back(readCase<Row>("GetInstance.first", size, got(0)));
    cases.push_back(readCase<Row>("GetInstance.middle", size, got(size / 2)));
    cases.push_back(readCase<Row>("GetInstance.last", size, got(size - 1)));
}

template <class Row>
void addWrites(std::vector<Case>& cases, std::size_t size) {
    const cimhost::ObjectPath middle = recordPath<Row>(instanceIdOf(size / 2, size));
    cases.push_back(writeCase<Row>("CreateInstance", size, createInstance(recordPath<Row>("a new record"))));
    cases.push_back(writeCase<Row>("ModifyInstance", size,
                                   modifyInstance(middle, textValue(Row::modified.name, "Another Party Ltd"))));
    cases.push_back(writeCase<Row>("DeleteInstance", size, deleteInstance(middle)));
}

/** What a table costs that no machine has; of leases only, whose records are the longer ones. */
void addLargest(std::vector<Case>& cases) {
    using Row = LeaseRow;
    const cimhost::ObjectPath middle = recordPath<Row>(instanceIdOf(largestSize / 2, largestSize));
    cases.push_back(readCase<Row>("EnumInstances", largestSize, enumInstances(Row::className, largestSize)));
    cases.push_back(readCase<Row>("EnumInstanceNames", largestSize, enumInstanceNames(Row::className, largestSize)));
    cases.push_back(readCase<Row>("GetInstance.middle", largestSize, getInstance(middle)));
    cases.push_back(writeCase<Row>("ModifyInstance", largestSize,
                                   modifyInstance(middle, textValue(Row::modified.name, "Another Party Ltd"))));
}

template <class Row>
void addRecords(std::vector<Case>& cases) {
    for (const std::size_t size : readSizes) {
        addReads<Row>(cases, size);
    }
    for (const std::size_t size : writeSizes) {
        addWrites<Row>(cases, size);
    }
}

/** The cases of a product class, which is served without records. */
template <class Row>
void addProduct(std::vector<Case>& cases) {
    cimhost::ObjectPath path = classPath(Row::className);
    for (const Row& row : makeRows<Row>(1)) {
        for (const auto& key : Row::keys) {
            path.keys.push_back(textValue(key.name, row.*key.member));
        }
    }
    for (auto& [operation, request] :
         {std::pair{"EnumInstances", enumInstances(Row::className, 1)}, std::pair{"GetInstance", getInstance(path)}}) {
        Case one = floorCase<Row>(operation, 1, request);
        one.provider = [](Workbench& bench) { return bench.loaded<LeaseRow>(10); };
        cases.push_back(std::move(one));
    }
}

Case associationCase(std::string operation, std::size_t computers, Request request) {
    constexpr std::size_t size = 1000;
    Case one = readCase<LeaseRow>(std::move(operation), size, std::move(request));
    one.className = "VELKO_LeaseSetting";
    one.twice = nullptr;  // its answers are others
    one.computers = computers;
    one.floor = [](const Workbench&, const CMPIBroker* broker) {
        return makeAssociationFloor(broker, makeRows<LeaseRow>(size));
    };
    return one;
}

}  // namespace

std::vector<Case> recordCases() {
    std::vector<Case> cases;
    addRecords<LeaseRow>(cases);
    addLargest(cases);
    addRecords<WarrantyRow>(cases);
    return cases;
}

std::vector<Case> productCases() {
    std::vector<Case> cases;
    addProduct<AgentRow>(cases);
    addProduct<AssetRow>(cases);
    return cases;
}

std::vector<Case> associationCases() {
    cimhost::ObjectPath computer = classPath("VELKO_ComputerSystem");
    computer.keys.push_back(textValue("Name", names::computer));
    const cimhost::ObjectPath lease = recordPath<LeaseRow>(names::computerNode);
    // From a lease, the last computer is left out: one computer gives no answer, two give one.
    return {
        associationCase("AssociatorNames.fromComputer", 1, associatorNames(computer, 1)),
        associationCase("Associators.fromComputer", 1, associators(computer, 1)),
        associationCase("AssociatorNames.fromLease", 1, associatorNames(lease, 0)),
        associationCase("Associators.fromLease", 1, associators(lease, 0)),
        associationCase("AssociatorNames.fromLeaseOfTwo", 2, associatorNames(lease, 1)),
        associationCase("Associators.fromLeaseOfTwo", 2, associators(lease, 1)),
        associationCase("EnumInstanceNames", 1, enumInstanceNames("VELKO_LeaseSetting", 1000)),
    };
}

}  // namespace bench

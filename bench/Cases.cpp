#include "Cases.h"

#include <utility>

namespace bench {

const std::vector<std::size_t> readSizes{10, 100, 1000, 10000, 100000};
const std::vector<std::size_t> writeSizes{10, 100, 1000, 10000};

namespace {

using cimhost::ObjectPath;
using cimhost::Request;

/** Larger tables are not measured behind the gate, because its share of the time does not depend on the size. */
constexpr std::size_t largestGated = 1000;

/** A case whose baseline has a table of this many rows. The caller sets the provider. */
template <class Row>
Case baselineCase(std::string operation, std::size_t size, ExpectedRequest request) {
    Case one;
    one.operation = std::move(operation);
    one.className = Row::className;
    one.size = size;
    one.request = std::move(request);
    one.baseline = [size](const Environment&, const CMPIBroker* broker) {
        return makeBaseline(broker, makeRows<Row>(size), {});
    };
    return one;
}

/** A case whose provider and baseline have a table of this many rows. */
template <class Row>
Case readCase(std::string operation, std::size_t size, ExpectedRequest request) {
    Case one = baselineCase<Row>(std::move(operation), size, std::move(request));
    one.provider = [size](Environment& environment) { return environment.loaded<Row>(size); };
    if (size <= largestGated) {
        one.twice = [size](Environment& environment) { return environment.loadedTwice<Row>(size); };
    }
    return one;
}

/** A case whose request changes the table. Each request starts with the initial table. */
template <class Row>
Case writeCase(std::string operation, std::size_t size, ExpectedRequest request) {
    Case one = baselineCase<Row>(std::move(operation), size, std::move(request));
    one.changedFile = Row::fileName;
    one.provider = [size](Environment& environment) { return environment.load(makeRows<Row>(size)); };
    one.baseline = [size](const Environment& environment, const CMPIBroker* broker) {
        return makeBaseline(broker, makeRows<Row>(size), environment.agent().baselineData() / Row::fileName);
    };
    return one;
}

template <class Row>
ObjectPath recordOf(std::size_t index, std::size_t size) {
    return recordPath(Row::className, instanceIdOf(index, size));
}

template <class Row>
void addEnumerations(std::vector<Case>& cases, std::size_t size) {
    const ObjectPath path = classPath(Row::className);
    cases.push_back(readCase<Row>("EnumInstances", size, {Request::enumerateInstances(path), size}));
    cases.push_back(readCase<Row>("EnumInstanceNames", size, {Request::enumerateInstanceNames(path), size}));
}

template <class Row>
void addGet(std::vector<Case>& cases, const char* operation, std::size_t index, std::size_t size) {
    cases.push_back(readCase<Row>(operation, size, {Request::getInstance(recordOf<Row>(index, size)), 1}));
}

template <class Row>
void addModification(std::vector<Case>& cases, std::size_t size) {
    const auto value = namedString(Row::modified.name, "Another Party Ltd");
    cases.push_back(writeCase<Row>("ModifyInstance", size, {modification(recordOf<Row>(size / 2, size), value)}));
}

template <class Row>
void addReads(std::vector<Case>& cases, std::size_t size) {
    addEnumerations<Row>(cases, size);
    addGet<Row>(cases, "GetInstance.first", 0, size);
    addGet<Row>(cases, "GetInstance.middle", size / 2, size);
    addGet<Row>(cases, "GetInstance.last", size - 1, size);
}

template <class Row>
void addWrites(std::vector<Case>& cases, std::size_t size) {
    const ObjectPath added = recordPath(Row::className, "a new record");
    cases.push_back(writeCase<Row>("CreateInstance", size, {creation(added), 1}));
    addModification<Row>(cases, size);
    cases.push_back(writeCase<Row>("DeleteInstance", size, {Request::deleteInstance(recordOf<Row>(size / 2, size))}));
}

/** Adds the cases of a table larger than in practice. It has leases, whose records are longer than warranties. */
void addLargest(std::vector<Case>& cases) {
    addEnumerations<LeaseRow>(cases, largestSize);
    addGet<LeaseRow>(cases, "GetInstance.middle", largestSize / 2, largestSize);
    addModification<LeaseRow>(cases, largestSize);
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

/** The cases of a product class, which has no records. */
template <class Row>
void addProduct(std::vector<Case>& cases) {
    const ObjectPath path = productPath(makeRows<Row>(1).front());
    for (const auto& [operation, request] :
         {std::pair{"EnumInstances", Request::enumerateInstances(classPath(Row::className))},
          std::pair{"GetInstance", Request::getInstance(path)}}) {
        Case one = baselineCase<Row>(operation, 1, {request, 1});
        one.provider = [](Environment& environment) { return environment.loaded<LeaseRow>(10); };
        cases.push_back(std::move(one));
    }
}

Case associationCase(std::string operation, std::size_t computers, ExpectedRequest request, std::size_t size = 1000) {
    Case one = readCase<LeaseRow>(std::move(operation), size, std::move(request));
    one.className = names::leaseSettingClass;
    one.twice = nullptr;  // the gate's results differ from the provider's
    one.computers = computers;
    one.baseline = [size](const Environment&, const CMPIBroker* broker) {
        return makeAssociationBaseline(broker, makeRows<LeaseRow>(size));
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
    const ObjectPath computer = computerPath(names::computer);
    const ObjectPath lease = recordPath(LeaseRow::className, names::computerNode);
    const cimhost::AssociationFilter filter = leaseSettings();
    const Request namesOfComputer = Request::associatorNames(computer, filter);
    const Request ofComputer = Request::associators(computer, filter);
    const Request namesOfLease = Request::associatorNames(lease, filter);
    const Request ofLease = Request::associators(lease, filter);
    // When it starts at a lease, the provider omits the last computer: with one computer it returns none, with two only
    // the first.
    return {
        associationCase("AssociatorNames.fromComputer", 1, {namesOfComputer, 1}, 10),
        associationCase("AssociatorNames.fromComputer", 1, {namesOfComputer, 1}),
        associationCase("AssociatorNames.fromComputer", 1, {namesOfComputer, 1}, largestSize),
        associationCase("Associators.fromComputer", 1, {ofComputer, 1}),
        associationCase("AssociatorNames.fromLease", 1, {namesOfLease, 0}),
        associationCase("Associators.fromLease", 1, {ofLease, 0}),
        associationCase("AssociatorNames.fromLeaseOfTwo", 2, {namesOfLease, 1}),
        associationCase("Associators.fromLeaseOfTwo", 2, {ofLease, 1}),
        associationCase("EnumInstanceNames", 1,
                        {Request::enumerateInstanceNames(classPath(names::leaseSettingClass)), 1000}),
    };
}

}  // namespace bench

#include "TranscriptScenarios.h"

#include <algorithm>
#include <iterator>

namespace contract {

namespace {

using testsupport::boolean;
using testsupport::dateTime;
using testsupport::named;
using testsupport::text;
using testsupport::uint32;

constexpr const char* agentClass = "VELKO_OstrelAgent";
constexpr const char* assetsClass = "VELKO_AssetIDDetails";
constexpr const char* unknownClass = "VELKO_NoSuchClass";

/** Returns new values for all modifiable properties of a record and for a read-only property. */
std::vector<NamedValue> changesOf(const AssociationKind& kind) {
    if (std::string(kind.element) == leases.element) {
        return {named("Caption", text("not changeable")),
                named("Lessor", text("Other Lessor")),
                named("BaseTermCommencementDate", dateTime("20270101000000.000000+000")),
                named("LeaseTerm", uint32(48)),
                named("EarlyTerminationOption", boolean(true)),
                named("FixedPricePurchaseOption", boolean(false)),
                named("RenewalOption", boolean(true)),
                named("BargainRenewalOption", boolean(false)),
                named("BaseRent", text("99.00 EUR")),
                named("FairMarketRental", text("100.00 EUR")),
                named("FairMarketValue", text("2000.00 EUR")),
                named("TerminationValue", text("500.00 EUR")),
                named("NetMonthlyLeaseRateFactor", uint32(3))};
    }
    return {named("Caption", text("not changeable")), named("WarrantyStartDate", dateTime("20270101000000.000000+000")),
            named("WarrantyDuration", uint32(36)), named("Warrantor", text("Other Warrantor"))};
}

Instance changed(const ObjectPath& path, std::vector<NamedValue> properties) {
    return clientInstance(path, std::move(properties));
}

/** Returns a scenario in which the record "A" of a class is loaded. */
Scenario withRecord(const AssociationKind& kind, const std::string& action,
                    std::function<void(testsupport::ProviderLibrary&, const AssociationKind&)> act) {
    return {std::string(kind.element).substr(6) + "-" + action, [kind, act](TranscriptTest& test) {
                test.writeData(kind.dataFile, recordFile(kind, {"A"}));
                act(test.begin(), kind);
            }};
}

/** Returns such a scenario, in which the data file cannot be opened after loading. */
Scenario unwritable(const AssociationKind& kind, const std::string& action,
                    std::function<void(testsupport::ProviderLibrary&, const AssociationKind&)> act) {
    return {std::string(kind.element).substr(6) + "-" + action + "-unwritable", [kind, act](TranscriptTest& test) {
                test.writeData(kind.dataFile, recordFile(kind, {"A"}));
                auto& provider = test.begin();
                test.blockData(kind.dataFile);
                act(provider, kind);
            }};
}

using Library = testsupport::ProviderLibrary;

void enumerateNames(Library& provider, const AssociationKind& kind) {
    provider.enumerateInstanceNames(classPath(kind.element));
}

void enumerate(Library& provider, const AssociationKind& kind) {
    provider.enumerateInstances(classPath(kind.element));
}

void create(Library& provider, const ObjectPath& path) {
    provider.createInstance(path, clientInstance(path, {}));
}

void modify(Library& provider, const AssociationKind& kind, const std::string& identifier,
            const cimhost::PropertyList& properties = {}) {
    const ObjectPath path = keyedPath(kind.element, identifier);
    provider.modifyInstance(path, changed(path, changesOf(kind)), properties);
}

/** A property list, which is traced but not applied. */
const cimhost::PropertyList oneProperty(std::vector<std::string>{"Caption"});

std::vector<Scenario> ofRecords(const AssociationKind& kind) {
    const std::string prefix = std::string(kind.element).substr(6) + "-";
    const auto with = [&](const char* action, auto act) { return withRecord(kind, action, act); };
    return {
        {prefix + "enumerate-none", [kind](TranscriptTest& test) { enumerate(test.begin(), kind); }},
        with("enumerate-names", enumerateNames),
        with("enumerate", enumerate),
        with("get", [](Library& p, const AssociationKind& s) { p.getInstance(keyedPath(s.element, "A")); }),
        with("get-listed",
             [](Library& p, const AssociationKind& s) { p.getInstance(keyedPath(s.element, "A"), oneProperty); }),
        with("get-absent", [](Library& p, const AssociationKind& s) { p.getInstance(keyedPath(s.element, "B")); }),
        with("create", [](Library& p, const AssociationKind& s) { create(p, keyedPath(s.element, "B")); }),
        {prefix + "create-first", [kind](TranscriptTest& test) { create(test.begin(), keyedPath(kind.element, "B")); }},
        with("create-duplicate", [](Library& p, const AssociationKind& s) { create(p, keyedPath(s.element, "A")); }),
        with("create-without-key", [](Library& p, const AssociationKind& s) { create(p, classPath(s.element)); }),
        unwritable(kind, "create", [](Library& p, const AssociationKind& s) { create(p, keyedPath(s.element, "B")); }),
        with("modify", [](Library& p, const AssociationKind& s) { modify(p, s, "A"); }),
        with("modify-listed", [](Library& p, const AssociationKind& s) { modify(p, s, "A", oneProperty); }),
        with("modify-absent", [](Library& p, const AssociationKind& s) { modify(p, s, "B"); }),
        with("delete", [](Library& p, const AssociationKind& s) { p.deleteInstance(keyedPath(s.element, "A")); }),
        with("delete-absent",
             [](Library& p, const AssociationKind& s) { p.deleteInstance(keyedPath(s.element, "B")); }),
        with("delete-without-key",
             [](Library& p, const AssociationKind& s) { p.deleteInstance(classPath(s.element)); }),
        unwritable(kind, "delete",
                   [](Library& p, const AssociationKind& s) { p.deleteInstance(keyedPath(s.element, "A")); }),
    };
}

/** Returns a scenario of an association with the records "/system/computer", which belongs to the computer, and "B". */
Scenario ofAssociation(const AssociationKind& kind, const std::string& action,
                       const std::vector<std::string>& computers,
                       std::function<void(Library&, const AssociationKind&)> act) {
    return {std::string(kind.association).substr(6) + "-" + action, [kind, computers, act](TranscriptTest& test) {
                test.writeData(kind.dataFile, recordFile(kind, {ofAlpha, "B"}));
                test.setComputers(computers);
                act(test.begin(), kind);
            }};
}

cimhost::AssociationFilter through(const AssociationKind& kind) {
    return {kind.association, {}, {}, {}};
}

std::function<void(Library&, const AssociationKind&)> namesFrom(
    std::function<ObjectPath(const AssociationKind&)> source) {
    return [source](Library& provider, const AssociationKind& kind) {
        provider.associatorNames(source(kind), through(kind));
    };
}

std::function<void(Library&, const AssociationKind&)> instancesFrom(
    std::function<ObjectPath(const AssociationKind&)> source, const cimhost::PropertyList& properties = {}) {
    return [=](Library& provider, const AssociationKind& kind) {
        provider.associators(source(kind), through(kind), properties);
    };
}

ObjectPath theComputer(const AssociationKind&) {
    return computerPath("testhost");
}

ObjectPath theElement(const AssociationKind& kind) {
    return keyedPath(kind.element, ofAlpha);
}

ObjectPath computerWithoutName(const AssociationKind&) {
    return testsupport::objectPath(nameSpace, "VELKO_ComputerSystem", {named("SystemName", text("testhost"))});
}

std::vector<Scenario> ofAssociations(const AssociationKind& kind) {
    const auto of = [&](const char* action, const std::vector<std::string>& computers, auto act) {
        return ofAssociation(kind, action, computers, act);
    };
    const auto list = [](Library& p, const AssociationKind& s) { p.enumerateInstanceNames(classPath(s.association)); };
    const auto listInstances = [](Library& p, const AssociationKind& s) {
        p.enumerateInstances(classPath(s.association));
    };
    return {
        of("enumerate-names", {"testhost"}, list),
        of("enumerate", {"testhost"}, listInstances),
        of("enumerate-listed", {"testhost"},
           [](Library& p, const AssociationKind& s) { p.enumerateInstances(classPath(s.association), oneProperty); }),
        of("enumerate-names-two-computers", {"testhost", "second"}, list),
        of("enumerate-names-no-computer", {}, list),
        of("get", {"testhost"},
           [](Library& p, const AssociationKind& s) {
               p.getInstance(testsupport::objectPath(nameSpace, s.association,
                                                     {named("Antecedent", testsupport::reference(computerPath())),
                                                      named("Dependent", testsupport::reference(theElement(s)))}));
           }),
        of("names-from-computer", {"testhost"}, namesFrom(theComputer)),
        of("from-computer", {"testhost"}, instancesFrom(theComputer)),
        of("from-computer-listed", {"testhost"}, instancesFrom(theComputer, oneProperty)),
        of("names-from-unknown-computer", {"testhost"},
           namesFrom([](const AssociationKind&) { return computerPath("other"); })),
        of("names-from-computer-class", {"testhost"},
           namesFrom([](const AssociationKind&) { return classPath("VELKO_ComputerSystem"); })),
        of("names-from-computer-without-name", {"testhost"}, namesFrom(computerWithoutName)),
        of("names-from-element", {"testhost", "second"}, namesFrom(theElement)),
        of("from-element", {"testhost", "second"}, instancesFrom(theElement)),
        of("from-element-listed", {"testhost", "second"}, instancesFrom(theElement, oneProperty)),
        of("names-from-element-one-computer", {"testhost"}, namesFrom(theElement)),
        of("names-from-element-no-computer", {}, namesFrom(theElement)),
        of("names-from-element-without-place", {"testhost", "second"},
           namesFrom([](const AssociationKind& s) { return keyedPath(s.element, "B"); })),
        of("names-from-element-without-identifier", {"testhost", "second"}, namesFrom([](const AssociationKind& s) {
               return testsupport::objectPath(nameSpace, s.element, {named("Other", text("B"))});
           })),
        of("names-from-other-element", {"testhost", "second"},
           namesFrom([](const AssociationKind& s) { return keyedPath(s.otherElement, ofAlpha); })),
    };
}

ObjectPath agentPath(const std::string& vendor) {
    return testsupport::objectPath(
        nameSpace, agentClass,
        {named("Name", text("Test Agent")), named("IdentifyingNumber", text("ID-1")),
         named("ProductName", text("Test Agent")), named("Vendor", text(vendor)), named("Version", text("4.2.0"))});
}

ObjectPath assetPath(const std::string& version) {
    return testsupport::objectPath(nameSpace, assetsClass,
                                   {named("IdentifyingNumber", text("/system")), named("Name", text("testhost")),
                                    named("Vendor", text("Example Maker")), named("Version", text(version))});
}

void modifyAsset(Library& provider) {
    const ObjectPath path = assetPath("4.2.0");
    provider.modifyInstance(
        path, changed(path, {named("AssetNumber", text("A-2")), named("PersonalizedLabel1", text("Room")),
                             named("PersonalizedData1", text("5")), named("PrimaryOwnerName", text("Bob")),
                             named("PrimaryOwnerPhone", text("12")), named("PrimaryOwnerPosition", text("Clerk")),
                             named("PrimaryOwnerDepartment", text("Law")),
                             named("LastInventoried", dateTime("20260102030405.000000+060")),
                             named("PurchaseDate", dateTime("20250101000000.000000+000")),
                             named("SystemLocation", text("Hall")), named("ZOPMProfile", text("gold")),
                             named("ZOPMUpdateTime", dateTime("20260708091011.000000+000"))}));
}

std::vector<Scenario> ofProducts() {
    const auto with = [](const char* action, std::function<void(Library&)> act) {
        return Scenario{action, [act](TranscriptTest& test) {
                            test.writeData("asset.dat", "USER.AssetNumber=A-1\nUSER.PersonalizedLabel2=Shelf\n");
                            act(test.begin());
                        }};
    };
    const auto unreadable = [](const char* action, std::function<void(Library&)> act) {
        return Scenario{action, [act](TranscriptTest& test) {
                            test.blockData("asset.dat");
                            act(test.begin());
                        }};
    };
    return {
        with("OstrelAgent-enumerate-names", [](Library& p) { p.enumerateInstanceNames(classPath(agentClass)); }),
        with("OstrelAgent-enumerate", [](Library& p) { p.enumerateInstances(classPath(agentClass)); }),
        with("OstrelAgent-get", [](Library& p) { p.getInstance(agentPath("VEL")); }),
        with("OstrelAgent-get-other-vendor", [](Library& p) { p.getInstance(agentPath("other")); }),
        with("AssetIDDetails-enumerate-names", [](Library& p) { p.enumerateInstanceNames(classPath(assetsClass)); }),
        with("AssetIDDetails-enumerate", [](Library& p) { p.enumerateInstances(classPath(assetsClass)); }),
        with("AssetIDDetails-get", [](Library& p) { p.getInstance(assetPath("4.2.0")); }),
        with("AssetIDDetails-get-other-version", [](Library& p) { p.getInstance(assetPath("other")); }),
        with("AssetIDDetails-modify", modifyAsset),
        unreadable("AssetIDDetails-enumerate-unreadable",
                   [](Library& p) { p.enumerateInstances(classPath(assetsClass)); }),
        unreadable("AssetIDDetails-modify-unwritable", modifyAsset),
    };
}

/** Makes every dispatched request with an unknown class. */
void allOnUnknownClass(Library& provider) {
    const ObjectPath path = classPath(unknownClass);
    const cimhost::AssociationFilter filter{unknownClass, {}, {}, {}};
    provider.enumerateInstanceNames(path);
    provider.enumerateInstances(path);
    provider.getInstance(path);
    create(provider, path);
    provider.modifyInstance(path, clientInstance(path, {}));
    provider.deleteInstance(path);
    provider.associatorNames(path, filter);
    provider.associators(path, filter);
}

void allThatIsOnlyNoted(Library& provider) {
    const ObjectPath path = classPath("VELKO_Lease");
    const cimhost::AssociationFilter filter{{}, "VELKO_LeaseSetting", {}, {}};
    provider.execQuery(path, "WQL", "SELECT * FROM VELKO_Lease");
    provider.references(path, filter);
    provider.referenceNames(path, filter);
    provider.cleanupInstanceMI(true);
    provider.cleanupAssociationMI(true);
}

std::vector<Scenario> ofTheLibrary() {
    const auto writeRecords = [](TranscriptTest& test) {
        test.writeData(leases.dataFile, recordFile(leases, {"A", "B"}));
        test.writeData(warranties.dataFile, recordFile(warranties, {"A"}));
    };
    return {
        {"load-without-files", [](TranscriptTest& test) { test.provider(); }, false},
        {"load-with-zero-counts",
         [](TranscriptTest& test) {
             test.writeData(leases.dataFile, recordFile(leases, {}));
             test.writeData(warranties.dataFile, recordFile(warranties, {}));
             test.provider();
         },
         false},
        {"load-with-records",
         [writeRecords](TranscriptTest& test) {
             writeRecords(test);
             test.provider();
         },
         false},
        {"unload",
         [writeRecords](TranscriptTest& test) {
             writeRecords(test);
             test.begin();
             test.unload();
         },
         false},
        {"only-noted", [](TranscriptTest& test) { allThatIsOnlyNoted(test.begin()); }, false},
        {"unknown-class", [](TranscriptTest& test) { allOnUnknownClass(test.begin()); }},
    };
}

}  // namespace

const std::vector<Scenario>& scenarios() {
    static const std::vector<Scenario> all = [] {
        std::vector<Scenario> made;
        for (const auto& some : {ofTheLibrary(), ofRecords(leases), ofRecords(warranties), ofAssociations(leases),
                                 ofAssociations(warranties), ofProducts()}) {
            std::copy(some.begin(), some.end(), std::back_inserter(made));
        }
        return made;
    }();
    return all;
}

std::vector<LogRecord> TranscriptTest::transcriptOf(const Scenario& scenario) {
    unload();
    agentEnvironment::clear();
    broker.cancelFailures();
    scenario.run(*this);
    return agentEnvironment::log();
}

testsupport::ProviderLibrary& TranscriptTest::begin() {
    provider().instanceMI();
    provider().associationMI();
    agentEnvironment::forgetLog();
    return provider();
}

void TranscriptTest::setComputers(const std::vector<std::string>& names) {
    std::vector<Instance> computers;
    std::transform(names.begin(), names.end(), std::back_inserter(computers), computerSystem);
    broker.serve("VELKO_ComputerSystem", std::move(computers));
}

}  // namespace contract

#include "OperationRows.h"

#include "Shown.h"

namespace gatetest {

namespace {

using cimhost::Operation;
using cimhost::Request;
using cimhost::lab::Manager;
using Rows = std::vector<Row>;
using Values = std::vector<NamedValue>;

/** Where managers make nothing of their own of what the provider answers. */
Bare always(const std::string& answer) {
    return {answer, answer, answer, answer};
}

/** A creation that the provider answers with the instance: taken, misread, or without a key to go by. */
Bare creation(const std::string& path, const std::string& stored, const std::string& storedWithoutKey) {
    return {path + stored, "root/cimv2[]" + stored, "manager's error 1", "manager's error 1" + storedWithoutKey};
}

/** One that it accepts and does not answer; where all it sees is an empty key, it makes a record of that. */
Bare silentCreation(const std::string& storedWithoutKey) {
    return {"manager's error 1", "died", "manager's error 1", "manager's error 1" + storedWithoutKey};
}

/** Where only the reading of references tells managers apart: one makes none of what is not supported. */
Bare unsupportedReferences() {
    return {"error 7", "error 7", "", ""};
}

Request asked(Operation operation, const ObjectPath& path, const cimhost::AssociationFilter& filter = {}) {
    Request request;
    request.operation = operation;
    request.path = path;
    request.filter = filter;
    return request;
}

Request changed(Operation operation, const ObjectPath& path, Values properties, cimhost::PropertyList list = {}) {
    Request request = asked(operation, path);
    request.instance = {path, std::move(properties)};
    request.properties = std::move(list);
    return request;
}

Request created(const ObjectPath& path, const Values& properties = {}) {
    Values all = path.keys;
    all.insert(all.end(), properties.begin(), properties.end());
    return changed(Operation::createInstance, path, std::move(all));
}

Request modified(const ObjectPath& path, Values properties, cimhost::PropertyList list = {}) {
    return changed(Operation::modifyInstance, path, std::move(properties), std::move(list));
}

Request queried(const std::string& className) {
    Request request = asked(Operation::execQuery, classPath(className));
    request.language = "WQL";
    request.query = "SELECT * FROM " + className;
    return request;
}

/** A class of records, as the rows see it. */
struct RecordKind {
    const char* className;
    const char* otherClass;
    const char* setting;
    const char* property;  ///< a text that can be changed, the first of the data file
    const char* file;
};

constexpr RecordKind recordKinds[] = {{lease, warranty, leaseSetting, "Lessor", "Lease.dat"},
                                      {warranty, lease, warrantySetting, "Warrantor", "Warranty.dat"}};

ObjectPath recordPath(const RecordKind& kind, const std::string& id) {
    return keyedPath(kind.className, id);
}

std::string allRecords(const RecordKind& kind) {
    return shown(recordPath(kind, firstPlace)) + " " + shown(recordPath(kind, "L")) + " " +
           shown(recordPath(kind, secondPlace));
}

/** That the file has changed and has these records now. */
std::string fileHas(const RecordKind& kind, const std::vector<std::string>& records) {
    std::string text = std::string("; ") + kind.file + ":";
    for (const std::string& each : records) {
        text += " " + each;
    }
    return text;
}

Rows readingRecords(const RecordKind& kind) {
    const ObjectPath all = classPath(kind.className);
    const std::string first = shown(recordPath(kind, firstPlace));
    return {
        {"enumerate", asked(Operation::enumerateInstances, all), allRecords(kind), always(allRecords(kind))},
        {"names", asked(Operation::enumerateInstanceNames, all), allRecords(kind), always(allRecords(kind))},
        {"get", asked(Operation::getInstance, recordPath(kind, "L")), shown(recordPath(kind, "L")),
         always(shown(recordPath(kind, "L")))},
        {"get absent", asked(Operation::getInstance, recordPath(kind, "none")), "error 6", always("manager's error 6")},
        {"get without key", asked(Operation::getInstance, all), "error 4", always(first)},
        {"query", queried(kind.className), "error 7", always("error 7")},
    };
}

Rows creatingRecords(const RecordKind& kind) {
    const ObjectPath fresh = recordPath(kind, "N");
    const std::string stored = fileHas(kind, {firstPlace, "L", secondPlace, "N"});
    const std::string withoutKey = fileHas(kind, {firstPlace, "L", secondPlace, "(empty)"});
    const Bare made = creation(shown(fresh), stored, withoutKey);
    const ObjectPath lossy = recordPath(kind, "N_1");
    const std::string lost = fileHas(kind, {firstPlace, "L", secondPlace, "N 1"});
    return {
        {"create", created(fresh), shown(fresh) + stored, made},
        {"create with value", created(fresh, {named(kind.property, text("ACME"))}),
         shown(fresh) + fileHas(kind, {firstPlace, "L", secondPlace, "N(ACME)"}), made},
        {"create what is there", created(recordPath(kind, "L")), "error 11", silentCreation(withoutKey)},
        {"create without key", created(classPath(kind.className)), "error 4", silentCreation(withoutKey)},
        {"create with read-only value", created(fresh, {named("ElementName", text("x"))}), "error 4", made},
        {"create what would be lost", created(lossy), "error 4", creation(shown(lossy), lost, withoutKey)},
    };
}

Rows modifyingRecords(const RecordKind& kind) {
    const ObjectPath there = recordPath(kind, "L");
    const Values change{named(kind.property, text("New"))};
    const std::string stored = fileHas(kind, {firstPlace, "L(New)", secondPlace});
    const std::string firstChanged = fileHas(kind, {std::string(firstPlace) + "(New)", "L", secondPlace});
    return {
        {"modify", modified(there, change), stored, always(stored)},
        {"modify what is listed", modified(there, change, {{kind.property}}), stored, always(stored)},
        {"modify what is not listed", modified(there, change, {{"ElementName"}}), "", always(stored)},
        {"modify to null", modified(there, {named(kind.property, testsupport::nullOf(CMPI_string))}), "", always("")},
        {"modify absent", modified(recordPath(kind, "none"), change), "error 6", always("")},
        {"modify without key", modified(classPath(kind.className), change), "error 4", always(firstChanged)},
        {"modify read-only", modified(there, {named("ElementName", text("x"))}), "error 4", always("")},
    };
}

Rows deletingRecords(const RecordKind& kind) {
    const std::string stored = fileHas(kind, {firstPlace, secondPlace});
    return {
        {"delete", asked(Operation::deleteInstance, recordPath(kind, "L")), stored, always(stored)},
        {"delete absent", asked(Operation::deleteInstance, recordPath(kind, "none")), "error 6", always("")},
        {"delete without key", asked(Operation::deleteInstance, classPath(kind.className)), "error 4", always("")},
    };
}

/** The path of a class that describes a product, with the agent's version. */
ObjectPath assetPath(const std::string& computer) {
    return testsupport::objectPath(nameSpace, asset,
                                   {named("IdentifyingNumber", text("/system")), named("Name", text(computer)),
                                    named("Vendor", text("Example Maker")), named("Version", text("4.2.0"))});
}

ObjectPath agentPath(const std::string& version) {
    return testsupport::objectPath(
        nameSpace, agent,
        {named("Name", text("Test Agent")), named("IdentifyingNumber", text("ID-1")),
         named("ProductName", text("Test Agent")), named("Vendor", text("VEL")), named("Version", text(version))});
}

Rows readingProducts(const std::string& all, const ObjectPath& there, const ObjectPath& absent) {
    const ObjectPath none = classPath(there.className);
    const std::string first = all.substr(0, all.find("] ") == std::string::npos ? all.size() : all.find("] ") + 1);
    return {
        {"enumerate", asked(Operation::enumerateInstances, none), all, always(all)},
        {"names", asked(Operation::enumerateInstanceNames, none), all, always(all)},
        {"get", asked(Operation::getInstance, there), shown(there), always(shown(there))},
        {"get absent", asked(Operation::getInstance, absent), "error 6", always("manager's error 6")},
        {"get without key", asked(Operation::getInstance, none), "error 4", always(first)},
        {"create", created(absent), "error 7", always("error 5")},
        {"delete", asked(Operation::deleteInstance, there), "error 7", always("error 5")},
        {"query", queried(there.className), "error 7", always("error 7")},
    };
}

Rows modifyingProducts() {
    const Values number{named("AssetNumber", text("A 1"))};
    const ObjectPath there = assetPath("alpha");
    const ObjectPath absent = assetPath("gamma");
    return {
        {"modify", modified(there, number), "; asset.dat", always("; asset.dat")},
        {"modify absent", modified(absent, number), "error 6", always("; asset.dat")},
        {"modify without key", modified(classPath(asset), number), "error 4", always("; asset.dat")},
        {"modify read-only", modified(there, {named("CSName", text("x"))}), "error 4", always("; asset.dat")},
        {"modify agent", modified(agentPath("4.2.0"), {named("Status", text("x"))}), "error 7", always("error 5")},
    };
}

ObjectPath settingPath(const RecordKind& kind, const std::string& computer, const std::string& id) {
    return testsupport::objectPath(nameSpace, kind.setting,
                                   {named("Antecedent", testsupport::reference(computerPath(computer))),
                                    named("Dependent", testsupport::reference(recordPath(kind, id)))});
}

Rows settings(const RecordKind& kind) {
    const ObjectPath all = classPath(kind.setting);
    const ObjectPath there = settingPath(kind, "beta", secondPlace);
    const ObjectPath absent = settingPath(kind, "beta", firstPlace);
    const std::string both = shown(settingPath(kind, "alpha", firstPlace)) + " " + shown(there);
    const std::string pairs = shown(settingPath(kind, "alpha", firstPlace)) + " " +
                              shown(settingPath(kind, "alpha", "L")) + " " +
                              shown(settingPath(kind, "alpha", secondPlace));
    return {
        {"enumerate", asked(Operation::enumerateInstances, all), both, always(pairs)},
        {"names", asked(Operation::enumerateInstanceNames, all), both, always(pairs)},
        {"get", asked(Operation::getInstance, there), shown(there), always("error 7")},
        {"get absent", asked(Operation::getInstance, absent), "error 6", always("error 7")},
        {"get without key", asked(Operation::getInstance, all), "error 4", always("error 7")},
        {"create", created(absent), "error 7", always("error 5")},
        {"modify", modified(there, {}), "error 7", always("error 5")},
        {"delete", asked(Operation::deleteInstance, there), "error 7", always("error 5")},
        {"query", queried(kind.setting), "error 7", always("error 7")},
    };
}

/** What belongs to an instance: the far ends, the associations, and the far ends as the provider tells them. */
struct Ends {
    const char* name;
    ObjectPath source;
    std::string far;
    std::string associations;
    std::string bare;
};

std::vector<Ends> endsOf(const RecordKind& kind) {
    const std::string alpha = shown(computerPath("alpha"));
    const std::string beta = shown(computerPath("beta"));
    const auto setting = [&](const char* computer, const char* id) { return shown(settingPath(kind, computer, id)); };
    return {
        {"first computer", computerPath("alpha"), shown(recordPath(kind, firstPlace)), setting("alpha", firstPlace),
         shown(recordPath(kind, firstPlace))},
        {"second computer", computerPath("beta"), shown(recordPath(kind, secondPlace)), setting("beta", secondPlace),
         shown(recordPath(kind, secondPlace))},
        {"absent computer", computerPath("gamma"), "", "", ""},
        {"first record", recordPath(kind, firstPlace), alpha, setting("alpha", firstPlace), alpha},
        {"second record", recordPath(kind, secondPlace), beta, setting("beta", secondPlace), alpha},
        {"record of nobody", recordPath(kind, "L"), "", "", ""},
        {"absent record", recordPath(kind, "none"), "", "", ""},
        {"other class", keyedPath(kind.otherClass, firstPlace), "", "", ""},
    };
}

Rows associations(const RecordKind& kind) {
    const cimhost::AssociationFilter byAssociation{kind.setting, {}, {}, {}};
    const cimhost::AssociationFilter byResult{{}, kind.setting, {}, {}};
    Rows rows;
    for (const Ends& each : endsOf(kind)) {
        const std::string of = std::string(" of ") + each.name;
        rows.push_back({"associators" + of, asked(Operation::associators, each.source, byAssociation), each.far,
                        always(each.bare)});
        rows.push_back({"associator names" + of, asked(Operation::associatorNames, each.source, byAssociation),
                        each.far, always(each.bare)});
        rows.push_back({"references" + of, asked(Operation::references, each.source, byResult), each.associations,
                        unsupportedReferences()});
        rows.push_back({"reference names" + of, asked(Operation::referenceNames, each.source, byResult),
                        each.associations, unsupportedReferences()});
    }
    return rows;
}

/** Roles and classes, from the first computer; the provider takes no notice of them. */
Rows filters(const RecordKind& kind) {
    struct Filter {
        const char* name;
        cimhost::AssociationFilter filter;  ///< beside the association class
        bool lets;
    };
    const Filter all[] = {
        {"own role", {{}, {}, "Antecedent", {}}, true},
        {"own role in other letters", {{}, {}, "ANTEcedent", {}}, true},
        {"other role", {{}, {}, "Dependent", {}}, false},
        {"result role", {{}, {}, {}, "Dependent"}, true},
        {"other result role", {{}, {}, {}, "Antecedent"}, false},
        {"unknown role", {{}, {}, "Nowhere", {}}, false},
        {"result class", {{}, kind.className, {}, {}}, true},
        {"other result class", {{}, kind.otherClass, {}, {}}, false},
        {"empty filters", {{}, "", "", ""}, true},
    };
    const std::string found = shown(recordPath(kind, firstPlace));
    Rows rows;
    for (Filter each : all) {
        each.filter.associationClass = kind.setting;
        for (const Operation operation : {Operation::associators, Operation::associatorNames}) {
            rows.push_back({std::string(each.name) + " of " + cimhost::nameOf(operation),
                            asked(operation, computerPath("alpha"), each.filter), each.lets ? found : "",
                            always(found)});
        }
    }
    const std::string association = shown(settingPath(kind, "alpha", firstPlace));
    for (const Operation operation : {Operation::references, Operation::referenceNames}) {
        for (const auto& [role, lets] : {std::pair("Antecedent", true), std::pair("Dependent", false)}) {
            rows.push_back({std::string("role ") + role + " of " + cimhost::nameOf(operation),
                            asked(operation, computerPath("alpha"), {{}, kind.setting, role, {}}),
                            lets ? association : "", unsupportedReferences()});
        }
    }
    return rows;
}

/** No association class: all of them. A manager that passes that on gets the provider's refusal. */
Rows anyAssociation() {
    const std::string records = shown(keyedPath(lease, firstPlace)) + " " + shown(keyedPath(warranty, firstPlace));
    const std::string both = shown(settingPath(recordKinds[0], "alpha", firstPlace)) + " " +
                             shown(settingPath(recordKinds[1], "alpha", firstPlace));
    const ObjectPath computer = computerPath("alpha");
    const Bare found{records, "error 5", records, records};
    return {
        {"associators", asked(Operation::associators, computer), records, found},
        {"associator names", asked(Operation::associatorNames, computer), records, found},
        {"references", asked(Operation::references, computer), both, unsupportedReferences()},
        {"reference names", asked(Operation::referenceNames, computer), both, unsupportedReferences()},
    };
}

void append(Rows& rows, const std::string& about, Rows more) {
    for (Row& row : more) {
        row.name = about + ": " + row.name;
        rows.push_back(std::move(row));
    }
}

}  // namespace

const std::string& Bare::under(Manager manager) const {
    switch (manager) {
        case Manager::standard:
            return standard;
        case Manager::sfcb:
            return sfcb;
        case Manager::openPegasus:
            return pegasus;
        default:
            return emptyKey;
    }
}

std::vector<std::string> recordsOfRows() {
    return {firstPlace, "L", secondPlace};
}

std::vector<Row> operationRows() {
    Rows rows;
    for (const RecordKind& kind : recordKinds) {
        for (const auto& some : {readingRecords, creatingRecords, modifyingRecords, deletingRecords}) {
            append(rows, kind.className, some(kind));
        }
        for (const auto& some : {settings, associations, filters}) {
            append(rows, kind.setting, some(kind));
        }
    }
    const std::string both = shown(assetPath("alpha")) + " " + shown(assetPath("beta"));
    append(rows, asset, readingProducts(both, assetPath("beta"), assetPath("gamma")));
    append(rows, agent, readingProducts(shown(agentPath("4.2.0")), agentPath("4.2.0"), agentPath("1.0")));
    append(rows, "products", modifyingProducts());
    append(rows, "any association", anyAssociation());
    return rows;
}

}  // namespace gatetest

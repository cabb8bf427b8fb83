#include "OperationRows.h"

#include "Formatting.h"

namespace gatetest {

namespace {

using cimhost::Operation;
using cimhost::Request;
using cimhost::lab::Manager;
using Rows = std::vector<Row>;
using Values = std::vector<NamedValue>;

/** The same response under each manager. */
BareResponse always(const std::string& answer) {
    return {answer, answer, answer, answer};
}

/**
 * A creation to which the provider responds with the instance instead of the path. One manager returns the instance's
 * path, one misreads the instance, and two fail because the instance has no usable path.
 */
BareResponse creation(const std::string& path, const std::string& stored, const std::string& storedWithoutKey) {
    return {path + stored, "root/cimv2[]" + stored, "manager's error 1", "manager's error 1" + storedWithoutKey};
}

/**
 * A creation that succeeds without a result. With a manager that passes an empty key, the provider stores a record with
 * an empty identifier.
 */
BareResponse silentCreation(const std::string& storedWithoutKey) {
    return {"manager's error 1", "died", "manager's error 1", "manager's error 1" + storedWithoutKey};
}

/** Unsupported requests for references. Some managers return success without results instead of the error. */
BareResponse unsupportedReferences() {
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

/** A class of records. */
struct RecordKind {
    const char* className;
    const char* otherClass;
    const char* setting;
    const char* property;  ///< a writable string property, the first in the data file
    const char* file;
};

constexpr RecordKind recordKinds[] = {{lease, warranty, leaseSetting, "Lessor", "Lease.dat"},
                                      {warranty, lease, warrantySetting, "Warrantor", "Warranty.dat"}};

ObjectPath recordPath(const RecordKind& kind, const std::string& id) {
    return keyedPath(kind.className, id);
}

std::string allRecords(const RecordKind& kind) {
    return formatted(recordPath(kind, firstNode)) + " " + formatted(recordPath(kind, "L")) + " " +
           formatted(recordPath(kind, secondNode));
}

/** Formats the expected change of a record file that contains these records afterwards. */
std::string fileHas(const RecordKind& kind, const std::vector<std::string>& records) {
    std::string text = std::string("; ") + kind.file + ":";
    for (const std::string& each : records) {
        text += " " + each;
    }
    return text;
}

Rows readingRecords(const RecordKind& kind) {
    const ObjectPath all = classPath(kind.className);
    const std::string first = formatted(recordPath(kind, firstNode));
    return {
        {"enumerate", asked(Operation::enumerateInstances, all), allRecords(kind), always(allRecords(kind))},
        {"names", asked(Operation::enumerateInstanceNames, all), allRecords(kind), always(allRecords(kind))},
        {"get", asked(Operation::getInstance, recordPath(kind, "L")), formatted(recordPath(kind, "L")),
         always(formatted(recordPath(kind, "L")))},
        {"get absent", asked(Operation::getInstance, recordPath(kind, "none")), "error 6", always("manager's error 6")},
        {"get without key", asked(Operation::getInstance, all), "error 4", always(first)},
        {"query", queried(kind.className), "error 7", always("error 7")},
    };
}

Rows creatingRecords(const RecordKind& kind) {
    const ObjectPath fresh = recordPath(kind, "N");
    const std::string stored = fileHas(kind, {firstNode, "L", secondNode, "N"});
    const std::string withoutKey = fileHas(kind, {firstNode, "L", secondNode, "(empty)"});
    const BareResponse made = creation(formatted(fresh), stored, withoutKey);
    const ObjectPath lossy = recordPath(kind, "N_1");
    const std::string lost = fileHas(kind, {firstNode, "L", secondNode, "N 1"});
    return {
        {"create", created(fresh), formatted(fresh) + stored, made},
        {"create with value", created(fresh, {named(kind.property, text("ACME"))}),
         formatted(fresh) + fileHas(kind, {firstNode, "L", secondNode, "N(ACME)"}), made},
        {"create existing", created(recordPath(kind, "L")), "error 11", silentCreation(withoutKey)},
        {"create without key", created(classPath(kind.className)), "error 4", silentCreation(withoutKey)},
        {"create with read-only value", created(fresh, {named("ElementName", text("x"))}), "error 4", made},
        {"create with lossy value", created(lossy), "error 4", creation(formatted(lossy), lost, withoutKey)},
    };
}

Rows modifyingRecords(const RecordKind& kind) {
    const ObjectPath existing = recordPath(kind, "L");
    const Values change{named(kind.property, text("New"))};
    const std::string stored = fileHas(kind, {firstNode, "L(New)", secondNode});
    const std::string firstChanged = fileHas(kind, {std::string(firstNode) + "(New)", "L", secondNode});
    return {
        {"modify", modified(existing, change), stored, always(stored)},
        {"modify listed property", modified(existing, change, {{kind.property}}), stored, always(stored)},
        {"modify unlisted property", modified(existing, change, {{"ElementName"}}), "", always(stored)},
        {"modify to null", modified(existing, {named(kind.property, testsupport::nullOf(CMPI_string))}), "",
         always("")},
        {"modify absent", modified(recordPath(kind, "none"), change), "error 6", always("")},
        {"modify without key", modified(classPath(kind.className), change), "error 4", always(firstChanged)},
        {"modify read-only", modified(existing, {named("ElementName", text("x"))}), "error 4", always("")},
    };
}

Rows deletingRecords(const RecordKind& kind) {
    const std::string stored = fileHas(kind, {firstNode, secondNode});
    return {
        {"delete", asked(Operation::deleteInstance, recordPath(kind, "L")), stored, always(stored)},
        {"delete absent", asked(Operation::deleteInstance, recordPath(kind, "none")), "error 6", always("")},
        {"delete without key", asked(Operation::deleteInstance, classPath(kind.className)), "error 4", always("")},
    };
}

/** Returns the path of a computer's asset data with the agent's version. */
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

Rows readingProducts(const std::string& all, const ObjectPath& existing, const ObjectPath& absent) {
    const ObjectPath none = classPath(existing.className);
    const std::string first = all.substr(0, all.find("] ") == std::string::npos ? all.size() : all.find("] ") + 1);
    return {
        {"enumerate", asked(Operation::enumerateInstances, none), all, always(all)},
        {"names", asked(Operation::enumerateInstanceNames, none), all, always(all)},
        {"get", asked(Operation::getInstance, existing), formatted(existing), always(formatted(existing))},
        {"get absent", asked(Operation::getInstance, absent), "error 6", always("manager's error 6")},
        {"get without key", asked(Operation::getInstance, none), "error 4", always(first)},
        {"create", created(absent), "error 7", always("error 5")},
        {"delete", asked(Operation::deleteInstance, existing), "error 7", always("error 5")},
        {"query", queried(existing.className), "error 7", always("error 7")},
    };
}

Rows modifyingProducts() {
    const Values number{named("AssetNumber", text("A 1"))};
    const ObjectPath existing = assetPath("alpha");
    const ObjectPath absent = assetPath("gamma");
    return {
        {"modify", modified(existing, number), "; asset.dat", always("; asset.dat")},
        {"modify absent", modified(absent, number), "error 6", always("; asset.dat")},
        {"modify without key", modified(classPath(asset), number), "error 4", always("; asset.dat")},
        {"modify read-only", modified(existing, {named("CSName", text("x"))}), "error 4", always("; asset.dat")},
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
    const ObjectPath existing = settingPath(kind, "beta", secondNode);
    const ObjectPath absent = settingPath(kind, "beta", firstNode);
    const std::string both = formatted(settingPath(kind, "alpha", firstNode)) + " " + formatted(existing);
    const std::string pairs = formatted(settingPath(kind, "alpha", firstNode)) + " " +
                              formatted(settingPath(kind, "alpha", "L")) + " " +
                              formatted(settingPath(kind, "alpha", secondNode));
    return {
        {"enumerate", asked(Operation::enumerateInstances, all), both, always(pairs)},
        {"names", asked(Operation::enumerateInstanceNames, all), both, always(pairs)},
        {"get", asked(Operation::getInstance, existing), formatted(existing), always("error 7")},
        {"get absent", asked(Operation::getInstance, absent), "error 6", always("error 7")},
        {"get without key", asked(Operation::getInstance, all), "error 4", always("error 7")},
        {"create", created(absent), "error 7", always("error 5")},
        {"modify", modified(existing, {}), "error 7", always("error 5")},
        {"delete", asked(Operation::deleteInstance, existing), "error 7", always("error 5")},
        {"query", queried(kind.setting), "error 7", always("error 7")},
    };
}

/**
 * A source instance with its expected associated objects, associations, and associated objects from the bare
 * provider.
 */
struct Ends {
    const char* name;
    ObjectPath source;
    std::string target;
    std::string associations;
    std::string bare;
};

std::vector<Ends> endsOf(const RecordKind& kind) {
    const std::string alpha = formatted(computerPath("alpha"));
    const std::string beta = formatted(computerPath("beta"));
    const auto setting = [&](const char* computer, const char* id) {
        return formatted(settingPath(kind, computer, id));
    };
    return {
        {"first computer", computerPath("alpha"), formatted(recordPath(kind, firstNode)), setting("alpha", firstNode),
         formatted(recordPath(kind, firstNode))},
        {"second computer", computerPath("beta"), formatted(recordPath(kind, secondNode)), setting("beta", secondNode),
         formatted(recordPath(kind, secondNode))},
        {"absent computer", computerPath("gamma"), "", "", ""},
        {"first record", recordPath(kind, firstNode), alpha, setting("alpha", firstNode), alpha},
        {"second record", recordPath(kind, secondNode), beta, setting("beta", secondNode), alpha},
        {"record without computer", recordPath(kind, "L"), "", "", ""},
        {"absent record", recordPath(kind, "none"), "", "", ""},
        {"other class", keyedPath(kind.otherClass, firstNode), "", "", ""},
    };
}

Rows associations(const RecordKind& kind) {
    const cimhost::AssociationFilter byAssociation{kind.setting, {}, {}, {}};
    const cimhost::AssociationFilter byResult{{}, kind.setting, {}, {}};
    Rows rows;
    for (const Ends& each : endsOf(kind)) {
        const std::string of = std::string(" of ") + each.name;
        rows.push_back({"associators" + of, asked(Operation::associators, each.source, byAssociation), each.target,
                        always(each.bare)});
        rows.push_back({"associator names" + of, asked(Operation::associatorNames, each.source, byAssociation),
                        each.target, always(each.bare)});
        rows.push_back({"references" + of, asked(Operation::references, each.source, byResult), each.associations,
                        unsupportedReferences()});
        rows.push_back({"reference names" + of, asked(Operation::referenceNames, each.source, byResult),
                        each.associations, unsupportedReferences()});
    }
    return rows;
}

/**
 * Association requests from the first computer with filters by role and class. The bare provider ignores the filters.
 */
Rows filters(const RecordKind& kind) {
    struct Filter {
        const char* name;
        cimhost::AssociationFilter filter;  ///< without the association class
        bool matches;
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
    const std::string found = formatted(recordPath(kind, firstNode));
    Rows rows;
    for (Filter each : all) {
        each.filter.associationClass = kind.setting;
        for (const Operation operation : {Operation::associators, Operation::associatorNames}) {
            rows.push_back({std::string(each.name) + " of " + cimhost::nameOf(operation),
                            asked(operation, computerPath("alpha"), each.filter), each.matches ? found : "",
                            always(found)});
        }
    }
    const std::string association = formatted(settingPath(kind, "alpha", firstNode));
    for (const Operation operation : {Operation::references, Operation::referenceNames}) {
        for (const auto& [role, matches] : {std::pair("Antecedent", true), std::pair("Dependent", false)}) {
            rows.push_back({std::string("role ") + role + " of " + cimhost::nameOf(operation),
                            asked(operation, computerPath("alpha"), {{}, kind.setting, role, {}}),
                            matches ? association : "", unsupportedReferences()});
        }
    }
    return rows;
}

/**
 * Requests without an association class select all association classes. The provider refuses such a request if the
 * manager passes it on unchanged.
 */
Rows anyAssociation() {
    const std::string records =
        formatted(keyedPath(lease, firstNode)) + " " + formatted(keyedPath(warranty, firstNode));
    const std::string both = formatted(settingPath(recordKinds[0], "alpha", firstNode)) + " " +
                             formatted(settingPath(recordKinds[1], "alpha", firstNode));
    const ObjectPath computer = computerPath("alpha");
    const BareResponse found{records, "error 5", records, records};
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

const std::string& BareResponse::under(Manager manager) const {
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
    return {firstNode, "L", secondNode};
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
    const std::string both = formatted(assetPath("alpha")) + " " + formatted(assetPath("beta"));
    append(rows, asset, readingProducts(both, assetPath("beta"), assetPath("gamma")));
    append(rows, agent, readingProducts(formatted(agentPath("4.2.0")), agentPath("4.2.0"), agentPath("1.0")));
    append(rows, "products", modifyingProducts());
    append(rows, "any association", anyAssociation());
    return rows;
}

}  // namespace gatetest

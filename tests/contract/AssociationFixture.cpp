#include "AssociationFixture.h"

#include <algorithm>
#include <iterator>

#include "schema/MofWriter.h"

namespace contract {

const char* const threeComputers = R"(
[[instrumentation.node]]
type = 1
path = "/system"
properties = { "36" = "Example Maker", "108" = "testhost" }

[[instrumentation.node]]
type = 40
path = "/system/computer"
properties = { "36" = "Example Maker", "39" = "Model X - Tower", "108" = "alpha" }

[[instrumentation.node]]
type = 40
path = "/system/second_computer 2"
properties = { "108" = "beta" }

[[instrumentation.node]]
type = 40
path = "/system/third"
properties = { "108" = "gamma" }
)";

std::string recordFile(const AssociationKind& kind, const std::vector<std::string>& identifiers) {
    std::string content = std::to_string(identifiers.size()) + "\n";
    for (const std::string& identifier : identifiers) {
        content += identifier + "\n" + kind.fields;
    }
    return content;
}

Instance computerSystem(const std::string& name) {
    return testsupport::instance(computerPath(name),
                                 {testsupport::named("Name", testsupport::text(name)),
                                  testsupport::named("ElementName", testsupport::text("Computer " + name)),
                                  testsupport::named("Caption", testsupport::nullOf(CMPI_string))});
}

std::vector<std::string> stringsOf(const std::vector<ObjectPath>& paths) {
    std::vector<std::string> strings;
    std::transform(paths.begin(), paths.end(), std::back_inserter(strings), testsupport::toText);
    return strings;
}

std::vector<std::string> stringsOf(const std::vector<Instance>& instances) {
    std::vector<std::string> strings;
    std::transform(instances.begin(), instances.end(), std::back_inserter(strings), [](const Instance& instance) {
        return testsupport::toText(instance.path) + " " + cimhost::formatMof(instance);
    });
    return strings;
}

void AssociationTest::writeRecordFile(const std::vector<std::string>& identifiers) {
    writeData(kind().dataFile, recordFile(kind(), identifiers));
}

void AssociationTest::setComputers(const std::vector<std::string>& names) {
    std::vector<Instance> computers;
    std::transform(names.begin(), names.end(), std::back_inserter(computers), computerSystem);
    broker.serve("VELKO_ComputerSystem", std::move(computers));
}

std::string AssociationTest::computer(const std::string& name) {
    return testsupport::toText(computerPath(name));
}

std::string AssociationTest::element(const std::string& identifier) {
    return testsupport::toText(keyedPath(kind().element, identifier));
}

std::string AssociationTest::keylessElement() {
    return testsupport::toText(classPath(kind().element));
}

std::string AssociationTest::pair(const std::string& computerName, const std::string& identifier) {
    return testsupport::toText(association(computerPath(computerName), keyedPath(kind().element, identifier)));
}

std::string AssociationTest::pairWithoutElement(const std::string& computerName) {
    return testsupport::toText(association(computerPath(computerName), classPath(kind().element)));
}

ObjectPath AssociationTest::association(const ObjectPath& antecedent, const ObjectPath& dependent) {
    ObjectPath path = classPath(kind().association);
    if (!antecedent.className.empty()) {
        path.keys.push_back(testsupport::named("Antecedent", testsupport::reference(antecedent)));
    }
    if (!dependent.className.empty()) {
        path.keys.push_back(testsupport::named("Dependent", testsupport::reference(dependent)));
    }
    return path;
}

}  // namespace contract

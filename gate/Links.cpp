#include "Links.h"

#include "Calls.h"
#include "Log.h"
#include "Objects.h"
#include "Values.h"

#include <algorithm>

namespace gate {

namespace {

/** Fails unless the computers could be enumerated. The log has the reason, too: clients often drop it. */
void requireEnumerated(bool isDone, const CMPIStatus& status) {
    if (!isDone) {
        const std::string text = failureText("enumerate VELKO_ComputerSystem", status);
        logError(text);
        fail(CMPI_RC_ERR_FAILED, text);
    }
}

CMPIEnumeration* enumerateComputers(const Request& request, const Provider& provider) {
    const CMPIBroker& broker = *request.broker;
    if (broker.bft == nullptr || broker.bft->enumerateInstances == nullptr) {
        fail(CMPI_RC_ERR_FAILED, "The object manager cannot enumerate computers.");
    }
    const CMPIObjectPath* classPath = makePath(request.broker, nameSpaceOf(request.path), computerClass);
    CMPIStatus status{CMPI_RC_OK, nullptr};
    CMPIEnumeration* computers = nullptr;
    provider.letOthersIn([&] {
        computers = broker.bft->enumerateInstances(request.broker, request.context, classPath, nullptr, &status);
    });
    requireEnumerated(status.rc == CMPI_RC_OK && computers != nullptr, status);
    return computers;
}

bool hasNext(CMPIEnumeration* computers) {
    const auto answer = ask<&CMPIEnumerationFT::hasNext>(computers);
    requireEnumerated(answer.isOk(), answer.status);
    return answer.value != 0;
}

/** The instance's path, made anew: some managers leave the namespace out. */
const CMPIObjectPath* computerPathOf(const Request& request, const CMPIInstance* instance) {
    const CMPIObjectPath* given = pathOf(instance);
    const Property name = *findProperty(*findClass(computerClass), "Name");
    const auto key = keyOf(given, name);
    require(key.has_value(), "name a computer");
    CMPIObjectPath* path = makePath(request.broker, nameSpaceOf(request.path), classNameOf(given).c_str());
    const CMPICount count = keyCountOf(given);
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* keyName = nullptr;
        const auto data = ask<&CMPIObjectPathFT::getKeyAt>(given, index, &keyName);
        const CMPIStatus status =
            tell<&CMPIObjectPathFT::addKey>(path, textOf(keyName).c_str(), &data.value.value, data.value.type);
        require(data.isOk() && status.rc == CMPI_RC_OK, "name a computer", status);
    }
    return path;
}

}  // namespace

std::vector<Computer> knownComputers(const Request& request, const Provider& provider) {
    std::vector<Computer> computers;
    CMPIEnumeration* enumeration = enumerateComputers(request, provider);
    while (hasNext(enumeration)) {
        const auto next = ask<&CMPIEnumerationFT::getNext>(enumeration);
        CMPIInstance* instance = next.isOk() ? cim::elementInstance(next.value) : nullptr;
        requireEnumerated(instance != nullptr, next.status);
        const CMPIObjectPath* path = computerPathOf(request, instance);
        if (nameSpaceOf(pathOf(instance)).empty()) {
            // So that the instance and its name are the same; a manager that cannot do that has it as it was.
            tell<&CMPIInstanceFT::setObjectPath>(instance, path);
        }
        const bool isKnown = std::any_of(computers.begin(), computers.end(),
                                         [&](const Computer& each) { return samePath(each.path, path); });
        if (!isKnown) {
            computers.push_back({path, instance});
        }
    }
    return computers;
}

std::vector<Link> linksOf(const Provider& provider, const std::vector<Computer>& computers, const Class& association) {
    std::vector<Link> links;
    for (const Computer& computer : computers) {
        const OwnPath path = namingPath(computer.path, *findClass(computerClass));
        for (const CMPIObjectPath* element : provider.associatorNames(path, association.name)) {
            links.push_back({computer.path, computer.instance, element});
        }
    }
    return links;
}

}  // namespace gate

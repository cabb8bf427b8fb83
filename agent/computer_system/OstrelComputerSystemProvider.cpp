#include <cmpift.h>

#include <atomic>
#include <exception>
#include <optional>
#include <string>
#include <vector>

#include "Export.h"
#include "KO/ClassIds.h"
#include "KO/Instrumentation.h"
#include "KO/ProviderUtilities.h"
#include "cim/CmpiAccess.h"
#include "cim/Names.h"

// Serves VELKO_ComputerSystem, read-only. Requests share only the broker, and may run concurrently.

namespace KO::ComputerSystem {

namespace {

constexpr const char* className = "VELKO_ComputerSystem";
constexpr const char* keyName = "Name";

/** The values of a computer node that the class returns. */
struct Computer {
    std::string name;  ///< the key
    std::optional<std::string> vendor;
    std::optional<std::string> productName;  ///< "model - suffix"
};

/** The product name before its first hyphen, without trailing spaces. None if there is no product name. */
std::optional<std::string> modelOf(const Computer& computer) {
    if (!computer.productName) {
        return std::nullopt;
    }
    std::string text = computer.productName->substr(0, computer.productName->find('-'));
    text.erase(text.find_last_not_of(' ') + 1);
    return text;
}

/** One property of the class: its CIM name and its value. */
struct Property {
    const char* name;
    std::optional<std::string> (*value)(const Computer& computer);
};

const Property classProperties[] = {
    {keyName, [](const Computer& computer) { return std::make_optional(computer.name); }},
    {"Caption", [](const Computer&) { return std::make_optional<std::string>("Computer System"); }},
    {"Description", [](const Computer& computer) { return std::make_optional("Computer system " + computer.name); }},
    {"ElementName", [](const Computer& computer) { return std::make_optional(computer.name); }},
    {"Vendor", [](const Computer& computer) { return computer.vendor; }},
    {"Model", [](const Computer& computer) { return modelOf(computer); }},
    {"ProductName", [](const Computer& computer) { return computer.productName; }},
};

std::optional<std::string> read(Instrumentation& node, NodeLexicon::Properties property) {
    std::string text;
    return node.getProperty(property, text) ? std::make_optional(text) : std::nullopt;
}

bool isWanted(const char* name, const char** wanted) {
    if (wanted == nullptr || cim::sameName(name, keyName)) {
        return true;
    }
    for (; *wanted != nullptr; ++wanted) {
        if (cim::sameName(name, *wanted)) {
            return true;
        }
    }
    return false;
}

/** All computers of the tree that have a name, in tree order. */
std::vector<Computer> allComputers() {
    std::vector<Computer> computers;
    Instrumentation node;
    for (node.selectNode(NodeLexicon::NT_COMPUTER); node; ++node) {
        if (const std::optional<std::string> name = read(node, NodeLexicon::PROPERTY_NAME)) {
            computers.push_back(
                {*name, read(node, NodeLexicon::PROPERTY_VENDOR), read(node, NodeLexicon::PROPERTY_PRODUCT_NAME)});
        }
    }
    return computers;
}

std::atomic<const CMPIBroker*> theBroker{nullptr};

CMPIStatus status(CMPIrc code, const char* message = nullptr) {
    return {code, message != nullptr ? cim::make<&CMPIBrokerEncFT::newString>(theBroker.load(), message) : nullptr};
}

/** The entry point of the operations that are not supported: create, modify, delete and query. */
template <typename... Arguments>
CMPIStatus notSupported(Arguments...) {
    return status(CMPI_RC_ERR_NOT_SUPPORTED);
}

/** Returns computers to the client of a request. */
struct ResultWriter {
    const CMPIBroker* broker;
    const CMPIResult* result;
    std::string nameSpace;

    ResultWriter(const CMPIResult* itsResult, const CMPIObjectPath* path)
        : broker(theBroker), result(itsResult), nameSpace(ProviderUtilities::getNamespace(path)) {}

    CMPIStatus returnPath(const Computer& computer) const {
        const CMPIObjectPath* path = makePath(computer);
        return path != nullptr ? cim::tell<&CMPIResultFT::returnObjectPath>(result, path) : cannotMake();
    }

    /**
     * @param wanted null-terminated array of property names in any letter case; null for all properties. The key is
     *               always returned.
     */
    CMPIStatus returnInstance(const Computer& computer, const char** wanted) const {
        CMPIInstance* instance = ProviderUtilities::createInstance(broker, makePath(computer));
        if (instance == nullptr) {
            return cannotMake();
        }
        for (const Property& property : classProperties) {
            auto value = isWanted(property.name, wanted) ? property.value(computer) : std::nullopt;
            if (value) {
                ProviderUtilities::setProperty(instance, property.name, *value);
            }
        }
        return cim::tell<&CMPIResultFT::returnInstance>(result, instance);
    }

    CMPIStatus done() const { return cim::tell<&CMPIResultFT::returnDone>(result); }

private:
    CMPIObjectPath* makePath(const Computer& computer) const {
        CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, className, nameSpace);
        ProviderUtilities::setKeyProperty(path, keyName, computer.name);
        return path;
    }

    static CMPIStatus cannotMake() {
        return status(CMPI_RC_ERR_FAILED, "The object manager could not make an object of VELKO_ComputerSystem");
    }
};

/** Runs a handler if the path has the served class. Converts exceptions, so that none reaches the object manager. */
template <typename Handler>
CMPIStatus guarded(const CMPIObjectPath* path, const Handler& handler) noexcept {
    try {
        if (ProviderUtilities::getClassId(path) != ClassId::computerSystem) {
            return status(CMPI_RC_ERR_INVALID_CLASS, "This provider serves VELKO_ComputerSystem only");
        }
        return handler();
    } catch (const std::exception& failure) {
        return status(CMPI_RC_ERR_FAILED, failure.what());
    } catch (...) {
        return status(CMPI_RC_ERR_FAILED);
    }
}

/** Returns all computers, one by one. Stops at the first that cannot be returned. */
template <typename Return>
CMPIStatus returnAll(const ResultWriter& writer, const Return& returnOne) {
    for (const Computer& computer : allComputers()) {
        const CMPIStatus answer = returnOne(computer);
        if (answer.rc != CMPI_RC_OK) {
            return answer;
        }
    }
    return writer.done();
}

CMPIStatus cleanup(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, CMPIBoolean /*terminating*/) {
    return status(CMPI_RC_OK);
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* result,
                                  const CMPIObjectPath* path) {
    return guarded(path, [&] {
        const ResultWriter writer(result, path);
        return returnAll(writer, [&](const Computer& computer) { return writer.returnPath(computer); });
    });
}

CMPIStatus enumerateInstances(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* result,
                              const CMPIObjectPath* path, const char** properties) {
    return guarded(path, [&] {
        const ResultWriter writer(result, path);
        return returnAll(writer, [&](const Computer& computer) { return writer.returnInstance(computer, properties); });
    });
}

CMPIStatus getInstance(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* result,
                       const CMPIObjectPath* path, const char** properties) {
    return guarded(path, [&] {
        std::string name;
        if (!ProviderUtilities::getKeyProperty(path, keyName, name)) {
            return status(CMPI_RC_ERR_INVALID_PARAMETER, "The key Name is missing or is not a string");
        }
        const ResultWriter writer(result, path);
        for (const Computer& computer : allComputers()) {
            if (computer.name == name) {
                const CMPIStatus answer = writer.returnInstance(computer, properties);
                return answer.rc == CMPI_RC_OK ? writer.done() : answer;
            }
        }
        return status(CMPI_RC_ERR_NOT_FOUND, ("There is no computer system named \"" + name + "\"").c_str());
    });
}

CMPIInstanceMIFT functions = {
    CMPIVersion200, CMPIVersion200,         "instanceOstrelComputerSystemProvider",
    cleanup,        enumerateInstanceNames, enumerateInstances,
    getInstance,    notSupported,           notSupported,
    notSupported,   notSupported,
};

CMPIInstanceMI instanceMI = {nullptr, &functions};

}  // namespace

}  // namespace KO::ComputerSystem

extern "C" KO_EXPORT CMPIInstanceMI* OstrelComputerSystemProvider_Create_InstanceMI(const CMPIBroker* broker,
                                                                                    const CMPIContext* /*context*/,
                                                                                    CMPIStatus* status) {
    KO::ComputerSystem::theBroker = broker;
    if (status != nullptr) {
        *status = {CMPI_RC_OK, nullptr};
    }
    return &KO::ComputerSystem::instanceMI;
}

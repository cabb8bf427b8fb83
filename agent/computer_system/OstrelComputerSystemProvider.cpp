#include <cmpift.h>

#include <atomic>
#include <exception>

#include "Computer.h"
#include "Export.h"
#include "KO/ClassIds.h"
#include "KO/ProviderUtilities.h"
#include "cim/CmpiAccess.h"

// Serves VELKO_ComputerSystem, read-only. Requests share only the broker, and may run concurrently.

namespace KO::ComputerSystem {

namespace {

std::atomic<const CMPIBroker*> theBroker{nullptr};

CMPIStatus status(CMPIrc code, const char* message = nullptr) {
    return {code, message != nullptr ? cim::make<&CMPIBrokerEncFT::newString>(theBroker.load(), message) : nullptr};
}

/** The entry point of each operation that would change the computers, and of queries. */
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
        const CMPIObjectPath* path = makePath(broker, nameSpace, computer);
        return path != nullptr ? result->ft->returnObjectPath(result, path) : cannotMake();
    }

    CMPIStatus returnInstance(const Computer& computer, const char** properties) const {
        const CMPIInstance* instance = makeInstance(broker, nameSpace, computer, properties);
        return instance != nullptr ? result->ft->returnInstance(result, instance) : cannotMake();
    }

    CMPIStatus done() const { return result->ft->returnDone(result); }

private:
    static CMPIStatus cannotMake() {
        return status(CMPI_RC_ERR_FAILED, "The object manager could not make an object of VELKO_ComputerSystem");
    }
};

/** Runs a handler; no exception may reach the object manager. */
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

/** Returns all computers, one by one, until one fails. */
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
        if (!ProviderUtilities::getKeyProperty(path, "Name", name)) {
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

#include "Computer.h"
#include "Export.h"
#include "KO/ClassIds.h"
#include "KO/ProviderUtilities.h"

#include <cmpift.h>

#include <atomic>
#include <exception>

// Serves VELKO_ComputerSystem, read-only. Requests share only the broker, and may run concurrently.

namespace KO::ComputerSystem {

namespace {

std::atomic<const CMPIBroker*> theBroker{nullptr};

CMPIStatus status(CMPIrc code, const char* message = nullptr) {
    const CMPIBroker* broker = theBroker;
    const bool canSay =
        message != nullptr && broker != nullptr && broker->eft != nullptr && broker->eft->newString != nullptr;
    return {code, canSay ? broker->eft->newString(broker, message, nullptr) : nullptr};
}

CMPIStatus ok() {
    return status(CMPI_RC_OK);
}
CMPIStatus notSupported() {
    return status(CMPI_RC_ERR_NOT_SUPPORTED);
}

/** Broker, result and namespace of a request. */
struct Request {
    const CMPIBroker* broker;
    const CMPIResult* result;
    std::string nameSpace;

    Request(const CMPIResult* itsResult, const CMPIObjectPath* path)
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
CMPIStatus returnAll(const Request& request, const Return& returnOne) {
    for (const Computer& computer : allComputers()) {
        const CMPIStatus answer = returnOne(computer);
        if (answer.rc != CMPI_RC_OK) {
            return answer;
        }
    }
    return request.done();
}

CMPIStatus cleanup(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, CMPIBoolean /*terminating*/) {
    return ok();
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* result,
                                  const CMPIObjectPath* path) {
    return guarded(path, [&] {
        const Request request(result, path);
        return returnAll(request, [&](const Computer& computer) { return request.returnPath(computer); });
    });
}

CMPIStatus enumerateInstances(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* result,
                              const CMPIObjectPath* path, const char** properties) {
    return guarded(path, [&] {
        const Request request(result, path);
        return returnAll(request,
                         [&](const Computer& computer) { return request.returnInstance(computer, properties); });
    });
}

CMPIStatus getInstance(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* result,
                       const CMPIObjectPath* path, const char** properties) {
    return guarded(path, [&] {
        std::string name;
        if (!ProviderUtilities::getKeyProperty(path, "Name", name)) {
            return status(CMPI_RC_ERR_INVALID_PARAMETER, "The key Name is missing or is not a string");
        }
        const Request request(result, path);
        for (const Computer& computer : allComputers()) {
            if (computer.name == name) {
                const CMPIStatus answer = request.returnInstance(computer, properties);
                return answer.rc == CMPI_RC_OK ? request.done() : answer;
            }
        }
        return status(CMPI_RC_ERR_NOT_FOUND, ("There is no computer system named \"" + name + "\"").c_str());
    });
}

CMPIStatus createInstance(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* /*result*/,
                          const CMPIObjectPath* /*path*/, const CMPIInstance* /*instance*/) {
    return notSupported();
}

CMPIStatus modifyInstance(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* /*result*/,
                          const CMPIObjectPath* /*path*/, const CMPIInstance* /*instance*/,
                          const char** /*properties*/) {
    return notSupported();
}

CMPIStatus deleteInstance(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* /*result*/,
                          const CMPIObjectPath* /*path*/) {
    return notSupported();
}

CMPIStatus execQuery(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* /*result*/,
                     const CMPIObjectPath* /*path*/, const char* /*language*/, const char* /*query*/) {
    return notSupported();
}

CMPIInstanceMIFT functions = {
    CMPIVersion200,
    CMPIVersion200,
    "instanceOstrelComputerSystemProvider",
    cleanup,
    enumerateInstanceNames,
    enumerateInstances,
    getInstance,
    createInstance,
    modifyInstance,
    deleteInstance,
    execQuery,
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

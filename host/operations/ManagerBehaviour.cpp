#include "operations/ManagerBehaviour.h"

namespace cimhost {
namespace {

/** The provider's message, or that of a CMPIError that it returned, or a sentence with the code. */
std::string messageOf(const ProviderResponse& response, Operation operation) {
    if (!response.status.message.empty()) {
        return response.status.message;
    }
    for (const ErrorInfo& error : eventsOf<ErrorInfo>(response.events)) {
        if (error.message) {
            return *error.message;
        }
    }
    return std::string("The provider returned code ") + std::to_string(response.status.rc) + " for " +
           nameOf(operation) + ", without a message.";
}

}  // namespace

const ManagerBehaviour& ManagerBehaviour::standard() {
    static const ManagerBehaviour behaviour;
    return behaviour;
}

Status ManagerBehaviour::statusOf(const ProviderResponse& response, Operation operation) const {
    return response.status.ok() ? Status{} : Status{response.status.rc, messageOf(response, operation)};
}

StatusOr<ObjectPath> ManagerBehaviour::createdPath(const ProviderResponse& response) const {
    for (const ResultEvent& event : response.events) {
        if (const auto* path = resultOf<ObjectPath>(event)) {
            return {{}, *path};
        }
        if (const auto* instance = resultOf<Instance>(event)) {
            return {{}, instance->path};
        }
    }
    return {{CMPI_RC_ERR_FAILED,
             "The provider reported success for CreateInstance, but returned neither a path nor an instance."},
            {}};
}

}  // namespace cimhost

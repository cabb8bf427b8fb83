#include <stdexcept>

#include "ProviderKit.h"

// A library with several providers: any name by the generic factory, and some whose factories fail.

namespace {

const CMPIBroker* broker = nullptr;
std::string providerName;

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return {CMPI_RC_NEVER_UNLOAD, nullptr};
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                              const char**) {
    result->ft->returnInstance(result, kit::newInstance(broker, path, "Other_Thing", "Provider", providerName));
    return kit::ok;
}

CMPIInstanceMIFT table{CMPIVersion200, CMPIVersion200, "instanceOther", cleanup, nullptr, enumerateInstances,
                       nullptr,        nullptr,        nullptr,         nullptr, nullptr};
CMPIInstanceMI interface { nullptr, &table };

CMPIAssociationMIFT associationTable{CMPIVersion200, CMPIVersion200, "associationOther", kit::cleanup, nullptr, nullptr,
                                     nullptr,        nullptr};
CMPIAssociationMI association{nullptr, &associationTable};

int refusals = 2;

}  // namespace

KIT_EXPORT CMPIInstanceMI* _Generic_Create_InstanceMI(const CMPIBroker* itsBroker, const CMPIContext*, const char* name,
                                                      CMPIStatus*) {
    kit::store(broker, itsBroker);
    providerName = name;
    return &interface;
}

KIT_EXPORT CMPIInstanceMI* Refusing_Create_InstanceMI(const CMPIBroker* itsBroker, const CMPIContext*,
                                                      CMPIStatus* status) {
    *status = kit::failure(itsBroker, CMPI_RC_ERR_ACCESS_DENIED, "no licence");
    return nullptr;
}

KIT_EXPORT CMPIInstanceMI* Null_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
    return nullptr;
}

KIT_EXPORT CMPIInstanceMI* Throwing_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
    throw std::runtime_error("no luck");
}

/** Fails twice, then succeeds. */
KIT_EXPORT CMPIInstanceMI* Late_Create_InstanceMI(const CMPIBroker* itsBroker, const CMPIContext* context,
                                                  CMPIStatus* status) {
    return --refusals >= 0 ? nullptr : _Generic_Create_InstanceMI(itsBroker, context, "Late", status);
}

/** Enumerates its own class in its factory. */
KIT_EXPORT CMPIInstanceMI* Selfish_Create_InstanceMI(const CMPIBroker* itsBroker, const CMPIContext* context,
                                                     CMPIStatus* status) {
    const CMPIObjectPath* own = itsBroker->eft->newObjectPath(itsBroker, "root/cimv2", "Selfish_Thing", nullptr);
    itsBroker->bft->enumerateInstances(itsBroker, context, own, nullptr, status);
    return status->rc == CMPI_RC_OK ? &interface : nullptr;
}

/** Its association interface does not ask to stay loaded; its instance interface does. */
KIT_EXPORT CMPIAssociationMI* Half_Create_AssociationMI(const CMPIBroker* itsBroker, const CMPIContext*, CMPIStatus*) {
    kit::log(itsBroker, "half factory");
    return &association;
}

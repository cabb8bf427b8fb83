#include <KO/Product.h>
#include <cmpimacs.h>

#include <string>

// Somebody else's provider: it names one thing, after the agent's product.

namespace {

const CMPIBroker* broker = nullptr;

CMPIStatus unsupported() {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

CMPIStatus thingCleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus thingEnumInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* path) {
    const std::wstring name = KO::Product::getName();
    const std::string narrow(name.begin(), name.end());
    CMPIObjectPath* thing = CMNewObjectPath(broker, "root/cimv2", "Somebody_Thing", nullptr);
    CMAddKey(thing, "Name", narrow.c_str(), CMPI_chars);
    static_cast<void>(path);
    CMReturnObjectPath(result, thing);
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus thingEnumInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                              const char**) {
    return unsupported();
}

CMPIStatus thingGetInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                            const char**) {
    return unsupported();
}

CMPIStatus thingCreateInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                               const CMPIInstance*) {
    return unsupported();
}

CMPIStatus thingModifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                               const CMPIInstance*, const char**) {
    return unsupported();
}

CMPIStatus thingDeleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*) {
    return unsupported();
}

CMPIStatus thingExecQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*,
                          const char*) {
    return unsupported();
}

}  // namespace

CMInstanceMIStub(thing, SomebodysProvider, broker, CMNoHook)

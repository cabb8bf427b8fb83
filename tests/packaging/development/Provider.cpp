#include <KO/Product.h>
#include <cmpimacs.h>

#include <string>

// An external provider with one instance, which is named after the agent's product.

namespace {

const CMPIBroker* broker = nullptr;

CMPIStatus unsupported() {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

CMPIStatus productCleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus productEnumInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                    const CMPIObjectPath* path) {
    const std::wstring name = KO::Product::getName();
    const std::string narrow(name.begin(), name.end());
    CMPIObjectPath* product = CMNewObjectPath(broker, "root/cimv2", "External_Product", nullptr);
    CMAddKey(product, "Name", narrow.c_str(), CMPI_chars);
    static_cast<void>(path);
    CMReturnObjectPath(result, product);
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus productEnumInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                                const char**) {
    return unsupported();
}

CMPIStatus productGetInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                              const char**) {
    return unsupported();
}

CMPIStatus productCreateInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                                 const CMPIInstance*) {
    return unsupported();
}

CMPIStatus productModifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                                 const CMPIInstance*, const char**) {
    return unsupported();
}

CMPIStatus productDeleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*) {
    return unsupported();
}

CMPIStatus productExecQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*, const char*,
                            const char*) {
    return unsupported();
}

}  // namespace

CMInstanceMIStub(product, ExternalProvider, broker, CMNoHook)

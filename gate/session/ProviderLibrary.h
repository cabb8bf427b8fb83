#pragma once

#include <cmpift.h>

namespace gate {

/**
 * The provider's shared library, in the directory of this one. It is not linked: the provider reads its record files
 * when it is loaded, so they must be recovered first. If it is loaded again, it reads them again.
 */
class ProviderLibrary {
public:
    bool isLoaded() const { return handle != nullptr; }

    /**
     * Loads the library. Throws std::runtime_error with the reason, also if another part of the process has loaded it:
     * the provider would not read its files again.
     */
    void load();

    /** Unloads the library if it is loaded. */
    void unload();

    /** @name The factories, while it is loaded. Null if the provider returns no interface. */
    ///@{
    CMPIInstanceMI* createInstanceMI(const CMPIBroker* broker) const;
    CMPIAssociationMI* createAssociationMI(const CMPIBroker* broker) const;
    ///@}

private:
    void* handle = nullptr;
};

}  // namespace gate

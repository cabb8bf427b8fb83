#pragma once

#include <exception>
#include <string>

/** Logger names that the agent's log filters select by. */
namespace KO::LeaseWarrantyProvider::LoggerNames {

/** Logger of all translation units except the two below. */
constexpr const char* provider = "Tarvik.LeaseAndWarrantyProvider";

/** Logger of OstrelAgent.cpp and AssetIDDetails.cpp. The shorter name is intentional. */
constexpr const char* shortened = "Tarvik.LeaseWarrantyProvider";

/**
 * Returns a logger's name as a string. The names are initialized while the library is loaded, which must not fail: if
 * memory is short, returns a shorter name that needs no allocation.
 */
inline std::string loggerName(const char* name) noexcept {
    try {
        return name;
    } catch (const std::exception&) {
        return "Tarvik";
    }
}

}  // namespace KO::LeaseWarrantyProvider::LoggerNames

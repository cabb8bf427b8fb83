#pragma once

#include <exception>
#include <string>

/** The names that the agent's log filters select by. */
namespace KO::LeaseWarrantyProvider::LoggerNames {

/** Logger of all units but the two below. */
constexpr const char* provider = "Tarvik.LeaseAndWarrantyProvider";

/** Logger of the units OstrelAgent and AssetIDDetails: shorter, and meant so. */
constexpr const char* shortened = "Tarvik.LeaseWarrantyProvider";

/**
 * A name as a unit keeps it. The units' names are made while the library is loaded, which must not fail: where memory
 * is lacking then, it is a shorter name that needs none.
 */
inline std::string loggerName(const char* name) noexcept {
    try {
        return name;
    } catch (const std::exception&) {
        return "Tarvik";
    }
}

}  // namespace KO::LeaseWarrantyProvider::LoggerNames

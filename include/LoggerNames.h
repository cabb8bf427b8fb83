#pragma once

/** The names that the agent's log filters select by. */
namespace KO::LeaseWarrantyProvider::LoggerNames {

/** Logger of all units but the two below. */
constexpr const char* provider = "Tarvik.LeaseAndWarrantyProvider";

/** Logger of the units OstrelAgent and AssetIDDetails: shorter, and meant so. */
constexpr const char* shortened = "Tarvik.LeaseWarrantyProvider";

}  // namespace KO::LeaseWarrantyProvider::LoggerNames

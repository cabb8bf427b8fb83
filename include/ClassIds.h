#pragma once

/** The numbers by which the agent framework knows the CIM classes that concern the provider. */
namespace KO::LeaseWarrantyProvider::ClassId {

constexpr unsigned short computerSystem = 1;  ///< served by another provider
constexpr unsigned short lease = 20;
constexpr unsigned short warranty = 21;
constexpr unsigned short leaseSetting = 25;
constexpr unsigned short warrantySetting = 32;
constexpr unsigned short ostrelAgent = 208;
constexpr unsigned short assetIDDetails = 209;

}  // namespace KO::LeaseWarrantyProvider::ClassId

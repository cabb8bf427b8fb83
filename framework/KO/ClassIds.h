#pragma once

/** CIM class ids of the agent framework, as ProviderUtilities::getClassId returns them. */
namespace KO::ClassId {

constexpr unsigned short unknown = 0;
constexpr unsigned short computerSystem = 1;
constexpr unsigned short lease = 20;
constexpr unsigned short warranty = 21;
constexpr unsigned short leaseSetting = 25;
constexpr unsigned short warrantySetting = 32;
constexpr unsigned short ostrelAgent = 208;
constexpr unsigned short assetIDDetails = 209;

}  // namespace KO::ClassId

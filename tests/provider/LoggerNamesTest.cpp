#include <gtest/gtest.h>

#include <string>

namespace KO::LeaseWarrantyProvider {

extern std::string loggerLeaseAndWarrantyProvider;
extern std::string loggerLeaseBase;
extern std::string loggerWarrantyBase;
extern std::string loggerLease;
extern std::string loggerWarranty;
extern std::string loggerLeaseSetting;
extern std::string loggerWarrantySetting;
extern std::string loggerOstrelAgent;
extern std::string loggerAssetIDDetails;
extern std::string loggerCMPILAWComputerSystem;
extern std::string loggerCMPILeaseSetting;
extern std::string loggerCMPIWarrantySetting;
extern std::string loggerCMPILease;
extern std::string loggerCMPIWarranty;
extern std::string loggerCMPIOstrelAgent;
extern std::string loggerCMPIAssetIDDetail;

namespace {

TEST(LoggerNames, OfAgentAndAssetElementsAreShorter) {
    for (const std::string* name : {&loggerOstrelAgent, &loggerAssetIDDetails}) {
        EXPECT_EQ(*name, "Tarvik.LeaseWarrantyProvider");
    }
}

TEST(LoggerNames, OfAllOtherFilesEqualTheProvidersName) {
    for (const std::string* name :
         {&loggerLeaseAndWarrantyProvider, &loggerLeaseBase, &loggerWarrantyBase, &loggerLease, &loggerWarranty,
          &loggerLeaseSetting, &loggerWarrantySetting, &loggerCMPILAWComputerSystem, &loggerCMPILeaseSetting,
          &loggerCMPIWarrantySetting, &loggerCMPILease, &loggerCMPIWarranty, &loggerCMPIOstrelAgent,
          &loggerCMPIAssetIDDetail}) {
        EXPECT_EQ(*name, "Tarvik.LeaseAndWarrantyProvider");
    }
}

}  // namespace

}  // namespace KO::LeaseWarrantyProvider

#include "Dispatch.h"

#include <algorithm>
#include <array>

#include "CMPIAssetIDDetail.h"
#include "CMPILease.h"
#include "CMPILeaseSetting.h"
#include "CMPIOstrelAgent.h"
#include "CMPIWarranty.h"
#include "CMPIWarrantySetting.h"
#include "Handlers.h"
#include "KO/ClassIds.h"

namespace KO::LeaseWarrantyProvider {

namespace {

using namespace Handlers;

constexpr Handler none = &invalidClass;

/** GetInstance of an association class is deliberately not supported. */
constexpr std::array<ClassHandlers, 6> dispatchTable{{
    // clang-format off
    {ClassId::lease, &names<CMPILease>, &instances<CMPILease>, &instances<CMPILease>,
           &create<CMPILease>, &modify<CMPILease>, &remove<CMPILease>, none, none},
    {ClassId::warranty, &names<CMPIWarranty>, &instances<CMPIWarranty>, &instances<CMPIWarranty>,
           &create<CMPIWarranty>, &modify<CMPIWarranty>, &remove<CMPIWarranty>, none, none},
    {ClassId::leaseSetting, &names<CMPILeaseSetting>, &instances<CMPILeaseSetting>, &notSupported, none, none, none,
           &associators<CMPILeaseSetting>, &associatorNames<CMPILeaseSetting>},
    {ClassId::warrantySetting, &names<CMPIWarrantySetting>, &instances<CMPIWarrantySetting>, &notSupported, none, none, none,
           &associators<CMPIWarrantySetting>, &associatorNames<CMPIWarrantySetting>},
    {ClassId::ostrelAgent, &names<CMPIOstrelAgent>, &instances<CMPIOstrelAgent>, &instances<CMPIOstrelAgent>,
           none, none, none, none, none},
    {ClassId::assetIDDetails, &names<CMPIAssetIDDetail>, &instances<CMPIAssetIDDetail>, &instances<CMPIAssetIDDetail>,
           none, &modify<CMPIAssetIDDetail>, none, none, none},
    // clang-format on
}};

constexpr ClassHandlers unknownClass{ClassId::unknown, none, none, none, none, none, none, none, none};

}  // namespace

const ClassHandlers& handlersOf(unsigned short classId) {
    const auto isServed = [&](const ClassHandlers& row) { return row.classId == classId; };
    const auto row = std::find_if(dispatchTable.begin(), dispatchTable.end(), isServed);
    return row == dispatchTable.end() ? unknownClass : *row;
}

}  // namespace KO::LeaseWarrantyProvider

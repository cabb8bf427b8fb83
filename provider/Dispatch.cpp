#include "Dispatch.h"

#include "CMPIAssetIDDetail.h"
#include "CMPILease.h"
#include "CMPILeaseSetting.h"
#include "CMPIOstrelAgent.h"
#include "CMPIWarranty.h"
#include "CMPIWarrantySetting.h"
#include "Handlers.h"
#include "KO/ClassIds.h"

#include <algorithm>
#include <array>

namespace KO::LeaseWarrantyProvider {

namespace {

struct DispatchRow {
    unsigned short classId;
    std::array<Body, static_cast<std::size_t>(Operation::count)> bodies;
};

using namespace Handlers;

constexpr Body none = &invalidClass;

/**
 * Class id, then the handlers in the order of Operation. GetInstance of an association class is deliberately not
 * supported.
 */
constexpr std::array<DispatchRow, 6> dispatchTable{{
    // clang-format off
    {ClassId::lease, {&names<CMPILease>, &instances<CMPILease>, &instances<CMPILease>,
           &create<CMPILease>, &modify<CMPILease>, &remove<CMPILease>, none, none}},
    {ClassId::warranty, {&names<CMPIWarranty>, &instances<CMPIWarranty>, &instances<CMPIWarranty>,
           &create<CMPIWarranty>, &modify<CMPIWarranty>, &remove<CMPIWarranty>, none, none}},
    {ClassId::leaseSetting, {&names<CMPILeaseSetting>, &instances<CMPILeaseSetting>, &notSupported, none, none, none,
           &associators<CMPILeaseSetting>, &associatorNames<CMPILeaseSetting>}},
    {ClassId::warrantySetting, {&names<CMPIWarrantySetting>, &instances<CMPIWarrantySetting>, &notSupported, none, none, none,
           &associators<CMPIWarrantySetting>, &associatorNames<CMPIWarrantySetting>}},
    {ClassId::ostrelAgent, {&names<CMPIOstrelAgent>, &instances<CMPIOstrelAgent>, &instances<CMPIOstrelAgent>,
           none, none, none, none, none}},
    {ClassId::assetIDDetails, {&names<CMPIAssetIDDetail>, &instances<CMPIAssetIDDetail>, &instances<CMPIAssetIDDetail>,
           none, &modify<CMPIAssetIDDetail>, none, none, none}},
    // clang-format on
}};

}  // namespace

Body bodyOf(Operation operation, unsigned short classId) {
    const auto served = [&](const DispatchRow& row) { return row.classId == classId; };
    const auto row = std::find_if(dispatchTable.begin(), dispatchTable.end(), served);
    return row == dispatchTable.end() ? none : row->bodies[static_cast<std::size_t>(operation)];
}

}  // namespace KO::LeaseWarrantyProvider

#include "Dispatch.h"

#include "Bodies.h"
#include "CMPIAssetIDDetail.h"
#include "CMPILease.h"
#include "CMPIOstrelAgent.h"
#include "CMPIWarranty.h"

#include <algorithm>
#include <array>

namespace KO::LeaseWarrantyProvider {

namespace {

struct DispatchRow {
    unsigned short classId;
    std::array<Body, static_cast<std::size_t>(Operation::count)> bodies;
};

using namespace Bodies;

constexpr Body none = &invalidClass;

/**
 * Class id, then the bodies in the order of Operation. An association class is enumerated but, as
 * designed, cannot be got.
 */
constexpr std::array<DispatchRow, 6> dispatchTable{{
    // clang-format off
    {20,  {&names<CMPILease>, &instances<CMPILease>, &instances<CMPILease>,
           &create<CMPILease>, &modify<CMPILease>, &remove<CMPILease>, none, none}},
    {21,  {&names<CMPIWarranty>, &instances<CMPIWarranty>, &instances<CMPIWarranty>,
           &create<CMPIWarranty>, &modify<CMPIWarranty>, &remove<CMPIWarranty>, none, none}},
    {25,  {none, none, &notSupported, none, none, none, none, none}},
    {32,  {none, none, &notSupported, none, none, none, none, none}},
    {208, {&names<CMPIOstrelAgent>, &instances<CMPIOstrelAgent>, &instances<CMPIOstrelAgent>,
           none, none, none, none, none}},
    {209, {&names<CMPIAssetIDDetail>, &instances<CMPIAssetIDDetail>, &instances<CMPIAssetIDDetail>,
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

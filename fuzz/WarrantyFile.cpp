#include "RecordFile.h"
#include "WarrantyBase.h"

using KO::LeaseWarrantyProvider::WarrantyStoreTraits;

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    return fuzz::checkRecordFile<WarrantyStoreTraits>(testsupport::warrantyFields(), fuzz::inputOf(data, size));
}

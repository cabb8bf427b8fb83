#include "RecordFile.h"
#include "WarrantyBase.h"

using KO::LeaseWarrantyProvider::WarrantyStoreTraits;

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    return fuzz::tryRecordFile<WarrantyStoreTraits>(testsupport::warrantyFields(), fuzz::textOf(data, size));
}

#include "RecordFile.h"
#include "WarrantyBase.h"

using KO::LeaseWarrantyProvider::WarrantyStore;

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    return fuzz::tryRecordFile<WarrantyStore>(testsupport::warrantyFields(), fuzz::textOf(data, size));
}

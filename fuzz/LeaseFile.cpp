#include "LeaseBase.h"
#include "RecordFile.h"

using KO::LeaseWarrantyProvider::LeaseStore;

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    return fuzz::tryRecordFile<LeaseStore>(testsupport::leaseFields(), fuzz::textOf(data, size));
}

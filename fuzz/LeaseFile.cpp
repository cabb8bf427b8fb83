#include "LeaseBase.h"
#include "RecordFile.h"

using KO::LeaseWarrantyProvider::LeaseStoreTraits;

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    return fuzz::checkRecordFile<LeaseStoreTraits>(testsupport::leaseFields(), fuzz::inputOf(data, size));
}

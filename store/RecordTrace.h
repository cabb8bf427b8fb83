#pragma once

#include <string>

namespace KO::LeaseWarrantyProvider {

/**
 * Traces the making and copying of records, as a base of each record type. It holds nothing; the
 * record types keep the copying that the compiler writes. Moves, as a growing table makes them, and
 * destruction are not traced.
 *
 * Traits is that of the records' store.
 */
template <class Traits>
class RecordTrace {
public:
    RecordTrace();
    explicit RecordTrace(const std::string& instanceId);
    RecordTrace(const RecordTrace& instance);
    RecordTrace& operator=(const RecordTrace& instance);
    RecordTrace(RecordTrace&&) noexcept = default;
    RecordTrace& operator=(RecordTrace&&) noexcept = default;
    ~RecordTrace() = default;
};

}  // namespace KO::LeaseWarrantyProvider

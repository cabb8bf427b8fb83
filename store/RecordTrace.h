#pragma once

#include <string>

namespace KO::LeaseWarrantyProvider {

/**
 * Traces construction and copying of records. An empty base of the record types, which use compiler-generated copying.
 * Does not trace destruction or moves, such as those of a growing table.
 *
 * Traits is the traits class of the records' store.
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

#include "model/Name.h"

#include <mutex>
#include <ostream>
#include <set>

namespace cimhost {

Name Name::declared(const std::string& name) {
    static std::mutex mutex;
    static auto& names = *new std::set<std::string>;  // never destroyed: names may be used until the process ends
    const std::lock_guard<std::mutex> lock(mutex);
    Name result;
    result.shared = {std::shared_ptr<void>(), &*names.insert(name).first};  // without an owner that is counted
    return result;
}

std::ostream& operator<<(std::ostream& stream, const Name& name) {
    return stream << name.string();
}

}  // namespace cimhost

#include "broker/PropertyLists.h"

namespace cimhost {

PropertyList propertyListFrom(const char** names) {
    if (names == nullptr) {
        return std::nullopt;
    }
    std::vector<std::string> list;
    for (; *names != nullptr; ++names) {
        list.emplace_back(*names);
    }
    return list;
}

CPropertyList::CPropertyList(const PropertyList& list) {
    if (list) {
        for (const std::string& name : *list) {
            pointers.push_back(name.c_str());
        }
        pointers.push_back(nullptr);
    }
}

}  // namespace cimhost

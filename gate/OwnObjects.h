#pragma once

#include "Values.h"

#include <cmpift.h>

#include <memory>
#include <string>

// Paths and instances that only the provider sees. They are the gate's own, so that nothing can fail when it reads
// them: a key that cannot be read makes the provider take the first instance that it has.

namespace gate {

/** An object path whose keys are strings. It has the functions that read a path's parts, and no others. */
class OwnPath {
public:
    OwnPath(std::string nameSpace, std::string className);
    OwnPath(OwnPath&&) noexcept;
    ~OwnPath();

    void addKey(const char* name, std::string value);

    /** The value of a key; empty when it was not added. */
    std::string key(const char* name) const;

    const CMPIObjectPath* handle() const;

private:
    struct Content;
    std::unique_ptr<Content> content;
};

/** An instance from which properties are read by name. A datetime is given as its text. */
class OwnInstance {
public:
    explicit OwnInstance(const Values& values);
    OwnInstance(OwnInstance&&) noexcept;
    ~OwnInstance();

    const CMPIInstance* handle() const;

private:
    struct Content;
    std::unique_ptr<Content> content;
};

}  // namespace gate

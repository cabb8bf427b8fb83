#include <string>

#include "Target.h"
#include "cim/Names.h"
#include "schema/Errors.h"
#include "schema/MofReader.h"
#include "schema/ObjectPathText.h"

// Object paths: an input is rejected with a PathError, or its path is the same after it is written and read.

namespace {

using fuzz::require;
using fuzz::requireSame;

constexpr const char* nameSpace = "root/cimv2";

/** Classes with keys of every type, and an association. */
constexpr const char* classes = R"(
class Every {
    [Key] boolean Flag; [Key] char16 Character; [Key] string Text; [Key] datetime Date;
    [Key] uint8 U8; [Key] uint16 U16; [Key] uint32 U32; [Key] uint64 U64;
    [Key] sint8 S8; [Key] sint16 S16; [Key] sint32 S32; [Key] sint64 S64;
    [Key] real32 R32; [Key] real64 R64; [Key] Named REF Other; string Plain;
};
class Named { [Key] string Name; };
class NamedMore : Named { string More; };
[Association] class Link { [Key] Named REF Left; [Key] Every REF Right; };
class Keyless { string Plain; };
)";

const cimhost::Schema& schema() {
    static cimhost::Schema known;
    if (known.classes().empty()) {
        cimhost::MofReader(known).readSource(classes, "classes");
    }
    return known;
}

void requireSound(const cimhost::ObjectPath& path) {
    require(cim::isName(path.className), "a path has a class");
    require(!path.nameSpace.empty(), "a path has a namespace");
    for (const cimhost::NamedValue& key : path.keys) {
        require(cim::isName(key.name), "a key has a name");
        require(!key.value.isNull && key.value.elements().size() == 1, "a key has a value");
    }
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    cimhost::ObjectPath path;
    try {
        path = cimhost::parseObjectPath(fuzz::inputOf(data, size), schema(), nameSpace);
    } catch (const cimhost::PathError&) {
        return 0;
    }
    requireSound(path);
    const std::string uri = cimhost::formatObjectPath(path);
    const cimhost::ObjectPath reread = cimhost::parseObjectPath(uri, schema(), "root/other");
    requireSound(reread);
    requireSame(cimhost::formatObjectPath(reread), uri, "path that was written and read");
    requireSame(reread.keys.size(), path.keys.size(), "keys of a path that was written and read");
    for (std::size_t key = 0; key < path.keys.size(); ++key) {
        require(reread.keys[key].value.type == path.keys[key].value.type, "a key keeps its type");
    }
    return 0;
}

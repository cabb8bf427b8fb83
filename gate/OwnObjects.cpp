#include "OwnObjects.h"

#include <deque>
#include <utility>

namespace gate {

namespace {

/** Characters as a CMPI string. It stays where it is: others point to it. */
struct Text {
    explicit Text(std::string text);
    Text(const Text&) = delete;
    Text& operator=(const Text&) = delete;

    std::string characters;
    CMPIString handle;
};

const char* getCharPtr(const CMPIString* string, CMPIStatus* rc) {
    if (rc != nullptr) {
        *rc = {CMPI_RC_OK, nullptr};
    }
    return static_cast<const Text*>(string->hdl)->characters.c_str();
}

CMPIStringFT stringFunctions{CMPIVersion200, nullptr, nullptr, getCharPtr};

Text::Text(std::string text) : characters(std::move(text)), handle{this, &stringFunctions} {}

/** A named value of a path or an instance. */
struct Member {
    Member(const char* itsName, CMPIType itsType, std::string text)
        : name(itsName), type(itsType), value(std::move(text)) {}

    Text name;
    CMPIType type;
    Text value;

    CMPIData data(CMPIValueState state) {
        CMPIData data{type, state, {}};
        if (type == CMPI_string) {
            data.value.string = &value.handle;
        } else {
            data.value = scalarFrom(value.characters, type);
        }
        return data;
    }
};

using Members = std::deque<Member>;  // grows without moving what is in it

void answer(CMPIStatus* rc, CMPIrc code) {
    if (rc != nullptr) {
        *rc = {code, nullptr};
    }
}

/** The member of a name, or data that say there is none. */
CMPIData find(Members& members, const char* name, CMPIValueState state, CMPIStatus* rc, CMPIrc codeForNone) {
    for (Member& member : members) {
        if (sameName(member.name.characters, name)) {
            answer(rc, CMPI_RC_OK);
            return member.data(state);
        }
    }
    answer(rc, codeForNone);
    return {CMPI_null, CMPI_notFound | CMPI_nullValue, {}};
}

}  // namespace

struct OwnPath::Content {
    Content(std::string itsNameSpace, std::string itsClassName)
        : nameSpace(std::move(itsNameSpace)), className(std::move(itsClassName)), handle{this, &functions} {}

    static Content& of(const CMPIObjectPath* path) { return *static_cast<Content*>(path->hdl); }

    template <Text Content::*part>
    static CMPIString* get(const CMPIObjectPath* path, CMPIStatus* rc) {
        answer(rc, CMPI_RC_OK);
        return &(of(path).*part).handle;
    }

    static CMPIData getKey(const CMPIObjectPath* path, const char* name, CMPIStatus* rc) {
        return find(of(path).keys, name, CMPI_keyValue, rc, CMPI_RC_ERR_NOT_FOUND);
    }

    static CMPIData getKeyAt(const CMPIObjectPath* path, CMPICount index, CMPIString** name, CMPIStatus* rc) {
        Members& keys = of(path).keys;
        if (index >= keys.size()) {
            answer(rc, CMPI_RC_ERR_NOT_FOUND);
            return {CMPI_null, CMPI_notFound | CMPI_nullValue, {}};
        }
        answer(rc, CMPI_RC_OK);
        if (name != nullptr) {
            *name = &keys[index].name.handle;
        }
        return keys[index].data(CMPI_keyValue);
    }

    static CMPICount getKeyCount(const CMPIObjectPath* path, CMPIStatus* rc) {
        answer(rc, CMPI_RC_OK);
        return static_cast<CMPICount>(of(path).keys.size());
    }

    static CMPIObjectPathFT makeFunctions() {
        CMPIObjectPathFT table{};
        table.ftVersion = CMPIVersion200;
        table.getNameSpace = &get<&Content::nameSpace>;
        table.getClassName = &get<&Content::className>;
        table.getKey = &getKey;
        table.getKeyAt = &getKeyAt;
        table.getKeyCount = &getKeyCount;
        return table;
    }

    static CMPIObjectPathFT functions;

    Text nameSpace;
    Text className;
    Members keys{};
    CMPIObjectPath handle;
};

CMPIObjectPathFT OwnPath::Content::functions = makeFunctions();

OwnPath::OwnPath(std::string nameSpace, std::string className)
    : content(std::make_unique<Content>(std::move(nameSpace), std::move(className))) {}

OwnPath::OwnPath(OwnPath&&) noexcept = default;
OwnPath::~OwnPath() = default;

void OwnPath::addKey(const char* name, std::string value) {
    content->keys.emplace_back(name, CMPI_string, std::move(value));
}

std::string OwnPath::key(const char* name) const {
    for (const Member& member : content->keys) {
        if (sameName(member.name.characters, name)) {
            return member.value.characters;
        }
    }
    return {};
}

const CMPIObjectPath* OwnPath::handle() const {
    return &content->handle;
}

struct OwnInstance::Content {
    Content() : handle{this, &functions} {}

    static CMPIData getProperty(const CMPIInstance* instance, const char* name, CMPIStatus* rc) {
        Content& content = *static_cast<Content*>(instance->hdl);
        return find(content.properties, name, CMPI_goodValue, rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    }

    static CMPIInstanceFT makeFunctions() {
        CMPIInstanceFT table{};
        table.ftVersion = CMPIVersion200;
        table.getProperty = &getProperty;
        return table;
    }

    static CMPIInstanceFT functions;

    Members properties{};
    CMPIInstance handle;
};

CMPIInstanceFT OwnInstance::Content::functions = makeFunctions();

OwnInstance::OwnInstance(const Values& values) : content(std::make_unique<Content>()) {
    for (const auto& [property, text] : values) {
        const CMPIType type = property->type == CMPI_dateTime ? CMPIType{CMPI_string} : property->type;
        content->properties.emplace_back(property->name, type, text);
    }
}

OwnInstance::OwnInstance(OwnInstance&&) noexcept = default;
OwnInstance::~OwnInstance() = default;

const CMPIInstance* OwnInstance::handle() const {
    return &content->handle;
}

}  // namespace gate

#pragma once

#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "broker/ObjectContents.h"

namespace cimhost {

class Arena;

/** The broker's side of an encapsulated object. Owned by an arena. */
class Object {
public:
    Object(Arena& itsOwner, ObjectKind itsKind) : owner(itsOwner), kindOf(itsKind) {}
    virtual ~Object() { noticeRelease(); }
    Object(const Object&) = delete;
    Object& operator=(const Object&) = delete;

    /** The arena that the object was created in. */
    Arena& arena() const { return owner; }
    ObjectKind kind() const { return kindOf; }

    /** Whether this is a clone. Clones are valid until their release: they outlive requests and marks. */
    bool isClone = false;

    /** Whether this is a string object whose character pointer is null. Some object managers pass such objects. */
    bool lacksCharacters = false;

    /** Set to true when the object is released or destroyed; can be null. */
    std::shared_ptr<bool> released{};

protected:
    void noticeRelease() {
        if (released != nullptr) {
            *released = true;
        }
    }

private:
    Arena& owner;
    ObjectKind kindOf;
};

/**
 * An encapsulated object: the handle that providers use, and its content. A release destroys the content. The handle
 * remains until the request ends, so that a use after the release is reported as an error.
 */
template <class Handle>
class Encapsulated final : public Object {
public:
    using Content = typename Traits<Handle>::Content;
    using Table = std::remove_pointer_t<decltype(Handle::ft)>;

    Encapsulated(Arena& itsOwner, const FunctionTables& tables, Content&& initial)
        : Object(itsOwner, Traits<Handle>::kind),
          // CMPI's handles have pointers to non-const tables, but callers do not write to the tables.
          handle{static_cast<Object*>(this), const_cast<Table*>(&(tables.*Traits<Handle>::table))},
          content(std::move(initial)) {}

    void release() {
        handle.hdl = nullptr;
        content.reset();
        noticeRelease();
    }

    Handle handle;
    std::optional<Content> content;
};

/** The object of a handle; null if the handle is null, released or of another kind. */
template <class Handle>
Encapsulated<Handle>* objectOf(const Handle* handle) {
    if (handle == nullptr || handle->hdl == nullptr) {
        return nullptr;
    }
    auto* object = static_cast<Object*>(handle->hdl);
    return object->kind() == Traits<Handle>::kind ? static_cast<Encapsulated<Handle>*>(object) : nullptr;
}

/** Name of the type of objects of this kind, such as "CMPIInstance". */
const char* typeNameOf(ObjectKind kind);

/** Describes an object in readable form; after its release, as "CMPIInstance (released)". */
std::string describe(const Object& object);

}  // namespace cimhost

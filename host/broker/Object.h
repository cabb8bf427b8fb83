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

    /** The arena that it was created in. */
    Arena& arena() const { return owner; }
    ObjectKind kind() const { return kindOf; }

    /** Clones are valid until their release: they outlive requests and marks. */
    bool isClone = false;

    /** A string object whose character pointer is null, which some object managers pass. */
    bool lacksCharacters = false;

    /** Set to true when the object is released or destroyed; may be null. */
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
          // CMPI's handles point to tables without const, but callers do not write to them.
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

/** Name of the type of these objects, such as "CMPIInstance". */
const char* typeNameOf(ObjectKind kind);

/** Describes an object for people; "CMPIInstance (released)" after its release. */
std::string describe(const Object& object);

}  // namespace cimhost

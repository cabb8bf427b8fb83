#pragma once

#include <memory>
#include <optional>
#include <utility>

#include "broker/ObjectContents.h"

namespace cimhost {

class Arena;

/** Something that an arena owns: the broker's side of an encapsulated object. */
class Object {
public:
    Object(Arena& itsOwner, ObjectKind itsKind) : owner(itsOwner), kindOf(itsKind) {}
    virtual ~Object() { noticeRelease(); }
    Object(const Object&) = delete;
    Object& operator=(const Object&) = delete;

    /** The arena that it was made in. */
    Arena& arena() const { return owner; }
    ObjectKind kind() const { return kindOf; }

    /** Clones live until somebody releases them: they outlive requests and marks. */
    bool isClone = false;

    /** A string object whose character pointer is null, which some object managers pass. */
    bool lacksCharacters = false;

    /** Becomes true when the object is released or goes; may be null. */
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
 * An encapsulated object: the handle that the provider sees and what it stands for. After a release the content is
 * gone; the handle stays, pointing to nothing, until the request ends, so that a use after release is told, not fatal.
 */
template <class Handle>
class Encapsulated final : public Object {
public:
    using Content = typename Traits<Handle>::Content;
    using Table = std::remove_pointer_t<decltype(Handle::ft)>;

    Encapsulated(Arena& itsOwner, const FunctionTables& tables, Content initial)
        : Object(itsOwner, Traits<Handle>::kind),
          // The standard's handles point to tables without const; nobody writes to them.
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

/** The object behind a handle; null when the handle is null, released or of another kind. */
template <class Handle>
Encapsulated<Handle>* objectOf(const Handle* handle) {
    if (handle == nullptr || handle->hdl == nullptr) {
        return nullptr;
    }
    auto* object = static_cast<Object*>(handle->hdl);
    return object->kind() == Traits<Handle>::kind ? static_cast<Encapsulated<Handle>*>(object) : nullptr;
}

}  // namespace cimhost

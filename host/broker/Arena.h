#pragma once

#include <cstddef>
#include <memory>
#include <mutex>
#include <utility>
#include <vector>

#include "broker/Object.h"

namespace cimhost {

/** Owns encapsulated objects, such as those of one request, and frees them when it is destroyed. Thread-safe. */
class Arena {
public:
    /**
     * @param itsTables function tables of its objects; must outlive the arena
     * @param forClones receives the clones of its objects, which outlive a request; null: this arena
     */
    explicit Arena(const FunctionTables& itsTables, Arena* forClones = nullptr)
        : tables(itsTables), cloneArena(forClones == nullptr ? *this : *forClones) {}
    Arena(const Arena&) = delete;
    Arena& operator=(const Arena&) = delete;

    /** Creates an object with this content. The handle is valid as long as the arena owns the object. */
    template <class Handle>
    Handle* make(typename Traits<Handle>::Content&& content) {
        auto object = std::make_unique<Encapsulated<Handle>>(*this, tables, std::move(content));
        Handle* handle = &object->handle;
        adopt(std::move(object));
        return handle;
    }

    template <class Handle>
    Handle* make(const typename Traits<Handle>::Content& content) {
        return make<Handle>(typename Traits<Handle>::Content(content));
    }

    /** Marks the current position for releaseMark(). @return the mark; owned by the arena */
    const void* mark();

    /**
     * Frees the objects created after the mark, except clones. Frees the mark and all later marks.
     * @return false if the pointer is not a current mark of this arena
     */
    bool releaseMark(const void* mark);

    /** The arena that receives the clones of this arena's objects. */
    Arena& clones() const { return cloneArena; }

    /** Moves an object from another arena to this one, if the other owns it. */
    void takeFrom(Arena& other, const Object& object);

    /** Number of objects, including released ones. */
    std::size_t size() const;

private:
    void adopt(std::unique_ptr<Object> object);
    std::unique_ptr<Object> disown(const Object& object);

    const FunctionTables& tables;
    Arena& cloneArena;
    mutable std::mutex mutex;
    std::vector<std::unique_ptr<Object>> objects;
    std::vector<std::unique_ptr<std::size_t>> marks;  ///< the number of objects at each mark
};

}  // namespace cimhost

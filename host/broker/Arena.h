#pragma once

#include <cstddef>
#include <memory>
#include <mutex>
#include <utility>
#include <vector>

#include "broker/Object.h"

namespace cimhost {

/**
 * Owner of the encapsulated objects of one request on one thread: it frees them all when it goes. Safe to use from
 * several threads.
 */
class Arena {
public:
    /**
     * @param itsTables function tables that its objects point to; they must outlive the arena
     * @param forClones where clones of its objects go, which outlive a request; null for this arena itself
     */
    explicit Arena(const FunctionTables& itsTables, Arena* forClones = nullptr)
        : tables(itsTables), cloneArena(forClones == nullptr ? *this : *forClones) {}
    Arena(const Arena&) = delete;
    Arena& operator=(const Arena&) = delete;

    /** A new object with that content; the handle lives as long as the arena. */
    template <class Handle>
    Handle* make(typename Traits<Handle>::Content content) {
        auto object = std::make_unique<Encapsulated<Handle>>(*this, tables, std::move(content));
        Handle* handle = &object->handle;
        adopt(std::move(object));
        return handle;
    }

    /** Remembers how far the arena is filled, for releaseMark(); the answer belongs to the arena. */
    const void* mark();

    /**
     * Frees all objects made since the mark, except clones, and the marks set since.
     * @return false when that is no mark of this arena, or no longer
     */
    bool releaseMark(const void* mark);

    /** Where clones of its objects go. */
    Arena& clones() const { return cloneArena; }

    /** Takes over an object of another arena, if it is there. */
    void takeFrom(Arena& other, const Object& object);

    /** How many objects it holds, released ones included. */
    std::size_t size() const;

private:
    void adopt(std::unique_ptr<Object> object);
    std::unique_ptr<Object> disown(const Object& object);

    const FunctionTables& tables;
    Arena& cloneArena;
    mutable std::mutex mutex;
    std::vector<std::unique_ptr<Object>> objects;
    std::vector<std::unique_ptr<std::size_t>> marks;  ///< each the number of objects at its time
};

}  // namespace cimhost

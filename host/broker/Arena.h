#pragma once

#include <cstddef>
#include <memory>
#include <mutex>
#include <utility>
#include <vector>

#include "broker/Object.h"

namespace cimhost {

/**
 * Owner of the encapsulated objects of one request on one thread: it frees them all when it goes. Objects made
 * from another object join its arena. Safe to use from several threads.
 */
class Arena {
public:
    /** @param itsTables function tables that its objects point to; they must outlive the arena */
    explicit Arena(const FunctionTables& itsTables) : tables(itsTables) {}
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

    /** How many objects it holds, released ones included. */
    std::size_t size() const;

private:
    void adopt(std::unique_ptr<Object> object);

    const FunctionTables& tables;
    mutable std::mutex mutex;
    std::vector<std::unique_ptr<Object>> objects;
    std::vector<std::unique_ptr<std::size_t>> marks;  ///< each the number of objects at its time
};

}  // namespace cimhost

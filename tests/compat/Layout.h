#pragma once

#include <cstddef>
#include <type_traits>

/**
 * Compile-time statements about the memory layout of the CMPI headers. One line is one row of a
 * table: a table of functions begins with a version number that takes one pointer's room, and every
 * member takes one pointer's room after it.
 */

template <class Actual, class Expected>
constexpr bool sameType = std::is_same_v<std::remove_cv_t<Actual>, Expected>;

/** A structure has the tag that the linker sees and that many bytes. */
#define LAYOUT_SIZE(type, bytes)                                             \
    static_assert(std::is_same_v<type, decltype(_##type{})>, #type ": tag"); \
    static_assert(sizeof(type) == (bytes), #type ": size");                  \
    static_assert(std::is_standard_layout_v<type>, #type ": not what C understands")

/** A member stands at that byte and is of that type. */
#define LAYOUT_MEMBER(type, member, byte, ...)                                    \
    static_assert(offsetof(type, member) == (byte), #type "." #member ": place"); \
    static_assert(sameType<decltype(type::member), __VA_ARGS__>, #type "." #member ": type")

/** A function stands in that slot of a table, counted in pointers, and has that signature. */
#define LAYOUT_SLOT(type, slot, member, ...)                                                     \
    static_assert(offsetof(type, member) == (slot) * sizeof(void*), #type "." #member ": slot"); \
    static_assert(std::is_same_v<decltype(type::member), __VA_ARGS__>, #type "." #member ": signature")

/** A pair of a private handle and a function table. */
#define LAYOUT_OBJECT(type, handle)       \
    LAYOUT_SIZE(type, 2 * sizeof(void*)); \
    LAYOUT_MEMBER(type, hdl, 0, handle);  \
    LAYOUT_MEMBER(type, ft, sizeof(void*), type##FT*)

/** A table of that many slots, the first of which holds its version. */
#define LAYOUT_TABLE(type, slots)               \
    LAYOUT_SIZE(type, (slots) * sizeof(void*)); \
    LAYOUT_MEMBER(type, ftVersion, 0, int)

/** A table of a management interface: two versions share the first slot, the name has the second. */
#define LAYOUT_INTERFACE(type, handle, slots)             \
    LAYOUT_OBJECT(type, handle);                          \
    LAYOUT_TABLE(type##FT, slots);                        \
    LAYOUT_MEMBER(type##FT, miVersion, sizeof(int), int); \
    LAYOUT_MEMBER(type##FT, miName, sizeof(void*), const char*)

/** A macro, an enumerator or a size has that value. */
#define LAYOUT_VALUE(name, value) static_assert((name) == (value), #name)

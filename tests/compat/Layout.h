#pragma once

#include <cstddef>
#include <type_traits>

/**
 * Compile-time checks of the memory layout of the CMPI headers. A line checks one row of a table. A function table
 * starts with a version number in the first pointer-sized slot; every member occupies one further slot.
 */

template <class Actual, class Expected>
constexpr bool sameType = std::is_same_v<std::remove_cv_t<Actual>, Expected>;

/** Checks the tag of a structure, which is part of mangled names, and its size. */
#define LAYOUT_SIZE(type, bytes)                                             \
    static_assert(std::is_same_v<type, decltype(_##type{})>, #type ": tag"); \
    static_assert(sizeof(type) == (bytes), #type ": size");                  \
    static_assert(std::is_standard_layout_v<type>, #type ": not what C understands")

/** Checks the byte offset and the type of a member. */
#define LAYOUT_MEMBER(type, member, byte, ...)                                    \
    static_assert(offsetof(type, member) == (byte), #type "." #member ": place"); \
    static_assert(sameType<decltype(type::member), __VA_ARGS__>, #type "." #member ": type")

/** Checks the slot of a function in a table, counted in pointers, and its signature. */
#define LAYOUT_SLOT(type, slot, member, ...)                                                     \
    static_assert(offsetof(type, member) == (slot) * sizeof(void*), #type "." #member ": slot"); \
    static_assert(std::is_same_v<decltype(type::member), __VA_ARGS__>, #type "." #member ": signature")

/** Checks a pair of a private handle and a function table. */
#define LAYOUT_OBJECT(type, handle)       \
    LAYOUT_SIZE(type, 2 * sizeof(void*)); \
    LAYOUT_MEMBER(type, hdl, 0, handle);  \
    LAYOUT_MEMBER(type, ft, sizeof(void*), type##FT*)

/** Checks that a table has this number of slots, the first of which contains the version. */
#define LAYOUT_TABLE(type, slots)               \
    LAYOUT_SIZE(type, (slots) * sizeof(void*)); \
    LAYOUT_MEMBER(type, ftVersion, 0, int)

/** Checks a table of a management interface: the first slot contains two versions, the second the name. */
#define LAYOUT_INTERFACE(type, handle, slots)             \
    LAYOUT_OBJECT(type, handle);                          \
    LAYOUT_TABLE(type##FT, slots);                        \
    LAYOUT_MEMBER(type##FT, miVersion, sizeof(int), int); \
    LAYOUT_MEMBER(type##FT, miName, sizeof(void*), const char*)

/** Checks the value of a macro, an enumerator or a size. */
#define LAYOUT_VALUE(name, value) static_assert((name) == (value), #name)

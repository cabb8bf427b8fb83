#pragma once

/**
 * Marks a declaration that is seen outside its shared library. Everything else is compiled with
 * hidden visibility.
 */
#define KO_EXPORT __attribute__((visibility("default")))

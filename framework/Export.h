#pragma once

/** Exports a declaration from its shared library. The default visibility is hidden. */
#define KO_EXPORT __attribute__((visibility("default")))

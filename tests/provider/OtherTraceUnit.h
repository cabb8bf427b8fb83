#pragma once

/** Formats a trace line in another translation unit. */
const char* traceOfOtherUnit(const char* function);

#pragma once

/** Returns the result of another translation unit's formatting function. */
const char* traceOfOtherUnit(const char* function);

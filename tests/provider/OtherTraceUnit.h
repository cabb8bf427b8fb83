#pragma once

/** What the formatting functions of another source unit give. */
const char* traceOfOtherUnit(const char* function);

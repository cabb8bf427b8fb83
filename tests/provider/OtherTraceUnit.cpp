#include "OtherTraceUnit.h"

#include "TraceFormat.h"

const char* traceOfOtherUnit(const char* function) {
    return KO::trace(function, "Other.cpp", 1, KO::MT_ENTERING);
}

// Scalars, values, types, codes and names.
#include <cmpidt.h>

#include <string_view>

#include "Layout.h"

// Scalars
static_assert(std::is_same_v<CMPICount, unsigned int>);
static_assert(std::is_same_v<CMPIBoolean, unsigned char>);
static_assert(std::is_same_v<CMPIChar16, unsigned short>);
static_assert(std::is_same_v<CMPIUint8, unsigned char>);
static_assert(std::is_same_v<CMPIUint16, unsigned short>);
static_assert(std::is_same_v<CMPIUint32, unsigned int>);
static_assert(std::is_same_v<CMPIUint64, unsigned long long>);
static_assert(std::is_same_v<CMPISint8, signed char>);
static_assert(std::is_same_v<CMPISint16, short>);
static_assert(std::is_same_v<CMPISint32, int>);
static_assert(std::is_same_v<CMPISint64, long long>);
static_assert(std::is_same_v<CMPIReal32, float>);
static_assert(std::is_same_v<CMPIReal64, double>);
static_assert(std::is_same_v<CMPIType, unsigned short>);
static_assert(std::is_same_v<CMPIValueState, unsigned short>);
static_assert(std::is_same_v<CMPIAccessor, CMPIData(const char*, void*)>);
static_assert(std::is_same_v<CMPIMsgFileHandle, void*>);
static_assert(std::is_same_v<CMPIGcStat, void>);
static_assert(std::is_same_v<CMPIFlags, unsigned int>);

// Values
LAYOUT_SIZE(CMPIValuePtr, 16);
LAYOUT_MEMBER(CMPIValuePtr, ptr, 0, void*);
LAYOUT_MEMBER(CMPIValuePtr, length, 8, CMPICount);

LAYOUT_SIZE(CMPIValue, 16);
LAYOUT_MEMBER(CMPIValue, uint64, 0, CMPIUint64);
LAYOUT_MEMBER(CMPIValue, uint32, 0, CMPIUint32);
LAYOUT_MEMBER(CMPIValue, uint16, 0, CMPIUint16);
LAYOUT_MEMBER(CMPIValue, uint8, 0, CMPIUint8);
LAYOUT_MEMBER(CMPIValue, sint64, 0, CMPISint64);
LAYOUT_MEMBER(CMPIValue, sint32, 0, CMPISint32);
LAYOUT_MEMBER(CMPIValue, sint16, 0, CMPISint16);
LAYOUT_MEMBER(CMPIValue, sint8, 0, CMPISint8);
LAYOUT_MEMBER(CMPIValue, real64, 0, CMPIReal64);
LAYOUT_MEMBER(CMPIValue, real32, 0, CMPIReal32);
LAYOUT_MEMBER(CMPIValue, boolean, 0, CMPIBoolean);
LAYOUT_MEMBER(CMPIValue, char16, 0, CMPIChar16);
LAYOUT_MEMBER(CMPIValue, inst, 0, CMPIInstance*);
LAYOUT_MEMBER(CMPIValue, ref, 0, CMPIObjectPath*);
LAYOUT_MEMBER(CMPIValue, args, 0, CMPIArgs*);
LAYOUT_MEMBER(CMPIValue, filter, 0, CMPISelectExp*);
LAYOUT_MEMBER(CMPIValue, Enum, 0, CMPIEnumeration*);
LAYOUT_MEMBER(CMPIValue, array, 0, CMPIArray*);
LAYOUT_MEMBER(CMPIValue, string, 0, CMPIString*);
LAYOUT_MEMBER(CMPIValue, chars, 0, char*);
LAYOUT_MEMBER(CMPIValue, dateTime, 0, CMPIDateTime*);
LAYOUT_MEMBER(CMPIValue, dataPtr, 0, CMPIValuePtr);
LAYOUT_MEMBER(CMPIValue, Byte, 0, CMPISint8);
LAYOUT_MEMBER(CMPIValue, Short, 0, CMPISint16);
LAYOUT_MEMBER(CMPIValue, Int, 0, CMPISint32);
LAYOUT_MEMBER(CMPIValue, Long, 0, CMPISint64);
LAYOUT_MEMBER(CMPIValue, Float, 0, CMPIReal32);
LAYOUT_MEMBER(CMPIValue, Double, 0, CMPIReal64);

LAYOUT_SIZE(CMPIData, 24);
LAYOUT_MEMBER(CMPIData, type, 0, CMPIType);
LAYOUT_MEMBER(CMPIData, state, 2, CMPIValueState);
LAYOUT_MEMBER(CMPIData, value, 8, CMPIValue);

LAYOUT_SIZE(CMPIStatus, 16);
LAYOUT_MEMBER(CMPIStatus, rc, 0, CMPIrc);
LAYOUT_MEMBER(CMPIStatus, msg, 8, CMPIString*);

// Versions
LAYOUT_VALUE(CMPIVersion100, 100);
LAYOUT_VALUE(CMPIVersion200, 200);

// Types, states, flags and capabilities
LAYOUT_VALUE(CMPI_null, 0x0);
LAYOUT_VALUE(CMPI_SIMPLE, 0x2);
LAYOUT_VALUE(CMPI_boolean, 0x2);
LAYOUT_VALUE(CMPI_char16, 0x3);
LAYOUT_VALUE(CMPI_REAL, 0x8);
LAYOUT_VALUE(CMPI_real32, 0x8);
LAYOUT_VALUE(CMPI_real64, 0xc);
LAYOUT_VALUE(CMPI_UINT, 0x80);
LAYOUT_VALUE(CMPI_uint8, 0x80);
LAYOUT_VALUE(CMPI_uint16, 0x90);
LAYOUT_VALUE(CMPI_uint32, 0xa0);
LAYOUT_VALUE(CMPI_uint64, 0xb0);
LAYOUT_VALUE(CMPI_SINT, 0xc0);
LAYOUT_VALUE(CMPI_sint8, 0xc0);
LAYOUT_VALUE(CMPI_sint16, 0xd0);
LAYOUT_VALUE(CMPI_sint32, 0xe0);
LAYOUT_VALUE(CMPI_sint64, 0xf0);
LAYOUT_VALUE(CMPI_INTEGER, 0xc0);
LAYOUT_VALUE(CMPI_ENC, 0x1000);
LAYOUT_VALUE(CMPI_instance, 0x1000);
LAYOUT_VALUE(CMPI_ref, 0x1100);
LAYOUT_VALUE(CMPI_args, 0x1200);
LAYOUT_VALUE(CMPI_class, 0x1300);
LAYOUT_VALUE(CMPI_filter, 0x1400);
LAYOUT_VALUE(CMPI_enumeration, 0x1500);
LAYOUT_VALUE(CMPI_string, 0x1600);
LAYOUT_VALUE(CMPI_chars, 0x1700);
LAYOUT_VALUE(CMPI_dateTime, 0x1800);
LAYOUT_VALUE(CMPI_ptr, 0x1900);
LAYOUT_VALUE(CMPI_charsptr, 0x1a00);
LAYOUT_VALUE(CMPI_ARRAY, 0x2000);
LAYOUT_VALUE(CMPI_booleanA, 0x2002);
LAYOUT_VALUE(CMPI_uint8A, 0x2080);
LAYOUT_VALUE(CMPI_uint16A, 0x2090);
LAYOUT_VALUE(CMPI_uint32A, 0x20a0);
LAYOUT_VALUE(CMPI_uint64A, 0x20b0);
LAYOUT_VALUE(CMPI_sint32A, 0x20e0);
LAYOUT_VALUE(CMPI_stringA, 0x3600);
LAYOUT_VALUE(CMPI_charsA, 0x3700);
LAYOUT_VALUE(CMPI_dateTimeA, 0x3800);
LAYOUT_VALUE(CMPI_instanceA, 0x3000);
LAYOUT_VALUE(CMPI_refA, 0x3100);
LAYOUT_VALUE(CMPI_keyInteger, 0xf0);
LAYOUT_VALUE(CMPI_keyString, 0x1600);
LAYOUT_VALUE(CMPI_keyBoolean, 0x2);
LAYOUT_VALUE(CMPI_keyRef, 0x1100);
LAYOUT_VALUE(CMPI_goodValue, 0x0);
LAYOUT_VALUE(CMPI_nullValue, 0x100);
LAYOUT_VALUE(CMPI_keyValue, 0x200);
LAYOUT_VALUE(CMPI_notFound, 0x400);
LAYOUT_VALUE(CMPI_badValue, 0x8000);
LAYOUT_VALUE(CMPI_FLAG_LocalOnly, 0x1);
LAYOUT_VALUE(CMPI_FLAG_DeepInheritance, 0x2);
LAYOUT_VALUE(CMPI_FLAG_IncludeQualifiers, 0x4);
LAYOUT_VALUE(CMPI_FLAG_IncludeClassOrigin, 0x8);
LAYOUT_VALUE(CMPI_MB_BasicRead, 0x1);
LAYOUT_VALUE(CMPI_MB_BasicWrite, 0x3);
LAYOUT_VALUE(CMPI_MB_InstanceManipulation, 0x7);
LAYOUT_VALUE(CMPI_MB_AssociationTraversal, 0x9);
LAYOUT_VALUE(CMPI_MB_Class_0, 0x1);
LAYOUT_VALUE(CMPI_MB_Class_1, 0x3);
LAYOUT_VALUE(CMPI_MB_Class_2, 0x7);

// Names of context entries
static_assert(std::string_view(CMPIPrincipal) == "CMPIPrincipal");
static_assert(std::string_view(CMPIInvocationFlags) == "CMPIInvocationFlags");
static_assert(std::string_view(CMPIInitNameSpace) == "CMPIInitNameSpace");
static_assert(std::string_view(CMPIRole) == "CMPIRole");
static_assert(std::string_view(CMPIAcceptLanguage) == "CMPIAcceptLanguage");
static_assert(std::string_view(CMPIContentLanguage) == "CMPIContentLanguage");

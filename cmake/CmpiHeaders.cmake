# Selects the CMPI headers. By default: those of an installed CMPI development package, otherwise the project's own.
set(LAW_CMPI_HEADERS AUTO CACHE STRING "Which CMPI headers to use: AUTO, SYSTEM or BUNDLED")
set_property(CACHE LAW_CMPI_HEADERS PROPERTY STRINGS AUTO SYSTEM BUNDLED)

set(bundled_cmpi_headers ${PROJECT_SOURCE_DIR}/compat/cmpi)
find_path(LAW_SYSTEM_CMPI_HEADERS NAMES cmpidt.h PATH_SUFFIXES cmpi)
mark_as_advanced(LAW_SYSTEM_CMPI_HEADERS)

if(LAW_CMPI_HEADERS STREQUAL "SYSTEM" AND NOT LAW_SYSTEM_CMPI_HEADERS)
    message(FATAL_ERROR "LAW_CMPI_HEADERS is SYSTEM, but this system has no cmpidt.h. "
                        "Install its CMPI development package or use BUNDLED.")
elseif(LAW_CMPI_HEADERS STREQUAL "BUNDLED" OR NOT LAW_SYSTEM_CMPI_HEADERS)
    set(cmpi_headers ${bundled_cmpi_headers})
    message(STATUS "CMPI headers: the project's own, ${cmpi_headers}")
elseif(LAW_CMPI_HEADERS MATCHES "^(AUTO|SYSTEM)$")
    set(cmpi_headers ${LAW_SYSTEM_CMPI_HEADERS})
    message(STATUS "CMPI headers: the system's, ${cmpi_headers}")
else()
    message(FATAL_ERROR "LAW_CMPI_HEADERS is '${LAW_CMPI_HEADERS}': must be AUTO, SYSTEM or BUNDLED")
endif()

add_library(law_cmpi INTERFACE)
target_include_directories(law_cmpi SYSTEM INTERFACE $<BUILD_INTERFACE:${cmpi_headers}>)
target_compile_definitions(law_cmpi INTERFACE CMPI_PLATFORM_LINUX_GENERIC_GNU CMPI_VERSION=200)

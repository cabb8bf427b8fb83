# Where things are installed, and in which component: provider, agent, host, development, or one of fleet/
include(GNUInstallDirs)

set(LAW_PROVIDER_DIRECTORY ${CMAKE_INSTALL_LIBDIR}/cmpi)
set(LAW_HEADER_DIRECTORY ${CMAKE_INSTALL_INCLUDEDIR}/ostrel)
# The package that CMake finds.
set(LAW_EXPORT Ostrel)
# The number of the binary interface that framework/ declares: libraries of other agents bear it too.
set(LAW_FRAMEWORK_INTERFACE 1)

find_program(LAW_GZIP gzip REQUIRED)
mark_as_advanced(LAW_GZIP)

# Libraries that the dynamic linker looks for elsewhere are found by their place seen from their users.
set(from_provider_directory "$ORIGIN")
set(from_library_directory "")
if(NOT CMAKE_INSTALL_FULL_LIBDIR IN_LIST CMAKE_CXX_IMPLICIT_LINK_DIRECTORIES)
    list(APPEND from_provider_directory "$ORIGIN/..")
    set(from_library_directory "$ORIGIN")
endif()

# law_install_provider(<target> COMPONENT <component> [BESIDE_OTHERS])
# A library that object managers load; with BESIDE_OTHERS, one that needs another of that directory.
function(law_install_provider target)
    cmake_parse_arguments(arg "BESIDE_OTHERS" "COMPONENT" "" ${ARGN})
    set(search ${from_provider_directory})
    if(NOT arg_BESIDE_OTHERS)
        list(REMOVE_ITEM search "$ORIGIN")
    endif()
    set_target_properties(${target} PROPERTIES BUILD_RPATH_USE_ORIGIN ON INSTALL_RPATH "${search}")
    install(TARGETS ${target} LIBRARY DESTINATION ${LAW_PROVIDER_DIRECTORY} COMPONENT ${arg_COMPONENT})
endfunction()

# law_install_library(<target> COMPONENT <component>)
# A library with the interface that framework/ declares.
function(law_install_library target)
    cmake_parse_arguments(arg "" "COMPONENT" "" ${ARGN})
    set_target_properties(${target} PROPERTIES
        SOVERSION ${LAW_FRAMEWORK_INTERFACE} VERSION ${LAW_FRAMEWORK_INTERFACE}.0.0
        INSTALL_RPATH "${from_library_directory}")
    install(TARGETS ${target} EXPORT ${LAW_EXPORT}
        LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT ${arg_COMPONENT}
        NAMELINK_COMPONENT development)
endfunction()

# law_install_compressed(<file> <name> <directory> <component>)
# Manual pages and changes are read compressed. The compressed file bears no time, so that it is always the same.
function(law_install_compressed file name directory component)
    set(compressed ${CMAKE_CURRENT_BINARY_DIR}/compressed/${component}/${name})
    set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${file})
    file(MAKE_DIRECTORY ${CMAKE_CURRENT_BINARY_DIR}/compressed/${component})
    execute_process(COMMAND ${LAW_GZIP} -9 --no-name --stdout ${file}
        OUTPUT_FILE ${compressed} COMMAND_ERROR_IS_FATAL ANY)
    install(FILES ${compressed} DESTINATION ${directory} COMPONENT ${component})
endfunction()

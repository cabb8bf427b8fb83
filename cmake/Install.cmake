# Installation directories and components. The components are provider, agent, host, development, and those of fleet/.
include(GNUInstallDirs)

set(LAW_PROVIDER_DIRECTORY ${CMAKE_INSTALL_LIBDIR}/cmpi)
set(LAW_HEADER_DIRECTORY ${CMAKE_INSTALL_INCLUDEDIR}/ostrel)
# Name of the CMake package.
set(LAW_EXPORT Ostrel)
# Version of the binary interface that framework/ declares. Libraries of other agents use it as their SOVERSION, too.
set(LAW_FRAMEWORK_INTERFACE 1)

find_program(LAW_GZIP gzip REQUIRED)
mark_as_advanced(LAW_GZIP)

# Libraries outside of the dynamic linker's default directories are found relative to the libraries that need them. In the
# build tree, all libraries are in one directory.
if(NOT CMAKE_INSTALL_FULL_LIBDIR IN_LIST CMAKE_CXX_IMPLICIT_LINK_DIRECTORIES)
    set(from_provider_directory "$ORIGIN" "$ORIGIN/..")
    set(from_library_directory "$ORIGIN")
endif()

# law_run_path(<target> [<directory>...])
# Gives a library the run path of its installation in the build tree, too. CMake would pad a longer run path of the build
# tree with empty elements, which mean the current directory.
function(law_run_path target)
    set_target_properties(${target} PROPERTIES INSTALL_RPATH "${ARGN}")
    if(ARGN)
        set_target_properties(${target} PROPERTIES BUILD_WITH_INSTALL_RPATH ON)
    endif()
endfunction()

# law_install_provider(<target> COMPONENT <component> [BESIDE_OTHERS])
# Installs a library that object managers load. BESIDE_OTHERS: the library needs another library in its directory.
function(law_install_provider target)
    cmake_parse_arguments(arg "BESIDE_OTHERS" "COMPONENT" "" ${ARGN})
    set(directories ${from_provider_directory})
    if(arg_BESIDE_OTHERS AND NOT directories)
        set(directories "$ORIGIN")
    endif()
    law_run_path(${target} ${directories})
    install(TARGETS ${target} LIBRARY DESTINATION ${LAW_PROVIDER_DIRECTORY} COMPONENT ${arg_COMPONENT})
endfunction()

# law_install_library(<target> COMPONENT <component>)
# Installs a library that implements framework/.
function(law_install_library target)
    cmake_parse_arguments(arg "" "COMPONENT" "" ${ARGN})
    set_target_properties(${target} PROPERTIES
        SOVERSION ${LAW_FRAMEWORK_INTERFACE} VERSION ${LAW_FRAMEWORK_INTERFACE}.0.0)
    law_run_path(${target} ${from_library_directory})
    install(TARGETS ${target} EXPORT ${LAW_EXPORT}
        LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT ${arg_COMPONENT}
        NAMELINK_COMPONENT development)
endfunction()

# law_install_configuration(<file> <directory> <name> <component>)
# Installs a file below the directory of the system's configuration. Does not replace a different installed file.
function(law_install_configuration file directory name component)
    install(CODE "
        set(new \"${file}\")
        set(directory \"${CMAKE_INSTALL_SYSCONFDIR}/${directory}\")
        set(name ${name})"
        COMPONENT ${component})
    install(SCRIPT ${PROJECT_SOURCE_DIR}/cmake/InstallConfiguration.cmake COMPONENT ${component})
endfunction()

# law_install_compressed(<file> <name> <directory> <component>)
# Installs a manual page or changelog compressed. The compressed file contains no timestamp, so that it is
# reproducible.
function(law_install_compressed file name directory component)
    set(compressed ${CMAKE_CURRENT_BINARY_DIR}/compressed/${component}/${name})
    set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${file})
    file(MAKE_DIRECTORY ${CMAKE_CURRENT_BINARY_DIR}/compressed/${component})
    execute_process(COMMAND ${LAW_GZIP} -9 --no-name --stdout ${file}
        OUTPUT_FILE ${compressed} COMMAND_ERROR_IS_FATAL ANY)
    install(FILES ${compressed} DESTINATION ${directory} COMPONENT ${component})
endfunction()

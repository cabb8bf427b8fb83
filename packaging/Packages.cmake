# The Debian packages, one per component. Include this file last: it packs the files that all other directories install.
set(CPACK_GENERATOR DEB)
set(CPACK_SET_DESTDIR ON)
set(CPACK_INSTALL_PREFIX ${CMAKE_INSTALL_PREFIX})
set(CPACK_STRIP_FILES ON)
set(CPACK_VERBATIM_VARIABLES ON)
set(CPACK_PACKAGE_VERSION ${PROJECT_VERSION})
set(CPACK_PACKAGE_DIRECTORY ${PROJECT_BINARY_DIR}/packages)
set(CPACK_PACKAGE_CONTACT "Lease and Warranty Provider developers <developers@lease-warranty-provider.example>")
# Each package has a separate summary.
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")
set(CPACK_COMPONENTS_ALL provider agent host development fleet facts metrics report)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_PACKAGE_RELEASE 1)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION admin)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
# Computes the dependencies on libraries of other packages. The agent's libraries are not installed at this point.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${CMAKE_LIBRARY_OUTPUT_DIRECTORY})

set(debian ${CMAKE_CURRENT_LIST_DIR}/debian)

# law_control_files(<component> <variable>)
# Lists the control files of a component's package, debian/<component>/*, and configures those that end in .in.
function(law_control_files component variable)
    file(GLOB files CONFIGURE_DEPENDS ${debian}/${component}/*)
    list(REMOVE_ITEM files ${debian}/${component}/lintian-overrides)
    set(templates ${files})
    list(FILTER templates INCLUDE REGEX "\\.in$")
    foreach(template IN LISTS templates)
        cmake_path(GET template STEM LAST_ONLY name)
        configure_file(${template} ${CMAKE_CURRENT_BINARY_DIR}/debian/${component}/${name} @ONLY)
        list(REMOVE_ITEM files ${template})
        list(APPEND files ${CMAKE_CURRENT_BINARY_DIR}/debian/${component}/${name})
    endforeach()
    set(${variable} ${files} PARENT_SCOPE)
endfunction()

# law_package(<component> <name> DESCRIPTION <summary and lines> [DEPENDS <packages>] [SECTION <section>]
#             [DOCUMENTS <names>])
# Defines the package of a component. DOCUMENTS are files of docs/, and debian/<component> has the control files. Each
# package contains the copyright, the changelogs and its lintian overrides.
macro(law_package component name)
    cmake_parse_arguments(arg "" "DESCRIPTION;DEPENDS;SECTION" "DOCUMENTS" ${ARGN})
    string(TOUPPER ${component} key)
    set(CPACK_DEBIAN_${key}_PACKAGE_NAME ${name})
    set(CPACK_DEBIAN_${key}_DESCRIPTION "${arg_DESCRIPTION}")
    set(CPACK_DEBIAN_${key}_PACKAGE_DEPENDS "${arg_DEPENDS}")
    if(arg_SECTION)
        set(CPACK_DEBIAN_${key}_PACKAGE_SECTION ${arg_SECTION})
    endif()
    law_control_files(${component} CPACK_DEBIAN_${key}_PACKAGE_CONTROL_EXTRA)

    set(documents ${CMAKE_INSTALL_DATADIR}/doc/${name})
    install(FILES ${debian}/copyright DESTINATION ${documents} COMPONENT ${component})
    foreach(document IN LISTS arg_DOCUMENTS)
        law_install_document(${document} ${name} ${component})
    endforeach()
    law_install_compressed(${PROJECT_SOURCE_DIR}/CHANGELOG.md changelog.gz ${documents} ${component})
    law_install_compressed(${debian}/changelog changelog.Debian.gz ${documents} ${component})
    law_install_overrides(${component} ${name})
endmacro()

# The packages of documents that are not in the provider's package.
set(package_of_agent.md ostrel-reference-agent)
set(package_of_cimhost.md cimhost)
set(package_of_serve.md cimhost)
set(package_of_serve-configuration.md cimhost)
set(package_of_fleet.md lease-warranty-fleet-common)
set(package_of_lease-warranty-export.md lease-warranty-facts)
set(package_of_lease-warranty-metrics.md lease-warranty-metrics)
set(package_of_lease-warranty-report.md lease-warranty-report)
file(GLOB linked CONFIGURE_DEPENDS RELATIVE ${PROJECT_SOURCE_DIR}/docs ${PROJECT_SOURCE_DIR}/docs/*.md)

# law_install_document(<name> <package> <component>)
# Installs a document. Adapts its links to the directories of the packages; no package contains CONTRIBUTING.md.
function(law_install_document name package component)
    set(directory ${CMAKE_INSTALL_DATADIR}/doc/${package})
    set(document ${PROJECT_SOURCE_DIR}/docs/${name})
    if(NOT name MATCHES "\\.md$")
        install(FILES ${document} DESTINATION ${directory} COMPONENT ${component})
        return()
    endif()
    set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${document})
    file(READ ${document} text)
    string(REPLACE "](../README.md" "](README.md" text "${text}")
    string(REPLACE "](docs/" "](" text "${text}")
    string(REGEX REPLACE "\\[([^]]*)\\]\\([./]*CONTRIBUTING[.]md[^)]*\\)" "\\1" text "${text}")
    foreach(other IN LISTS linked)
        set(home lease-warranty-provider)
        if(DEFINED package_of_${other})
            set(home ${package_of_${other}})
        endif()
        if(NOT home STREQUAL package)
            string(REPLACE "](${other}" "](../${home}/${other}" text "${text}")
        endif()
    endforeach()
    cmake_path(GET document FILENAME name)
    file(WRITE ${CMAKE_CURRENT_BINARY_DIR}/documents/${name} "${text}")
    install(FILES ${CMAKE_CURRENT_BINARY_DIR}/documents/${name} DESTINATION ${directory} COMPONENT ${component})
endfunction()

# law_install_overrides(<component> <name>)
# Installs the lintian overrides of all packages, followed by those of the component.
function(law_install_overrides component name)
    set(overrides ${CMAKE_CURRENT_BINARY_DIR}/overrides/${name})
    configure_file(${debian}/lintian-overrides.in ${overrides} @ONLY)
    if(EXISTS ${debian}/${component}/lintian-overrides)
        file(READ ${debian}/${component}/lintian-overrides own)
        file(APPEND ${overrides} "${own}")
    endif()
    install(FILES ${overrides} DESTINATION ${CMAKE_INSTALL_DATADIR}/lintian/overrides COMPONENT ${component})
endfunction()

law_package(provider lease-warranty-provider
    DOCUMENTS architecture.md architecture.svg classes.md data-files.md gate.md lease-warranty-data.md
        lease-warranty-register.md log-records.md messages.md object-managers.md performance.md
        performance-figures.md performance.svg security.md ../README.md
    DEPENDS "ostrel-reference-agent (>= ${PROJECT_VERSION}) | ostrel-agent"
    DESCRIPTION "CMPI provider for the leases and warranties of a computer
A library that a CIM object manager (SFCB, OpenPegasus) loads, and that
serves the leases and warranties under which a computer is held, the
computer's asset identification and the identity of its management agent.

The package also contains a gate, which serializes requests and follows the
CIM standard, the command lease-warranty-register, which registers the
classes with the object manager, and the command lease-warranty-data, which
checks, restores, exports and imports the data.")
# Needed by manager-test.
set(CPACK_DEBIAN_PROVIDER_PACKAGE_SUGGESTS "cimhost, python3, sblim-wbemcli")

law_package(agent ostrel-reference-agent
    DOCUMENTS agent.md
    DESCRIPTION "framework and logging library of a management agent
The libraries that the CMPI provider for leases and warranties needs, and
a CMPI provider of the computer that they belong to. They read the real
machine: host name, vendor and model.

Another agent's libraries with the same declarations can replace them.")
set(CPACK_DEBIAN_AGENT_PACKAGE_PROVIDES ostrel-agent)

law_package(host cimhost
    DOCUMENTS cimhost.md serve.md serve-configuration.md
    DESCRIPTION "object manager for CMPI providers
On the command line, it loads a CMPI provider, sends it one request, prints the
response as text, JSON or MOF, and exits. As a service, which is installed
disabled, it serves CIM clients over HTTP with CIM-XML. It reads classes from
MOF files and providers from registrations in SFCB's format.")
set(CPACK_DEBIAN_HOST_PACKAGE_SUGGESTS lease-warranty-provider)

set(version "${PROJECT_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE}")
law_package(development lease-warranty-provider-dev
    SECTION libdevel
    DEPENDS "ostrel-reference-agent (= ${version}), cimhost (= ${version})"
    DESCRIPTION "headers to build CMPI providers with
The CMPI 2.0 headers, the declarations of the agent's framework and logging
library, and the files with which CMake and pkg-config find them.")

include(${CMAKE_CURRENT_LIST_DIR}/FleetPackages.cmake)

include(CPack)

# A library with a GNU_UNIQUE symbol cannot be unloaded, and object managers unload providers.
include(CheckCXXCompilerFlag)
check_cxx_compiler_flag(-fno-gnu-unique LAW_HAVE_NO_GNU_UNIQUE)

# law_unloadable(<target>)
# Sets the options of the objects of a library that object managers load and unload.
function(law_unloadable target)
    if(LAW_HAVE_NO_GNU_UNIQUE)
        target_compile_options(${target} PRIVATE -fno-gnu-unique)
    endif()
endfunction()

# law_shared_library(<target> [EXPORTS <version script>])
# Options of a library that object managers load and unload: no undefined symbols, and no exports except those of the
# version script.
function(law_shared_library target)
    cmake_parse_arguments(arg "" "EXPORTS" "" ${ARGN})
    target_link_libraries(${target} PRIVATE law_options)
    law_unloadable(${target})
    if(NOT LAW_SANITIZE)
        target_link_options(${target} PRIVATE -Wl,-z,defs)
    endif()
    if(arg_EXPORTS)
        target_link_options(${target} PRIVATE -Wl,--version-script=${arg_EXPORTS})
        set_property(TARGET ${target} APPEND PROPERTY LINK_DEPENDS ${arg_EXPORTS})
    endif()
endfunction()

# A library with a GNU_UNIQUE symbol cannot be unloaded, and object managers unload providers.
include(CheckCXXCompilerFlag)
check_cxx_compiler_flag(-fno-gnu-unique LAW_HAVE_NO_GNU_UNIQUE)

# law_shared_library(<target> [EXPORTS <version script>])
# Sets the options of a library that an object manager loads: it has no undefined symbols, exports only the symbols of
# the version script, and can be unloaded.
function(law_shared_library target)
    cmake_parse_arguments(arg "" "EXPORTS" "" ${ARGN})
    target_link_libraries(${target} PRIVATE law_options)
    if(LAW_HAVE_NO_GNU_UNIQUE)
        target_compile_options(${target} PRIVATE -fno-gnu-unique)
    endif()
    if(NOT LAW_SANITIZE)
        target_link_options(${target} PRIVATE -Wl,-z,defs)
    endif()
    if(arg_EXPORTS)
        target_link_options(${target} PRIVATE -Wl,--version-script=${arg_EXPORTS})
        set_property(TARGET ${target} APPEND PROPERTY LINK_DEPENDS ${arg_EXPORTS})
    endif()
endfunction()

# A GNU_UNIQUE symbol pins its library in the process for good: a provider must be able to go.
include(CheckCXXCompilerFlag)
check_cxx_compiler_flag(-fno-gnu-unique LAW_HAVE_NO_GNU_UNIQUE)

# law_shared_library(<target> [EXPORTS <version script>])
# Options of a library that an object manager loads: no symbol left open, nothing exported by
# accident (with EXPORTS: exactly what the version script names), and nothing that prevents unloading.
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

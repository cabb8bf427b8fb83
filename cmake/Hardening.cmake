# What makes a mistake with memory harder to exploit, in the process of whoever loads the libraries: stack protectors,
# checked variants of the C library's functions, tables that are read-only once the library is loaded, positions that
# nobody can foresee. script/check-hardening looks whether the built files have it.
include(CheckCompilerFlag)
include(CheckPIESupported)

check_pie_supported()
add_compile_options(-fstack-protector-strong)
foreach(flag IN ITEMS -fstack-clash-protection -fcf-protection)
    string(MAKE_C_IDENTIFIER LAW_HAVE${flag} have)
    check_compiler_flag(CXX ${flag} ${have})
    if(${have})
        add_compile_options(${flag})
    endif()
endforeach()
add_link_options(-Wl,-z,relro,-z,now,-z,noexecstack)

# The checked variants need an optimised build, and the sanitizers check more.
if(NOT LAW_SANITIZE)
    add_compile_options("$<$<NOT:$<CONFIG:Debug>>:SHELL:-U_FORTIFY_SOURCE -D_FORTIFY_SOURCE=2>")
endif()

# Options that make memory errors harder to exploit: stack protectors, fortified functions of the C library,
# relocations that are read-only after loading, and position-independent programs. script/check-hardening checks the
# built files.
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

# Fortified functions need an optimised build. Builds with sanitizers do not need them, because these check more.
if(NOT LAW_SANITIZE)
    add_compile_options("$<$<NOT:$<CONFIG:Debug>>:SHELL:-U_FORTIFY_SOURCE -D_FORTIFY_SOURCE=2>")
endif()

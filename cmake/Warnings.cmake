# Compiler options that every target of the project is built with.
add_library(law_options INTERFACE)
target_compile_options(law_options INTERFACE
    -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)

option(LAW_SANITIZE "Build with the address and undefined behaviour sanitizers" OFF)
if(LAW_SANITIZE)
    set(sanitizers -fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer)
    add_compile_options(${sanitizers})
    add_link_options(${sanitizers})
endif()

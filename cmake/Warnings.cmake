# Compiler options of all targets of the project.
add_library(law_options INTERFACE)
target_compile_options(law_options INTERFACE
    -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)

set(LAW_SANITIZE "" CACHE STRING "Sanitizers to build with, such as \"address,undefined\" or \"thread\"")
if(LAW_SANITIZE)
    # The sanitizers' reports need line numbers; more debug information would take longer to build.
    set(sanitizers -fsanitize=${LAW_SANITIZE} -fno-sanitize-recover=all -fno-omit-frame-pointer -g1)
    add_compile_options(${sanitizers})
    add_link_options(${sanitizers})
endif()

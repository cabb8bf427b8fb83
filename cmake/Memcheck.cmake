# A script of ctest's: runs the tests of the build directory of preset dev under valgrind's memcheck
# and fails when a test fails or valgrind finds an error. Run by script/valgrind.
set(CTEST_SOURCE_DIRECTORY ${CMAKE_CURRENT_LIST_DIR}/..)
set(CTEST_BINARY_DIRECTORY ${CTEST_SOURCE_DIRECTORY}/build/dev)
find_program(CTEST_MEMORYCHECK_COMMAND valgrind REQUIRED)
set(CTEST_MEMORYCHECK_COMMAND_OPTIONS
    "--leak-check=full --show-leak-kinds=definite --errors-for-leak-kinds=definite --error-exitcode=97 --num-callers=30")

ctest_start(Experimental QUIET)
ctest_memcheck(PARALLEL_LEVEL $ENV{LAW_JOBS} RETURN_VALUE failures DEFECT_COUNT defects)
if(failures OR defects)
    message(FATAL_ERROR "valgrind: ${defects} defects; see ${CTEST_BINARY_DIRECTORY}/Testing/Temporary/MemoryChecker.*.log")
endif()

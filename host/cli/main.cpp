#include "cli/Program.h"
#include "cli/Serve.h"

/**
 * Read by jemalloc. With few arenas, a request uses the memory that the last one has freed and that the processor's
 * caches still hold. Threads do not wait for each other, since each has a cache of free memory.
 */
extern "C" [[gnu::visibility("default")]] const char* malloc_conf;
const char* malloc_conf = "narenas:2";

int main(int count, char** values) {
    cimhost::ServeCommand serve;
    return cimhost::runProgram(count, values, serve.commandLine(), serve);
}

#include "cli/Program.h"
#include "cli/Serve.h"

int main(int count, char** values) {
    cimhost::ServeCommand serve;
    return cimhost::runProgram(count, values, serve.commandLine(), serve);
}

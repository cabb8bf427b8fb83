#include "cli/Program.h"

int main(int count, char** values) {
    cimhost::CommandExtension none;
    return cimhost::runProgram(count, values, {}, none);
}

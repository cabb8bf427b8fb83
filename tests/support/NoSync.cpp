#include <unistd.h>

// Syncs do nothing in a program that contains this file, also in the libraries under test: they are slow on a busy
// disk, and PowerCutTest tests their purpose.

extern "C" __attribute__((visibility("default"))) int fsync(int) {
    return 0;
}

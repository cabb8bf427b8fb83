#define TOML_IMPLEMENTATION
#include "configuration/Toml.h"

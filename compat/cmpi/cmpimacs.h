/* CMPI 2.0 convenience for provider authors */
#ifndef CMPIMACS_H
#define CMPIMACS_H

#include "cmpidt.h"
#include "cmpift.h"

#endif

// A run-time module for tests that has none of the host's functions.
#include "qn/dsc/osdep/Export.h"

extern "C" ZKFPGA_EXPORT int poorRuntimeMark;
int poorRuntimeMark = 1;

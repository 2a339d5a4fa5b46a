// A run-time module for tests that has none of the host's functions.
extern "C" __attribute__((visibility("default"))) int poorRuntimeMark;
int poorRuntimeMark = 1;

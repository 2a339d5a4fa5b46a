#pragma once

// Marks a function that programs and modules outside find by its name.
#if defined(_WIN32)
#define ZKFPGA_EXPORT __declspec(dllexport)
#else
#define ZKFPGA_EXPORT __attribute__((visibility("default")))
#endif

#pragma once

// Marks a function that programs and modules outside find by its name.
#define ZKFPGA_EXPORT __attribute__((visibility("default")))

// Parses the files named on the command line with libexpat, and does nothing else.

#include <cstdio>

#include "baselines/ParseWithExpat.h"

int main(int argc, char** argv) {
    for (int i = 1; i < argc; ++i) {
        if (!bench::ParseWithExpat(argv[i])) {
            std::fprintf(stderr, "cannot parse %s\n", argv[i]);
            return 1;
        }
    }
    return 0;
}

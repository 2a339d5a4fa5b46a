#include "cachebuilder/Tool.h"

int main(int argc, char** argv) {
    return zkhw::RunTool(argc, argv);
}

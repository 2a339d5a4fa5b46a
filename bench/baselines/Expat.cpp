// The floor under every reader that is built on libexpat: parses the files named on the command line in blocks of
// 4096 bytes, with handlers that do nothing.

#include <cstdio>
#include <cstdlib>

#include <expat.h>

namespace {

void XMLCALL OnStart(void*, const XML_Char*, const XML_Char**) {}
void XMLCALL OnEnd(void*, const XML_Char*) {}
void XMLCALL OnText(void*, const XML_Char*, int) {}

bool Parse(const char* path) {
    FILE* file = std::fopen(path, "r");
    if (file == nullptr) {
        return false;
    }
    XML_Parser parser = XML_ParserCreate("utf-8");
    XML_SetElementHandler(parser, OnStart, OnEnd);
    XML_SetCharacterDataHandler(parser, OnText);
    char block[4096];
    XML_Status status = XML_STATUS_OK;
    for (bool last = false; !last && status == XML_STATUS_OK;) {
        const size_t count = std::fread(block, 1, sizeof block, file);
        last = count < sizeof block;
        status = XML_Parse(parser, block, static_cast<int>(count), last ? 1 : 0);
    }
    XML_ParserFree(parser);
    std::fclose(file);
    return status == XML_STATUS_OK;
}

}  // namespace

int main(int argc, char** argv) {
    for (int i = 1; i < argc; ++i) {
        if (!Parse(argv[i])) {
            std::fprintf(stderr, "cannot parse %s\n", argv[i]);
            return 1;
        }
    }
    return 0;
}

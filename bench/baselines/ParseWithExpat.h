#pragma once

// The floor under every reader that is built on libexpat: parses a file in blocks of 4096 bytes, with handlers that do
// nothing.

#include <cstdio>

#include <expat.h>

namespace bench {

// False if the file can't be opened or isn't well formed.
inline bool ParseWithExpat(const char* path) {
    std::FILE* file = std::fopen(path, "r");
    if (file == nullptr) {
        return false;
    }
    XML_Parser parser = XML_ParserCreate("utf-8");
    XML_SetElementHandler(
        parser, [](void*, const XML_Char*, const XML_Char**) {}, [](void*, const XML_Char*) {});
    XML_SetCharacterDataHandler(parser, [](void*, const XML_Char*, int) {});
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

}  // namespace bench

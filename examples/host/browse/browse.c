/* Shows what is in an installation's tree, through the exported functions alone. They take and give text in the host's
 * own form of data, so a program that calls them has to be, or bring, a host's run-time: here that is runtime.c.
 *
 *   browse FOLDER                    lists the targets
 *   browse FOLDER TARGET             shows the target's properties and all nodes below it
 *   browse FOLDER TARGET PROPERTY    shows one property, such as DeviceCategory or IO/user_led/DisplayName, and the
 *                                    node that has it if that lies below the target
 *
 * FOLDER holds the folder Targets; "-" is the folder of this program, where it is started by its path. Included files
 * and the relative paths of a cache start from the program's own folder, so put it into the installation's.
 * BROWSE_LANGUAGE may be Japanese or ChineseS.
 *
 * In one line, with zkfpga installed:
 *   cc -std=c99 -rdynamic browse.c runtime.c $(pkg-config --cflags --libs zkfpga) -o browse
 * For Windows, with the compiler's names of that system:
 *   windres browse.rc browse.res.o
 *   cc -std=c99 -Wl,--export-all-symbols browse.c runtime.c browse.res.o $(pkg-config --cflags --libs zkfpga) -o browse
 */

#include <stdio.h>
#include <stdlib.h>
#include <string.h>

#include "runtime.h"
#include "zkfpga/exports.h"

/* A NUL-terminated copy. */
static char* CopyBytes(const char* bytes, size_t length) {
    char* const copy = malloc(length + 1);
    if (copy == NULL) {
        abort();
    }
    memcpy(copy, bytes, length);
    copy[length] = '\0';
    return copy;
}

static char* CopyString(ZkStringHandle string) {
    return CopyBytes(StringBytes(string), StringLength(string));
}

/* The path of a top-level node: "/" and its name, with a backslash before each "/" and backslash of the name. */
static char* PathOfTarget(const char* target) {
    char* const path = malloc(2 * strlen(target) + 2);
    if (path == NULL) {
        abort();
    }
    char* end = path;
    *end++ = '/';
    for (; *target != '\0'; ++target) {
        if (*target == '/' || *target == '\\') {
            *end++ = '\\';
        }
        *end++ = *target;
    }
    *end = '\0';
    return path;
}

/* The first query builds the tree, and a failure of that is reported once. So it is asked for by itself. */
static int OpenTree(void) {
    unsigned char found = 0;
    const ZkStringHandle none = NewString();
    const HRESULT result = FPGAResTree_GetProperty("", "", "", none, &found);
    HostDisposeHandle(none);
    if (FAILED(result)) {
        fprintf(stderr, "browse: the tree can't be built: 0x%08X\n", (unsigned)result);
        return 0;
    }
    return 1;
}

/* The names of the nodes below a path; null if the path leads nowhere. */
static ZkStringArrayHandle NamesBelow(const char* base, const char* below, const char* options) {
    unsigned char found = 0;
    ZkStringArrayHandle names = NULL;
    const HRESULT result = FPGAResTree_GetDescendantNames(base, below, options, &names, &found);
    if (SUCCEEDED(result) && found) {
        return names;
    }
    DisposeStringArray(names);
    return NULL;
}

/* A target answers to its category without being read: it is one of the properties that a cache keeps. */
static int ListTargets(void) {
    /* "includePath=false" has to stand here: the library adds an option that would switch paths on. */
    const ZkStringArrayHandle names = NamesBelow("", "", "protocol=Target,includePath=false");
    if (names == NULL) {
        return 0;
    }
    printf("%u targets:\n", (unsigned)ArrayCount(names));
    const ZkStringHandle category = NewString();
    for (size_t i = 0; i < ArrayCount(names); ++i) {
        char* const name = CopyString(ArrayElement(names, i));
        unsigned char found = 0;
        FPGAResTree_GetProperty(name, "DeviceCategory", "", category, &found);
        printf("  %-16s %.*s\n", name, (int)StringLength(category), StringBytes(category));
        free(name);
    }
    HostDisposeHandle(category);
    DisposeStringArray(names);
    return 1;
}

/* Cuts the next <Val> out of a cluster's text and takes the escapes out of it. Gives it, and in `*rest` what follows.
 */
static char* NextValue(char* cluster, char** rest) {
    static const char open[] = "<Val>";
    static const char close[] = "</Val>";
    char* const value = strstr(cluster, open) + strlen(open);
    char* const end = strstr(value, close);
    *rest = end + strlen(close);
    char* to = value;
    for (const char* from = value; from != end; ++to) {
        const char unit = *from++;
        *to = unit;
        if (unit == '&') { /* "&amp;", "&lt;" or "&gt;" */
            *to = *from == 'a' ? '&' : *from == 'l' ? '<' : '>';
            from = strchr(from, ';') + 1;
        }
    }
    *to = '\0';
    return value;
}

/* Each result is a cluster of a name and a value. An ordered node may have several entries of one name; a lookup gives
 * the first, so only that is shown. */
static int ShowProperties(const char* path) {
    unsigned char found = 0;
    ZkStringArrayHandle clusters = NULL;
    const HRESULT result = FPGAResTree_GetMultipleProperties(path, "", "", &clusters, &found);
    const size_t count = ArrayCount(clusters);
    char** const texts = calloc(count + 1, sizeof *texts);
    char** const names = calloc(count + 1, sizeof *names);
    if (texts == NULL || names == NULL) {
        abort();
    }
    for (size_t i = 0; i < count; ++i) {
        char* rest;
        texts[i] = CopyString(ArrayElement(clusters, i));
        names[i] = NextValue(texts[i], &rest);
        size_t first = 0;
        while (strcmp(names[first], names[i]) != 0) {
            ++first;
        }
        if (first == i) {
            printf("  %s = %s\n", names[i], NextValue(rest, &rest));
        }
    }
    for (size_t i = 0; i < count; ++i) {
        free(texts[i]);
    }
    free(texts);
    free(names);
    DisposeStringArray(clusters);
    return SUCCEEDED(result) && found;
}

static int ShowTarget(const char* target) {
    char* const path = PathOfTarget(target);
    const int found = ShowProperties(path);
    if (found) {
        const ZkStringArrayHandle names = NamesBelow(path, "", "recurse=true");
        printf("%u nodes below:\n", (unsigned)ArrayCount(names));
        for (size_t i = 0; i < ArrayCount(names); ++i) {
            const ZkStringHandle name = ArrayElement(names, i);
            printf("  %.*s\n", (int)StringLength(name), StringBytes(name));
        }
        DisposeStringArray(names);
    } else {
        fprintf(stderr, "browse: there is no target %s\n", target);
    }
    free(path);
    return found;
}

/* Converts a text to UTF-16 and back again. */
static void ShowConversions(ZkStringHandle text) {
    const ZkStringHandle wide = NewString();
    const ZkStringHandle back = NewString();
    FPGA_mbstowcs(text, wide);
    FPGA_wcstombs(wide, back);
    const int same = StringLength(back) == StringLength(text) &&
                     memcmp(StringBytes(back), StringBytes(text), StringLength(text)) == 0;
    printf("  %u bytes, %u units of UTF-16, %s on the way back\n", (unsigned)StringLength(text),
           (unsigned)(StringLength(wide) / sizeof(WCHAR)), same ? "the same" : "another text");
    HostDisposeHandle(back);
    HostDisposeHandle(wide);
}

/* `node` is a path below the target. */
static void ShowNode(const char* target, const char* node) {
    /* A dump of a node that isn't there would end the process. */
    const ZkStringArrayHandle names = NamesBelow(target, node, "");
    if (names != NULL) {
        const ZkStringHandle text = NewString();
        if (SUCCEEDED(FPGAResTree_Dump(target, node, "", text))) {
            printf("%s:%.*s\n", node, (int)StringLength(text), StringBytes(text));
        }
        HostDisposeHandle(text);
    }
    DisposeStringArray(names);
}

static int ShowProperty(const char* target, const char* property) {
    unsigned char found = 0;
    const ZkStringHandle value = NewString();
    const HRESULT result = FPGAResTree_GetProperty(target, property, "", value, &found);
    if (SUCCEEDED(result) && found) {
        printf("%s = %.*s\n", property, (int)StringLength(value), StringBytes(value));
        ShowConversions(value);
    }
    HostDisposeHandle(value);
    return SUCCEEDED(result) && found;
}

/* The last separator of a path: on Windows that may be a backslash. Null if there is none. */
static const char* LastSeparator(const char* path) {
    const char* const slash = strrchr(path, '/');
    return slash != NULL ? slash : strrchr(path, '\\');
}

int main(int argc, char** argv) {
    if (argc < 2 || argc > 4) {
        fprintf(stderr, "usage: browse FOLDER [TARGET [PROPERTY]]\n");
        return 2;
    }
    const char* const programSlash = LastSeparator(argv[0]);
    char* const ownFolder = CopyBytes(argv[0], programSlash == NULL ? 0 : (size_t)(programSlash - argv[0]));
    SetInstallationFolder(strcmp(argv[1], "-") != 0 ? argv[1] : programSlash == NULL ? "." : ownFolder);

    int done = OpenTree();
    if (done && argc == 2) {
        done = ListTargets();
    } else if (done && argc == 3) {
        done = ShowTarget(argv[2]);
    } else if (done) {
        done = ShowProperty(argv[2], argv[3]);
        const char* const slash = strrchr(argv[3], '/');
        if (done && slash != NULL) {
            char* const node = CopyBytes(argv[3], (size_t)(slash - argv[3]));
            ShowNode(argv[2], node);
            free(node);
        }
        if (!done) {
            fprintf(stderr, "browse: %s has no property %s\n", argv[2], argv[3]);
        }
    }
    free(ownFolder);
    return done ? 0 : 1;
}

/* A host that was made without any header of the library: it knows the names of the functions, the ids of the
 * interfaces, and the number of each operation in its table. It runs beside the folder Targets without a run-time, and
 * its argument is the library's file. Says which slot gave something unexpected; exit status 0 if none did. */
#include <stdint.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <uchar.h>

#include "SlotsHostModule.h"

/* In memory order. */
static const uint8_t node5[16] = {0xA8, 0xAB, 0x4A, 0x2C, 0x50, 0x45, 0x9D, 0x47,
                                  0xB8, 0x4A, 0x06, 0xFB, 0xE9, 0x20, 0x4F, 0x97};
static const uint8_t tree2[16] = {0xA4, 0x76, 0xE6, 0x93, 0x6B, 0x16, 0xAD, 0x48,
                                  0xA3, 0x52, 0x1F, 0x9D, 0xC1, 0x01, 0x85, 0xC7};
static const uint8_t node1[16] = {0xB5, 0x63, 0x86, 0x23, 0x4F, 0xBA, 0x53, 0x4A,
                                  0x82, 0xEE, 0x98, 0x6B, 0x3E, 0x80, 0xC8, 0xF2};
static const uint8_t selector[16] = {0x44, 0x66, 0xAF, 0x4E, 0xFB, 0x35, 0x1A, 0x44,
                                     0x8E, 0xC2, 0x14, 0x4B, 0x44, 0x34, 0x80, 0xC8};

enum { Ok = 0, No = 1 };

typedef int32_t (*Query)(const void* id, void* context, void* item, void** result);
typedef uint32_t (*Count)(void* self);
typedef int32_t (*AskId)(void* self, const void* id, void** result);
typedef int32_t (*Ask)(void* self);
typedef int32_t (*Give)(void* self, char16_t** text);
typedef int32_t (*GiveList)(void* self, uint32_t* count, void*** list);
typedef int32_t (*AskText)(void* self, const char16_t* text);
typedef int32_t (*GiveByText)(void* self, const char16_t* text, char16_t** value);
typedef int32_t (*GiveByIndex)(void* self, uint32_t index, char16_t** value);
typedef int32_t (*SetText)(void* self, const char16_t* name, const char16_t* value);
typedef int32_t (*SetAt)(void* self, uint32_t index, const char16_t* value);
typedef int32_t (*Modes)(void* self, const char16_t* owner, uint32_t* mode);
typedef int32_t (*Reserve)(void* self, const char16_t* owner, uint32_t mode, uint32_t* granted);
typedef int32_t (*ModesEx)(void* self, const char16_t* owners, int except, uint32_t* mode);
typedef int32_t (*GiveNode)(void* self, void** node);
typedef int32_t (*ListOfType)(void* self, const char16_t* type, uint32_t* count, void*** list);
typedef int32_t (*NamesOfType)(void* self, const char16_t* path, const char16_t* type, int withPath, uint32_t* count,
                               void*** names, void*** displays);
typedef int32_t (*NamesEx)(void* self, const char16_t* path, const char16_t* type, int withPath,
                           const char16_t* exclusion, uint32_t* count, void*** names, void*** displays);
typedef int32_t (*FindNode)(void* self, const char16_t* path, uint32_t* consumed, int* crossed, void** node);
typedef int32_t (*Begin)(void* self, uint32_t* pending);
typedef int32_t (*End)(void* self, uint32_t flags, int replace);
typedef int32_t (*Filter)(void* self, uint32_t nodeCount, const char16_t** nodes, uint32_t propertyCount,
                          const char16_t** properties, char16_t** xml);
typedef int32_t (*FilterEx)(void* self, int keep, uint32_t nodeCount, const char16_t** nodes, uint32_t propertyCount,
                            const char16_t** properties, char16_t** xml);
typedef int32_t (*Compare)(void* self, void* other, int* result);
typedef int32_t (*CompareEx)(void* self, void* other, int* result, int skip);
typedef int32_t (*TreeList)(void* self, const char16_t* path, const char16_t* options, uint32_t* count, void*** list);
typedef int32_t (*TreeText)(void* self, const char16_t* path, const char16_t* options, char16_t** value);
typedef int32_t (*TreeFilter)(void* self, const char16_t* path, uint32_t nodeCount, const char16_t** nodes,
                              uint32_t propertyCount, const char16_t** properties, char16_t** xml);

#define SLOT(type, object, number) ((type)(*(void***)(object))[number])

static void (*freeText)(char16_t*);
static uint32_t (*textLength)(char16_t*);
static void (*freeList)(void*);
static int failures;

static void Check(int isRight, const char* table, int slot) {
    if (!isRight) {
        printf("%s slot %d\n", table, slot);
        ++failures;
    }
}

/* Whether a text that was given is this one; frees it. */
static int Is(char16_t* text, const char16_t* expected) {
    uint32_t length = 0;
    while (expected[length] != 0) {
        ++length;
    }
    const int same = text != NULL && textLength(text) == length &&
                     memcmp(text, expected, ((size_t)length + 1) * sizeof *expected) == 0;
    freeText(text);
    return same;
}

/* Whether a list that was given has the one text, or none if that is null; frees it. */
static int IsList(uint32_t count, void** list, const char16_t* expected) {
    int same = count == (expected == NULL ? 0 : 1);
    for (uint32_t i = 0; i < count; ++i) {
        same = Is(list[i], expected == NULL ? u"" : expected) && same;
    }
    freeList(list);
    return same;
}

static void ReleaseObject(void* object) {
    SLOT(Count, object, 2)(object);
}

/* The only node of a list, with the list freed; null if there isn't exactly one. */
static void* OnlyNode(uint32_t count, void** list) {
    void* const first = count == 1 ? list[0] : NULL;
    for (uint32_t i = 0; first == NULL && i < count; ++i) {
        ReleaseObject(list[i]);
    }
    freeList(list);
    return first;
}

static int IsNamed(void* node, const char16_t* name) {
    char16_t* text = NULL;
    if (node != NULL) {
        SLOT(Give, node, 3)(node, &text);
        ReleaseObject(node);
    }
    return Is(text, name);
}

static void WalkIdentity(void* root, void* part) {
    char16_t* text = NULL;
    uint32_t count = 0;
    void** list = NULL;
    void* other = NULL;
    Check(SLOT(AskId, root, 0)(root, node1, &other) == Ok && other == root, "node", 0);
    const uint32_t references = SLOT(Count, root, 1)(root);
    Check(SLOT(Count, root, 2)(root) == references - 1, "node", 2);
    ReleaseObject(other);
    Check(SLOT(AskId, root, 0)(root, selector, &other) == (int32_t)0x80004002 && other == NULL, "node", 0);
    Check(SLOT(Give, part, 3)(part, &text) == Ok && Is(text, u"P"), "node", 3);
    Check(SLOT(Give, part, 4)(part, &text) == Ok && Is(text, u"/Parts/P"), "node", 4);
    Check(SLOT(Give, part, 5)(part, &text) == Ok && Is(text, u"/Parts/P"), "node", 5);
    Check(SLOT(Give, part, 7)(part, &text) == Ok && Is(text, u"Part"), "node", 7);
    Check(SLOT(GiveList, part, 8)(part, &count, &list) == Ok && IsList(count, list, u"Part"), "node", 8);
    Check(SLOT(AskText, part, 9)(part, u"part") == Ok && SLOT(AskText, part, 9)(part, u"Bank") == No, "node", 9);
}

static void WalkProperties(void* part) {
    char16_t* text = NULL;
    uint32_t count = 0;
    void** list = NULL;
    Check(SLOT(GiveByText, part, 10)(part, u"Size", &text) == Ok && Is(text, u"3"), "node", 10);
    Check(SLOT(GiveByIndex, part, 11)(part, 0, &text) == Ok && Is(text, u"3"), "node", 11);
    Check(SLOT(SetText, part, 12)(part, u"Size", u"4") == Ok, "node", 12);
    Check(SLOT(GiveByIndex, part, 11)(part, 0, &text) == Ok && Is(text, u"4"), "node", 12);
    Check(SLOT(SetAt, part, 13)(part, 0, u"3") == Ok && SLOT(SetAt, part, 13)(part, 1, u"") == No, "node", 13);
    Check(SLOT(GiveList, part, 14)(part, &count, &list) == Ok && IsList(count, list, u"Size"), "node", 14);
    Check(SLOT(AskText, part, 51)(part, u"Size") == No, "node", 51);
}

static void WalkReservations(void* part) {
    uint32_t mode = 9;
    Check(SLOT(Modes, part, 15)(part, NULL, &mode) == No && mode == 0, "node", 15);
    Check(SLOT(Reserve, part, 16)(part, u"me", 2, &mode) == Ok && mode == 2, "node", 16);
    Check(SLOT(Modes, part, 15)(part, u"me", &mode) == Ok && mode == 2, "node", 15);
    Check(SLOT(ModesEx, part, 38)(part, u"me", 1, &mode) == No && mode == 0, "node", 38);
    Check(SLOT(AskText, part, 17)(part, u"me") == Ok, "node", 17);
    Check(SLOT(AskText, part, 17)(part, u"me") == No, "node", 17);
}

static void WalkNeighbours(void* root, void* parts, void* part) {
    uint32_t count = 0;
    void** list = NULL;
    void* node = NULL;
    Check(SLOT(Ask, part, 22)(part) == Ok && SLOT(Ask, root, 22)(root) == No, "node", 22);
    Check(SLOT(GiveNode, part, 23)(part, &node) == Ok && IsNamed(node, u"Parts"), "node", 23);
    Check(SLOT(Ask, parts, 24)(parts) == Ok && SLOT(Ask, part, 24)(part) == No, "node", 24);
    Check(SLOT(GiveList, parts, 25)(parts, &count, &list) == Ok && IsNamed(OnlyNode(count, list), u"P"), "node", 25);
    Check(SLOT(ListOfType, parts, 26)(parts, u"Part", &count, &list) == Ok && IsNamed(OnlyNode(count, list), u"P"),
          "node", 26);
    Check(SLOT(ListOfType, root, 27)(root, u"Part", &count, &list) == Ok && IsNamed(OnlyNode(count, list), u"P"),
          "node", 27);
    Check(SLOT(NamesOfType, parts, 29)(parts, NULL, u"Part", 1, &count, &list, NULL) == Ok &&
              IsList(count, list, u"/Parts/P"),
          "node", 29);
    Check(SLOT(NamesOfType, root, 30)(root, NULL, u"Part", 0, &count, &list, NULL) == Ok && IsList(count, list, u"P"),
          "node", 30);
    Check(SLOT(NamesEx, root, 42)(root, NULL, u"Part", 1, u"", &count, &list, NULL) == Ok &&
              IsList(count, list, u"/Parts/P"),
          "node", 42);
}

static void WalkTexts(void* parts, void* part) {
    static const char16_t* const names[] = {u"Size"};
    char16_t* text = NULL;
    uint32_t pending = 9;
    int result = 9;
    void* clone = NULL;
    Check(SLOT(AskText, part, 20)(part, u"<Made>1</Made>") == Ok, "node", 20);
    Check(SLOT(Give, part, 37)(part, &text) == Ok &&
              Is(text, u"\n<Part name=\"P\">\n   <Made>1</Made>\n   <Size>3</Size>\n</Part>"),
          "node", 37);
    Check(SLOT(Filter, part, 39)(part, 0, NULL, 1, (const char16_t**)names, &text) == Ok &&
              Is(text, u"\n<Part name=\"P\">\n   <Size>3</Size>\n</Part>"),
          "node", 39);
    Check(SLOT(FilterEx, part, 43)(part, 0, 0, NULL, 1, (const char16_t**)names, &text) == Ok &&
              Is(text, u"\n<Part name=\"P\">\n   <Made>1</Made>\n</Part>"),
          "node", 43);
    Check(SLOT(AskText, part, 21)(part, u"Made") == Ok, "node", 21);
    Check(SLOT(Give, part, 37)(part, &text) == Ok && Is(text, u"\n<Part name=\"P\">\n   <Size>3</Size>\n</Part>"),
          "node", 21);
    Check(SLOT(Begin, part, 34)(part, &pending) == Ok && pending == 0, "node", 34);
    Check(SLOT(SetText, part, 12)(part, u"Size", u"3") == Ok && SLOT(Ask, part, 36)(part) == Ok, "node", 36);
    Check(SLOT(End, part, 35)(part, 0, 1) == Ok && SLOT(Ask, part, 36)(part) == No, "node", 35);
    Check(SLOT(AskId, part, 41)(part, u"Copy", &clone) == Ok && clone != NULL, "node", 41);
    Check(SLOT(Compare, part, 40)(part, clone, &result) == Ok && result == 1, "node", 40);
    Check(SLOT(CompareEx, parts, 50)(parts, clone, &result, 1) == Ok && result == 0, "node", 50);
    Check(IsNamed(clone, u"Copy"), "node", 41);
}

static void WalkTree(void* tree) {
    static const char16_t* const names[] = {u"Size"};
    char16_t* text = NULL;
    uint32_t count = 0;
    void** list = NULL;
    Check(SLOT(TreeList, tree, 3)(tree, u"Parts", u"", &count, &list) == Ok && IsList(count, list, u"P"), "tree", 3);
    Check(SLOT(TreeList, tree, 4)(tree, u"Parts/P", u"", &count, &list) == Ok && IsList(count, list, u"Size"), "tree",
          4);
    Check(SLOT(TreeList, tree, 5)(tree, u"Parts/P", u"", &count, &list) == Ok &&
              IsList(count, list,
                     u"<Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name><Val>Size</Val></String>"
                     u"<String><Name>value</Name><Val>3</Val></String></Cluster>"),
          "tree", 5);
    Check(SLOT(TreeText, tree, 6)(tree, u"Parts/P/Size", u"", &text) == Ok && Is(text, u"3"), "tree", 6);
    Check(SLOT(TreeFilter, tree, 7)(tree, u"Parts/P", 0, NULL, 1, (const char16_t**)names, &text) == Ok &&
              Is(text, u"\n<Part name=\"P\">\n   <Size>3</Size>\n</Part>"),
          "tree", 7);
}

static void* Export(void* library, const char* name) {
    void* const address = FindExport(library, name);
    if (address == NULL) {
        printf("no %s\n", name);
        exit(2);
    }
    return address;
}

int main(int argc, char** argv) {
    void* const library = argc == 2 ? LoadLibraryFile(argv[1]) : NULL;
    if (library == NULL) {
        printf("no library\n");
        return 2;
    }
    const Query query = (Query)Export(library, "QueryResourceTreeInterface");
    freeText = (void (*)(char16_t*))Export(library, "SysFreeString");
    textLength = (uint32_t(*)(char16_t*))Export(library, "SysStringLen");
    freeList = (void (*)(void*))Export(library, "CoTaskMemFree");

    void* root = NULL;
    void* tree = NULL;
    void* parts = NULL;
    void* part = NULL;
    if (query(node5, NULL, NULL, &root) != Ok || query(tree2, NULL, NULL, &tree) != Ok) {
        printf("no tree\n");
        return 1;
    }
    uint32_t consumed = 9;
    int crossed = 9;
    Check(SLOT(FindNode, root, 31)(root, u"Parts", NULL, NULL, &parts) == Ok, "node", 31);
    Check(SLOT(FindNode, root, 31)(root, u"Parts/P/Size", &consumed, &crossed, &part) == No && consumed == 8 &&
              crossed == 0,
          "node", 31);
    if (failures == 0) {
        WalkIdentity(root, part);
        WalkProperties(part);
        WalkReservations(part);
        WalkNeighbours(root, parts, part);
        WalkTexts(parts, part);
        WalkTree(tree);
        ReleaseObject(part);
        ReleaseObject(parts);
    }
    ReleaseObject(tree);
    ReleaseObject(root);
    if (failures == 0) {
        printf("all slots\n");
    }
    return failures == 0 ? 0 : 1;
}

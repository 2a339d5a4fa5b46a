/* The functions of this library that a host finds by name. Plain C. The executable zkfpga_make_resource_cache exports
 * the same names.
 *
 * Narrow text is NUL-terminated and in the process's default code page (UTF-8 on Linux). Results are 32 bits, negative
 * means failure (types.h). One thread at a time, the first use included. C++ exceptions may leave these functions where
 * memory runs out, where a text can't be converted, and where the host's run-time reports an error while a result is
 * stored: build the caller so that they can pass.
 *
 * The first query builds the tree of the process, from the host's folder Targets/QN/FPGA: from the cache there if no
 * resource file is newer, otherwise from the resource files, and then the cache is written anew. A failure of that is
 * reported once; later queries go on with what there is. */
#ifndef ZKFPGA_EXPORTS_H
#define ZKFPGA_EXPORTS_H

#include "zkfpga/host_data.h"
#include "zkfpga/host_interfaces.h"
#include "zkfpga/types.h"

#ifdef __cplusplus
namespace zkhw {
class FPGAResTree;
}
using ZkhwFPGAResTree = zkhw::FPGAResTree;
extern "C" {
#else
typedef struct ZkhwFPGAResTree ZkhwFPGAResTree;
#endif

/* The owner of the tree of this process, made at the first call; null if there is no memory for it. It is this
 * library's and is deleted at exit. */
ZKFPGA_API ZkhwFPGAResTree* gFPGAResTree(void);

/* Gives the interface `id` of the tree in `*result`, with one reference for the caller. `id` is one of the five of
 * IzkhwResourceTreeNode (the root node), the two of IzkEIOGResourceTree, or that of IzkhwResourceTreeOwner.
 * `context` and `item` may be null; those of the first successful query for a node or a tree are kept for good: the
 * item by a reference, the context without. For IzkhwResourceTreeOwner, the host object that stands for the tree is
 * asked of the item's project, or of `context` if `item` is null.
 * S_OK; E_NOINTERFACE: another id; E_POINTER: the owner's id with neither context nor item; E_FAIL: the item has no
 * project; E_OUTOFMEMORY; a negative code of what builds the tree, or of the host. With all failures `*result` is null,
 * and the next call tries again. A null `id` gives E_POINTER and leaves `*result` alone. A null `result` with a known
 * id traps, and so does having no memory for the owner. */
ZKFPGA_API HRESULT QueryResourceTreeInterface(const IID* id, IzkHostContext* context, IzkProjectItem* item,
                                              void** result);

/* The queries below name a node by `basePath`, one element however many slashes it holds, and `subPath`, a path below
 * it, of which one leading "/" is passed over. With an empty `subPath`, `basePath` is a path itself. `options` is an
 * option string of IzkEIOGResourceTree (tree_root.h), to which "stripPathPrefix=" and `basePath` are added: results are
 * relative to the base. A null text counts as empty. The caller owns all handles; where there is none, and where
 * `found` is null, nothing is stored. 0, or a negative code, and then nothing was stored: 0x8007000E: no memory for the
 * owner; 0x80004003: null `names`; else that of what builds the tree or of the tree's own query. Without the host's
 * run-time (host_runtime.h) storing ends the process. */

/* Stores the property at that path in `value`; `*found` is 1. If there is none: 0 is the result all the same, `*found`
 * is 0, and `value` becomes empty. */
ZKFPGA_API HRESULT FPGAResTree_GetProperty(const char* basePath, const char* subPath, const char* options,
                                           ZkStringHandle value, unsigned char* found);

/* Store what IzkEIOGResourceTree::GetDescendantNames or GetMultipleProperties gives in `*names`, which is made if it is
 * null and resized to fit. `*found` is 0, and the array empty, if the path leads nowhere. E_POINTER: `names` is null.
 * If the host's run-time reports an error while a string is stored, that string and those in front of it are given back
 * and null, the others stay, and the exception that leaves says "Array index out of bounds." */
ZKFPGA_API HRESULT FPGAResTree_GetDescendantNames(const char* basePath, const char* subPath, const char* options,
                                                  ZkStringArrayHandle* names, unsigned char* found);
ZKFPGA_API HRESULT FPGAResTree_GetMultipleProperties(const char* basePath, const char* subPath, const char* options,
                                                     ZkStringArrayHandle* names, unsigned char* found);

/* Stores the node at that path, with all below it, as text in the language of resource files. `options` isn't used. A
 * path that leads nowhere traps. */
ZKFPGA_API HRESULT FPGAResTree_Dump(const char* basePath, const char* subPath, const char* options,
                                    ZkStringHandle text);

/* Gives the host's accessor for the node behind a host reference, through the export
 * "ZkhwResourceTreeAccessorSetRefNum" of the loaded module "zkhwResourceTreeAccess.mxx" (on Linux
 * zkhwResourceTreeAccess.so). 0; 1, and `*accessor` is untouched, if the reference stands for no node, or the module or
 * its export isn't there. */
ZKFPGA_API int32_t ZkhwResTree_GetNode(uint32_t refNum, int32_t* accessor);

/* Convert all of `source` into `destination`, up to the first NUL. "Wide" is UTF-16 units, two bytes each. UTF-8 here
 * has no sequences of four bytes: pairs are two sequences of three. Always 0. */
ZKFPGA_API int32_t FPGA_mbstowcs(ZkStringHandle source, ZkStringHandle destination); /* default code page to wide */
ZKFPGA_API int32_t FPGA_wcstombs(ZkStringHandle source, ZkStringHandle destination); /* wide to default code page */
ZKFPGA_API int32_t FPGA_MbsToUtf8(ZkStringHandle source, ZkStringHandle destination);
ZKFPGA_API int32_t FPGA_Utf8ToMbs(ZkStringHandle source, ZkStringHandle destination);

/* Names the module of the host's run-time (host_runtime.h) for the whole process; null: none. On Linux a module is a
 * dlopen handle. It must stay loaded while it is named. Then calls the hook with it. */
ZKFPGA_API void SetZKRTModule(void* module);

/* Names the thread-local slot in which a thread may hold a module of its own; 0xFFFFFFFF: none. On Linux a slot is a
 * pthread_key_t. A thread whose slot is null goes on to what SetZKRTModule named. Then calls the hook with it. */
ZKFPGA_API void SetZKRTTLSIndex(uint32_t index);

/* Do nothing. */
ZKFPGA_API void SetZKRTModuleHook(void* module);
ZKFPGA_API void SetZKRTTLSIndexHook(uint32_t index);

#ifdef __cplusplus
}
#endif

#endif

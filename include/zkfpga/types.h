/* The types of the boundary between this library and a host. On Windows they are the system's own; elsewhere they are
 * declared here, with the widths that they have on Windows: ULONG, LONG, DWORD and HRESULT have 32 bits, BOOL is an
 * int, text is UTF-16. For C99 (with <uchar.h>) and for C++20. */
#ifndef ZKFPGA_TYPES_H
#define ZKFPGA_TYPES_H

#if defined(_WIN32)

#include <windows.h>

#include <oleauto.h>
#include <unknwn.h>

#if defined(ZKFPGA_BUILDING_LIBRARY)
#define ZKFPGA_API __declspec(dllexport)
#else
#define ZKFPGA_API __declspec(dllimport)
#endif

#else

#include <stdint.h>  // NOLINT(modernize-deprecated-headers): for C, too
#ifndef __cplusplus
#include <uchar.h>
#endif

typedef int32_t HRESULT;
typedef int32_t LONG;
typedef uint32_t ULONG;
typedef uint32_t DWORD;
typedef int BOOL;
typedef char16_t WCHAR;
typedef char16_t OLECHAR;
typedef const WCHAR* LPCWSTR;

/* A text with its length in bytes, 32 bits, in front of the first unit and a NUL unit behind the last (memory.h). */
typedef OLECHAR* BSTR;

/* Data1 to Data3 are in the machine's byte order. The text form {01234567-89AB-CDEF-0123-456789ABCDEF} shows Data1,
 * Data2, Data3, the first two bytes of Data4, and the other six. */
typedef struct _GUID {
    uint32_t Data1;
    uint16_t Data2;
    uint16_t Data3;
    uint8_t Data4[8];
} GUID;
typedef GUID IID;

#define STDMETHODCALLTYPE
#define ZKFPGA_API __attribute__((visibility("default")))

/* Result codes: negative means failure. S_FALSE is a normal outcome: a miss, a no, a refusal. */
#define S_OK ((HRESULT)0)
#define S_FALSE ((HRESULT)1)
#define E_NOINTERFACE ((HRESULT)0x80004002U)
#define E_POINTER ((HRESULT)0x80004003U)
#define E_FAIL ((HRESULT)0x80004005U)
#define E_OUTOFMEMORY ((HRESULT)0x8007000EU)
#define E_INVALIDARG ((HRESULT)0x80070057U)

#define SUCCEEDED(result) ((HRESULT)(result) >= 0)
#define FAILED(result) ((HRESULT)(result) < 0)

#ifdef __cplusplus

constexpr bool operator==(const GUID& a, const GUID& b) {
    if (a.Data1 != b.Data1 || a.Data2 != b.Data2 || a.Data3 != b.Data3) {
        return false;
    }
    for (int i = 0; i < 8; ++i) {
        if (a.Data4[i] != b.Data4[i]) {
            return false;
        }
    }
    return true;
}

typedef const GUID& REFGUID;
typedef const IID& REFIID;

/* What every interface begins with. An object lives as long as somebody holds a reference to it: who gets an interface
 * pointer from an operation holds one more, and gives it back with Release. */
struct IUnknown {
    /* Gives the interface `id` of the object in `*result`, with one reference for the caller: S_OK. For an id that the
     * object hasn't: E_NOINTERFACE and a null `*result`. The object's identity is its pointer for IUnknown's id.
     * A null `result` breaks the contract and ends the process (objects of this library trap). */
    virtual HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** result) = 0;

    /* One reference more; gives the new count, for diagnosis only. */
    virtual ULONG STDMETHODCALLTYPE AddRef() = 0;

    /* One reference less; gives the new count. At 0 the object is gone. More releases than references break the
     * contract: an object of this library traps if it still stands; the memory of one that is gone may hold anything,
     * and then nothing is certain. */
    virtual ULONG STDMETHODCALLTYPE Release() = 0;

  protected:
    ~IUnknown() = default;
};

#else

typedef const GUID* REFGUID;
typedef const IID* REFIID;
typedef struct IUnknown IUnknown;

#endif /* __cplusplus */

#endif /* _WIN32 */

#endif

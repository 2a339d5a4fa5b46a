// The layout of what a 32-bit host shares with this library, for its compiler alone: everything is asserted while it
// compiles. Sizes and places follow from the types, with natural alignment.

#include <cstddef>
#include <type_traits>

#include "hostbridge/HostStringArray.h"
#include "zkfpga/host_data.h"
#include "zkfpga/host_interfaces.h"

static_assert(sizeof(void*) == 4, "for a compiler of 32-bit hosts");

// The record of a project item: 52 bytes.
static_assert(std::is_standard_layout_v<ProjectItemRecord>);
static_assert(offsetof(ProjectItemRecord, size) == 0 && sizeof(ProjectItemRecord::size) == 4);
static_assert(offsetof(ProjectItemRecord, name) == 4 && sizeof(ProjectItemRecord::name) == 4);
static_assert(offsetof(ProjectItemRecord, id) == 8 && sizeof(ProjectItemRecord::id) == 16);
static_assert(offsetof(ProjectItemRecord, reserved1) == 24 && sizeof(ProjectItemRecord::reserved1) == 20);
static_assert(offsetof(ProjectItemRecord, data) == 44 && sizeof(ProjectItemRecord::data) == 4);
static_assert(offsetof(ProjectItemRecord, reserved2) == 48 && sizeof(ProjectItemRecord::reserved2) == 4);
static_assert(sizeof(ProjectItemRecord) == 52);

// A string array of n elements: its count and behind that the handles, 4 * n + 4 bytes.
static_assert(offsetof(zkhw::HostStringArrayBlock, elements) == 4);
static_assert(sizeof(ZkStringHandle) == 4);
static_assert(offsetof(zkhw::HostStringArrayBlock, elements) + 7 * sizeof(ZkStringHandle) == 4 * 7 + 4);

// The types of the boundary, and how identifiers lie in memory.
static_assert(sizeof(HRESULT) == 4 && sizeof(ULONG) == 4 && sizeof(LONG) == 4 && sizeof(DWORD) == 4);
static_assert(sizeof(BOOL) == 4 && sizeof(WCHAR) == 2 && sizeof(OLECHAR) == 2);
static_assert(sizeof(GUID) == 16 && offsetof(GUID, Data2) == 4 && offsetof(GUID, Data3) == 6);
static_assert(offsetof(GUID, Data4) == 8);

// An interface is a pointer to its table.
static_assert(sizeof(IzkProjectItem) == 4 && sizeof(IzkProject) == 4 && sizeof(IzkHostContext) == 4);

#include "hostbridge/HostString.h"

#include <cstring>
#include <string_view>

#include "qn/dsc/zk/ThrowIfZKError.h"

namespace zkhw {

using qn::dsc::NarrowString;
using qn::dsc::String;
using qn::dsc::zk::ThrowIfZKError;

namespace {

// Good until the block is resized.
std::string_view BytesOf(HostHandle handle) {
    int32_t length = 0;
    if (handle != nullptr) {
        std::memcpy(&length, *handle, sizeof length);
    }
    if (length == 0) {
        return {};
    }
    return std::string_view(*handle + sizeof length, static_cast<uint32_t>(length));
}

}  // namespace

NarrowString HostStringToNarrow(HostHandle handle) {
    return NarrowString(BytesOf(handle));
}

String HostStringToString(HostHandle handle) {
    const std::string_view bytes = BytesOf(handle);
    return String(bytes.data(), static_cast<uint32_t>(bytes.size()));
}

void StoreInHostString(const NarrowString& text, HostHandle& handle) {
    StoreInHostString(text.CStr(), text.Length(), handle);
}

void StoreInHostString(const String& text, HostHandle& handle) {
    StoreInHostString(NarrowString(text), handle);
}

void StoreInHostString(const char* bytes, uint32_t length, HostHandle& handle) {
    ThrowIfZKError(HostResizeArray(hostTypeOfBytes, 1, &handle, length));
    // The block may have moved: it is looked up only now.
    std::memcpy(*handle, &length, sizeof length);
    if (length != 0) {
        std::memcpy(*handle + sizeof length, bytes, length);
    }
}

void StoreInGivenHostString(const String& text, HostHandle handle) {
    if (handle != nullptr) {
        StoreInHostString(text, handle);
    }
}

void StoreInGivenHostString(const char* bytes, uint32_t length, HostHandle handle) {
    if (handle != nullptr) {
        StoreInHostString(bytes, length, handle);
    }
}

void ClearHostString(HostHandle& handle) {
    StoreInHostString(nullptr, 0, handle);
}

void DisposeHostString(HostHandle& handle) {
    ThrowIfZKError(HostDisposeHandle(handle));
    handle = nullptr;
}

}  // namespace zkhw

#include "qn/dsc/osdep/FileSystem.h"

#include <atomic>

namespace qn::dsc::osdep {

namespace {

// Null: the operating system's own.
std::atomic<FileSystem*> currentFileSystem = nullptr;

}  // namespace

FileSystem& GetFileSystem() {
    FileSystem* const current = currentFileSystem.load(std::memory_order_acquire);
    return current != nullptr ? *current : GetNativeFileSystem();
}

FileSystem* SetFileSystem(FileSystem* fileSystem) {
    return currentFileSystem.exchange(fileSystem, std::memory_order_acq_rel);
}

}  // namespace qn::dsc::osdep

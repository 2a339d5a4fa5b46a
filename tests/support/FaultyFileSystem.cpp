#include "support/FaultyFileSystem.h"

#include <algorithm>

#include "qn/dsc/osdep/Compare.h"

namespace qn::dsc::osdep {

void FaultyFileSystem::Fail(FileCall kind, uint64_t nth, int error) {
    const uint64_t call = Count(kind) + nth;
    faults.push_back({kind, call, call, error});
}

void FaultyFileSystem::FailFromThenOn(FileCall kind, uint64_t nth, int error) {
    faults.push_back({kind, Count(kind) + nth, UINT64_MAX, error});
}

void FaultyFileSystem::FailOnPath(FileCall kind, const String& path, int error) {
    pathFaults.push_back({kind, path, error});
}

void FaultyFileSystem::Clear() {
    faults.clear();
    pathFaults.clear();
    transferLimit = SIZE_MAX;
    workingFolder = String();
    executablePath = String();
}

int FaultyFileSystem::Enter(FileCall kind, const String* path) {
    ++counts[static_cast<size_t>(FileCall::Any)];
    ++counts[static_cast<size_t>(kind)];
    for (const Fault& fault : faults) {
        const bool isMeant = fault.kind == FileCall::Any || fault.kind == kind;
        if (isMeant && Count(fault.kind) >= fault.first && Count(fault.kind) <= fault.last) {
            return fault.error;
        }
    }
    for (const PathFault& fault : pathFaults) {
        const bool isMeant = fault.kind == FileCall::Any || fault.kind == kind;
        if (isMeant && path != nullptr && Equal(fault.path.View(), path->View())) {
            return fault.error;
        }
    }
    return 0;
}

int FaultyFileSystem::ReadAttributes(const String& path, FileAttributes& attributes) {
    const int error = Enter(FileCall::ReadAttributes, &path);
    return error != 0 ? error : inner.ReadAttributes(path, attributes);
}

int FaultyFileSystem::ReadIdentity(const String& path, FileIdentity& identity) {
    const int error = Enter(FileCall::ReadIdentity, &path);
    return error != 0 ? error : inner.ReadIdentity(path, identity);
}

int FaultyFileSystem::BeginSearch(const String& pattern, SearchHandle& search, String& firstName) {
    int error = Enter(FileCall::BeginSearch, &pattern);
    if (error == 0) {
        error = inner.BeginSearch(pattern, search, firstName);
    }
    openSearches += error == 0 ? 1 : 0;
    return error;
}

int FaultyFileSystem::NextName(SearchHandle search, String& name) {
    const int error = Enter(FileCall::NextName, nullptr);
    return error != 0 ? error : inner.NextName(search, name);
}

void FaultyFileSystem::EndSearch(SearchHandle search) {
    --openSearches;
    inner.EndSearch(search);
}

int FaultyFileSystem::MakeFolder(const String& path) {
    const int error = Enter(FileCall::MakeFolder, &path);
    return error != 0 ? error : inner.MakeFolder(path);
}

int FaultyFileSystem::OpenBinary(const String& path, uint32_t mode, FileHandle& file) {
    int error = Enter(FileCall::OpenBinary, &path);
    if (error == 0) {
        error = inner.OpenBinary(path, mode, file);
    }
    openFiles += error == 0 ? 1 : 0;
    return error;
}

int FaultyFileSystem::OpenText(const String& path, TextMode mode, FileHandle& file) {
    int error = Enter(FileCall::OpenText, &path);
    if (error == 0) {
        error = inner.OpenText(path, mode, file);
    }
    openFiles += error == 0 ? 1 : 0;
    return error;
}

int FaultyFileSystem::ReadBytes(FileHandle file, void* buffer, size_t count, size_t& got) {
    const int error = Enter(FileCall::ReadBytes, nullptr);
    return error != 0 ? error : inner.ReadBytes(file, buffer, std::min(count, transferLimit), got);
}

int FaultyFileSystem::WriteBytes(FileHandle file, const void* buffer, size_t count, size_t& put) {
    const int error = Enter(FileCall::WriteBytes, nullptr);
    return error != 0 ? error : inner.WriteBytes(file, buffer, std::min(count, transferLimit), put);
}

int FaultyFileSystem::CloseFile(FileHandle file) {
    const int error = Enter(FileCall::CloseFile, nullptr);
    --openFiles;
    const int closeError = inner.CloseFile(file);
    return error != 0 ? error : closeError;
}

int FaultyFileSystem::ReadWorkingFolder(String& path) {
    const int error = Enter(FileCall::ReadWorkingFolder, nullptr);
    if (error == 0 && !workingFolder.IsEmpty()) {
        path = workingFolder;
        return 0;
    }
    return error != 0 ? error : inner.ReadWorkingFolder(path);
}

int FaultyFileSystem::ReadExecutablePath(String& path) {
    const int error = Enter(FileCall::ReadExecutablePath, nullptr);
    if (error == 0 && !executablePath.IsEmpty()) {
        path = executablePath;
        return 0;
    }
    return error != 0 ? error : inner.ReadExecutablePath(path);
}

std::unique_ptr<FolderHold> FaultyFileSystem::HoldFolder(const String& folder) {
    return inner.HoldFolder(folder);
}

}  // namespace qn::dsc::osdep

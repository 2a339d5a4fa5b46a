#include "support/FaultyFileSystem.h"

#include <algorithm>
#include <utility>

#include "qn/dsc/osdep/Compare.h"
#include "qn/dsc/osdep/path.h"

namespace qn::dsc::osdep {

// A walk of the inner file system. Knows the present path, for the faults that are set on paths.
class FaultyFolderWalk final : public FolderWalk {
  public:
    FaultyFolderWalk(FaultyFileSystem& faultyFiles, std::unique_ptr<FolderWalk> innerWalk, const String& start)
        : files(faultyFiles), inner(std::move(innerWalk)) {
        paths.push_back(start);
        ++files.openWalks;
    }
    ~FaultyFolderWalk() override { --files.openWalks; }

    int List() override {
        const int error = files.Enter(FileCall::ListFolder, &paths.back());
        return error != 0 ? error : inner->List();
    }
    size_t EntryCount() const override { return inner->EntryCount(); }
    WalkEntry EntryAt(size_t number) const override { return inner->EntryAt(number); }
    int Enter(size_t number, WayIn& way) override {
        String path = PathOf(number);
        const String any = JoinPath(paths.back(), u"*");
        paths.reserve(paths.size() + 1);
        int error = files.Enter(FileCall::EnterFolder, &path);
        if (error == 0) {
            error = files.PathFaultFor(FileCall::EnterFolder, any);
        }
        if (error == 0) {
            error = inner->Enter(number, way);
        }
        if (error == 0) {
            paths.push_back(std::move(path));
        }
        return error;
    }
    void Leave() override {
        paths.pop_back();
        inner->Leave();
    }
    int ReadWriteTime(size_t number, uint64_t& time) override {
        const String path = PathOf(number);
        const int error = files.Enter(FileCall::ReadWriteTime, &path);
        return error != 0 ? error : inner->ReadWriteTime(number, time);
    }
    int ReadIdentity(size_t level, FileIdentity& identity) override {
        const int error = files.Enter(FileCall::ReadIdentity, &paths[level]);
        return error != 0 ? error : inner->ReadIdentity(level, identity);
    }

  private:
    String PathOf(size_t number) const { return JoinPath(paths.back(), String(inner->EntryAt(number).name)); }

    FaultyFileSystem& files;
    std::unique_ptr<FolderWalk> inner;
    std::vector<String> paths;
};

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
    return path == nullptr ? 0 : PathFaultFor(kind, *path);
}

int FaultyFileSystem::PathFaultFor(FileCall kind, const String& path) const {
    for (const PathFault& fault : pathFaults) {
        const bool isMeant = fault.kind == FileCall::Any || fault.kind == kind;
        if (isMeant && Equal(fault.path.View(), path.View())) {
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

int FaultyFileSystem::BeginWalk(const String& folder, const String& pattern, std::unique_ptr<FolderWalk>& walk) {
    String start = folder;
    if (start.Length() > 3 && start.View().back() == u'\\') {
        start.Erase(start.Length() - 1, 1, false);
    }
    int error = Enter(FileCall::BeginWalk, &start);
    std::unique_ptr<FolderWalk> begun;
    if (error == 0) {
        error = inner.BeginWalk(folder, pattern, begun);
    }
    if (error == 0) {
        walk = std::make_unique<FaultyFolderWalk>(*this, std::move(begun), start);
    }
    return error;
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

int FaultyFileSystem::CutFile(FileHandle file, uint64_t length) {
    const int error = Enter(FileCall::CutFile, nullptr);
    return error != 0 ? error : inner.CutFile(file, length);
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

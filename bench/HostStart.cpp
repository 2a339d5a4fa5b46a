// What a host waits for, measured inside its process, on an installation whose root holds this program:
//
//   HostStart first PATH          the first answer: the property at PATH, on the cache that stands there
//   HostStart deep PATH           then the property at PATH, for which a target's description has to be read
//   HostStart walk                the bare work under the first: every folder listed, every resource file's time asked,
//                                 and the cache parsed by libexpat with handlers that do nothing
//   HostStart parse FILE ...      the bare work under the second: the files parsed in the same way
//
// Prints nanoseconds. A process answers but once: the tree is there afterwards, as it is in a host.

#include <cstdio>
#include <cstring>
#include <ctime>
#include <string>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "baselines/ParseWithExpat.h"
#include "zkfpga/zkfpga.h"

namespace {

long Now() {
    timespec time{};
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &time);
    return time.tv_sec * 1000000000L + time.tv_nsec;
}

// Lists the folder and those in it; asks each resource file for its time. How many there are.
long Walk(int parent, const char* name) {
    const int descriptor = openat(parent, name, O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    DIR* const folder = fdopendir(descriptor);
    long count = 0;
    while (const dirent* const entry = readdir(folder)) {
        const size_t length = std::strlen(entry->d_name);
        constexpr size_t endingLength = 12;
        if (entry->d_type == DT_DIR) {
            if (std::strcmp(entry->d_name, ".") != 0 && std::strcmp(entry->d_name, "..") != 0) {
                count += Walk(descriptor, entry->d_name);
            }
        } else if (length >= endingLength && std::strcmp(entry->d_name + length - endingLength, "resource.xml") == 0) {
            struct stat status {};
            fstatat(descriptor, entry->d_name, &status, 0);
            ++count;
        }
    }
    closedir(folder);
    return count;
}

bool AskFor(IzkEIOGResourceTree* tree, const char* path) {
    std::u16string wide;
    for (const char* unit = path; *unit != '\0'; ++unit) {
        wide.push_back(static_cast<unsigned char>(*unit));
    }
    BSTR value = nullptr;
    const HRESULT result = tree->GetProperty(wide.c_str(), nullptr, &value);
    SysFreeString(value);
    return result == S_OK;
}

// Nanoseconds; negative if there was no answer.
long AskTheTree(const char* first, const char* deep) {
    long start = Now();
    void* tree = nullptr;
    if (QueryResourceTreeInterface(&IID_IzkEIOGResourceTree, nullptr, nullptr, &tree) != S_OK ||
        !AskFor(static_cast<IzkEIOGResourceTree*>(tree), first)) {
        return -1;
    }
    if (deep != nullptr) {
        start = Now();
        if (!AskFor(static_cast<IzkEIOGResourceTree*>(tree), deep)) {
            return -1;
        }
    }
    return Now() - start;
}

long DoBareWork(int argc, char** argv) {
    const long start = Now();
    if (std::strcmp(argv[1], "walk") == 0) {
        std::string folder(argv[0]);
        folder.erase(folder.rfind('/'));
        folder += "/Targets/QN/FPGA";
        if (Walk(AT_FDCWD, folder.c_str()) == 0 || !bench::ParseWithExpat((folder + "/resource_cache.xml").c_str())) {
            return -1;
        }
    }
    for (int i = 2; i < argc; ++i) {
        if (!bench::ParseWithExpat(argv[i])) {
            return -1;
        }
    }
    return Now() - start;
}

}  // namespace

int main(int argc, char** argv) {
    long elapsed = -1;
    if (argc == 3 && std::strcmp(argv[1], "first") == 0) {
        elapsed = AskTheTree(argv[2], nullptr);
    } else if (argc == 4 && std::strcmp(argv[1], "deep") == 0) {
        elapsed = AskTheTree(argv[2], argv[3]);
    } else if (argc >= 2) {
        elapsed = DoBareWork(argc, argv);
    }
    std::printf("%ld\n", elapsed);
    return elapsed < 0 ? 1 : 0;
}

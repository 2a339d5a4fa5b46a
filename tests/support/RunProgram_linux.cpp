#include "support/RunProgram.h"

#include <csignal>
#include <cstdio>
#include <cstdlib>

#include <fcntl.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include "support/ProcessEnd.h"

namespace qn::dsc::osdep {

namespace {

// A file without a name, so that no pipe can fill up while nobody reads.
class CapturedStream {
  public:
    CapturedStream() : file(std::tmpfile()) {
        if (file == nullptr) {
            std::abort();
        }
    }
    ~CapturedStream() { std::fclose(file); }
    CapturedStream(const CapturedStream&) = delete;
    CapturedStream& operator=(const CapturedStream&) = delete;

    int Descriptor() const { return fileno(file); }
    std::string Text() const {
        std::string text;
        char buffer[4096];
        off_t offset = 0;
        for (ssize_t got; (got = pread(Descriptor(), buffer, sizeof buffer, offset)) > 0; offset += got) {
            text.append(buffer, static_cast<size_t>(got));
        }
        return text;
    }

  private:
    std::FILE* file;
};

constexpr int notStarted = 127;

[[noreturn]] void BecomeProgram(char* const* argv, const char* workingFolder, int output, int errors) {
    const rlimit noCore{0, 0};
    setrlimit(RLIMIT_CORE, &noCore);
    const int nothing = open("/dev/null", O_RDONLY);
    if (chdir(workingFolder) == 0 && dup2(nothing, 0) == 0 && dup2(output, 1) == 1 && dup2(errors, 2) == 2) {
        execv(argv[0], argv);
    }
    _exit(notStarted);
}

std::string DescribeEnd(int status) {
    if (WIFEXITED(status)) {
        return WEXITSTATUS(status) == notStarted ? "not started"
                                                 : EndWithResult(static_cast<uint32_t>(WEXITSTATUS(status)));
    }
    switch (WTERMSIG(status)) {
        case SIGTRAP:
            return endByTrap;
        case SIGABRT:
            return endByAbort;
        default:
            return "signal " + std::to_string(WTERMSIG(status));
    }
}

}  // namespace

ProgramResult RunProgram(const std::string& program, const std::vector<std::string>& arguments,
                         const std::string& workingFolder) {
    std::vector<std::string> texts{program};
    texts.insert(texts.end(), arguments.begin(), arguments.end());
    std::vector<char*> argv;
    for (std::string& text : texts) {
        argv.push_back(text.data());
    }
    argv.push_back(nullptr);
    const CapturedStream output;
    const CapturedStream errors;
    const pid_t child = fork();
    if (child == 0) {
        BecomeProgram(argv.data(), workingFolder.c_str(), output.Descriptor(), errors.Descriptor());
    }
    int status = 0;
    if (child < 0 || waitpid(child, &status, 0) != child) {
        return {"not started", "", ""};
    }
    return {DescribeEnd(status), output.Text(), errors.Text()};
}

}  // namespace qn::dsc::osdep

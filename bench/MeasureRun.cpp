// Runs a program and prints, on one line: exit status, CPU seconds (user and system), wall seconds, and the peak of
// its resident memory in bytes. Small on purpose: the peak that the system reports for a program counts from the
// memory of whoever started it, so a large starter would hide a small program.

#include <cstdio>
#include <cstdlib>
#include <ctime>

#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

double Seconds(const timeval& time) {
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) * 1e-6;
}

double Now() {
    timespec time{};
    clock_gettime(CLOCK_MONOTONIC, &time);
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

}  // namespace

int main(int argc, char** argv) {
    if (argc < 2) {
        std::fputs("usage: MeasureRun program [argument ...]\n", stderr);
        return 2;
    }
    const double start = Now();
    const pid_t child = fork();
    if (child < 0) {
        std::perror("fork");
        return 2;
    }
    if (child == 0) {
        execv(argv[1], argv + 1);
        std::perror(argv[1]);
        std::_Exit(127);
    }
    int status = 0;
    rusage usage{};
    if (wait4(child, &status, 0, &usage) != child) {
        std::perror("wait4");
        return 2;
    }
    const double wall = Now() - start;
    const int code = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
    std::printf("%d %.6f %.6f %.6f %ld\n", code, Seconds(usage.ru_utime), Seconds(usage.ru_stime), wall,
                usage.ru_maxrss * 1024);
    return 0;
}

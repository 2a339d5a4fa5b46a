#include <windows.h>

#include "support/NativeProgram_windows.h"
#include "support/ProcessEnd.h"
#include "support/RunProgram.h"

namespace qn::dsc::osdep {

namespace {

// A file that goes with its last handle, so that no pipe can fill up while nobody reads.
class CapturedStream {
  public:
    CapturedStream() {
        char16_t folder[MAX_PATH + 1];
        char16_t name[MAX_PATH + 1];
        GetTempPathW(MAX_PATH + 1, folder);
        GetTempFileNameW(folder, u"out", 0, name);
        SECURITY_ATTRIBUTES inherited{sizeof inherited, nullptr, TRUE};
        handle = CreateFileW(name, GENERIC_READ | GENERIC_WRITE | DELETE,
                             FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, &inherited, CREATE_ALWAYS,
                             FILE_ATTRIBUTE_TEMPORARY | FILE_FLAG_DELETE_ON_CLOSE, nullptr);
        if (handle == INVALID_HANDLE_VALUE) {
            abort();
        }
    }
    ~CapturedStream() { CloseHandle(handle); }
    CapturedStream(const CapturedStream&) = delete;
    CapturedStream& operator=(const CapturedStream&) = delete;

    HANDLE Handle() const { return handle; }
    std::string Text() const {
        std::string text;
        char buffer[4096];
        DWORD got = 0;
        SetFilePointer(handle, 0, nullptr, FILE_BEGIN);
        while (ReadFile(handle, buffer, sizeof buffer, &got, nullptr) != 0 && got != 0) {
            text.append(buffer, got);
        }
        return text;
    }

  private:
    HANDLE handle;
};

// By the rules by which a program's run-time takes its command line apart.
void AppendQuoted(const std::string& argument, std::u16string& line) {
    line += u'"';
    size_t backslashes = 0;
    for (const char16_t unit : Widened(argument)) {
        if (unit == u'"') {
            line.append(backslashes + 1, u'\\');
        }
        backslashes = unit == u'\\' ? backslashes + 1 : 0;
        line += unit;
    }
    line.append(backslashes, u'\\');
    line += u'"';
}

std::u16string CommandLine(const std::string& program, const std::vector<std::string>& arguments) {
    std::u16string line;
    AppendQuoted(program, line);
    for (const std::string& argument : arguments) {
        line += u' ';
        AppendQuoted(argument, line);
    }
    return line;
}

std::string WithoutReturns(std::string text) {
    std::erase(text, '\r');
    return text;
}

std::string DescribeEnd(DWORD code) {
    if (code == static_cast<DWORD>(EXCEPTION_BREAKPOINT)) {
        return endByTrap;
    }
    return code == 3 ? endByAbort : EndWithResult(static_cast<uint32_t>(code));
}

}  // namespace

ProgramResult RunProgram(const std::string& program, const std::vector<std::string>& arguments,
                         const std::string& workingFolder) {
    const CapturedStream output;
    const CapturedStream errors;
    SECURITY_ATTRIBUTES inherited{sizeof inherited, nullptr, TRUE};
    STARTUPINFOW start{};
    start.cb = sizeof start;
    start.dwFlags = STARTF_USESTDHANDLES;
    start.hStdInput = CreateFileW(u"NUL", GENERIC_READ, FILE_SHARE_READ, &inherited, OPEN_EXISTING, 0, nullptr);
    start.hStdOutput = output.Handle();
    start.hStdError = errors.Handle();
    PROCESS_INFORMATION process{};
    std::u16string line = CommandLine(program, arguments);
    const bool isStarted = CreateProcessW(Widened(program).c_str(), line.data(), nullptr, nullptr, TRUE, 0, nullptr,
                                          Widened(workingFolder).c_str(), &start, &process) != 0;
    CloseHandle(start.hStdInput);
    if (!isStarted) {
        return {"not started", "", ""};
    }
    WaitForSingleObject(process.hProcess, INFINITE);
    DWORD code = 0;
    GetExitCodeProcess(process.hProcess, &code);
    CloseHandle(process.hProcess);
    CloseHandle(process.hThread);
    return {DescribeEnd(code), WithoutReturns(output.Text()), WithoutReturns(errors.Text())};
}

}  // namespace qn::dsc::osdep

// Running a program from a test, and the files that it works on.
#include "tests/support/program.h"

#include "apps/common/unicode.h"

#include <windows.h>

#include <algorithm>
#include <cstring>
#include <fstream>
#include <iterator>

namespace apps_test {

namespace fs = std::filesystem;

static std::string Contents(fs::path const &path) {
    std::ifstream file(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(file), {});
}

Bytes Foreign(std::string const &name) {
    std::string const text = Contents(fs::path(ORU_FOREIGN_FILES) / name);
    return Bytes(text.begin(), text.end());
}

fs::path ProgramFolder() {
    wchar_t path[MAX_PATH];
    ::GetModuleFileNameW(nullptr, path, MAX_PATH);
    return fs::path(path).parent_path();
}

Process::Process(std::string const &name, std::string const &arguments, fs::path const &folder,
                 void *output, void *errors) {
    std::wstring command =
        L"\"" + (ProgramFolder() / name).wstring() + L"\" " + App::ToPath(arguments).wstring();
    STARTUPINFOW startup = {};
    startup.cb = sizeof startup;
    startup.dwFlags = output ? STARTF_USESTDHANDLES : 0;
    startup.hStdOutput = output;
    startup.hStdError = errors;
    PROCESS_INFORMATION process = {};
    ::CreateProcessW(nullptr, command.data(), nullptr, nullptr, TRUE, 0, nullptr, folder.c_str(),
                     &startup, &process);
    ::CloseHandle(process.hThread);
    handle_ = process.hProcess;
}

Process::~Process() {
    ::TerminateProcess(handle_, 99);
    ::CloseHandle(handle_);
}

int Process::exitCode() const {
    constexpr DWORD kMilliseconds = 150000;
    DWORD code = 0;
    bool const ended = ::WaitForSingleObject(handle_, kMilliseconds) == WAIT_OBJECT_0;
    return ended && ::GetExitCodeProcess(handle_, &code) ? static_cast<int>(code) : -1;
}

void Process::pressControlC() const {
    // The system starts this routine in all processes of a console, which the tests' may lack.
    FARPROC const routine = ::GetProcAddress(::GetModuleHandleW(L"kernelbase.dll"), "CtrlRoutine");
    LPTHREAD_START_ROUTINE start;
    static_assert(sizeof start == sizeof routine, "function pointers have one size");
    std::memcpy(&start, &routine, sizeof start);
    ::CloseHandle(::CreateRemoteThread(handle_, nullptr, 0, start, nullptr, 0, nullptr));
}

Outcome RunProgram(std::string const &name, std::string const &arguments, fs::path const &folder) {
    TemporaryFolder const captures;
    auto const fileFor = [&](char const *stream) {
        SECURITY_ATTRIBUTES inheritable = {sizeof inheritable, nullptr, TRUE};
        return ::CreateFileW((captures.path() / stream).c_str(), GENERIC_WRITE, FILE_SHARE_READ,
                             &inheritable, CREATE_ALWAYS, FILE_ATTRIBUTE_NORMAL, nullptr);
    };
    HANDLE const output = fileFor("output"), errors = fileFor("errors");
    int const exitCode = Process(name, arguments, folder, output, errors).exitCode();
    ::CloseHandle(output);
    ::CloseHandle(errors);
    return {exitCode, Contents(captures.path() / "output"), Contents(captures.path() / "errors")};
}

TemporaryFolder::TemporaryFolder() {
    static int sCount = 0;
    path_ = fs::temp_directory_path() / ("oru_apps_" + std::to_string(::GetCurrentProcessId()) +
                                         "_" + std::to_string(sCount++));
    fs::create_directories(path_);
}

TemporaryFolder::~TemporaryFolder() {
    std::error_code ignored;
    fs::remove_all(path_, ignored);
}

std::vector<std::string> TemporaryFolder::list(std::string const &subfolder) const {
    std::vector<std::string> names;
    for (fs::directory_entry const &entry : fs::directory_iterator(path_ / subfolder))
        names.push_back(App::ToText(entry.path().filename()));
    std::sort(names.begin(), names.end());
    return names;
}

} // namespace apps_test

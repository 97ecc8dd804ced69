// The wish to end that a person tells by Ctrl-C or by closing the console.
#include "apps/develop/cancellation.h"

#include <windows.h>

namespace Develop {

namespace {

std::atomic<bool> gIsRequested(false);

/// The system calls this on a thread of its own.
BOOL WINAPI OnConsoleEvent(DWORD event) {
    bool const isRepeated = gIsRequested.exchange(true);
    if (event != CTRL_C_EVENT && event != CTRL_BREAK_EVENT)
        ::Sleep(INFINITE); // once this returns the process is ended; the main thread does it sooner
    if (isRepeated)
        ::TerminateProcess(::GetCurrentProcess(), Cancellation::kExitCode);
    return TRUE;
}

} // namespace

Cancellation::Cancellation() {
    gIsRequested = false;
    ::SetConsoleCtrlHandler(&OnConsoleEvent, TRUE);
}

Cancellation::~Cancellation() {
    ::SetConsoleCtrlHandler(&OnConsoleEvent, FALSE);
}

std::atomic<bool> const &Cancellation::isRequested() const {
    return gIsRequested;
}

} // namespace Develop

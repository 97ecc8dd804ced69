// The file that a program's trace of OpenGL calls goes to.
#include "apps/common/tracefile.h"

#include "apps/common/failure.h"
#include "apps/common/unicode.h"

#include <windows.h>

namespace App {

namespace {

constexpr std::size_t kBufferBytes = 1 << 16;

std::ofstream *gStream = nullptr;
LPTOP_LEVEL_EXCEPTION_FILTER gPreviousFilter = nullptr;

/// The system calls this when the process crashes.
LONG WINAPI WriteLastLines(EXCEPTION_POINTERS *crash) {
    gStream->flush();
    return gPreviousFilter ? gPreviousFilter(crash) : EXCEPTION_CONTINUE_SEARCH;
}

} // namespace

TraceFile::TraceFile(std::string const &name) : buffer_(kBufferBytes) {
    stream_.rdbuf()->pubsetbuf(buffer_.data(), kBufferBytes); // heeded only before it is open
    stream_.open(ToPath(name));
    if (!stream_)
        throw Failure("the trace " + name + " cannot be written");
    gStream = &stream_;
    gPreviousFilter = ::SetUnhandledExceptionFilter(&WriteLastLines);
}

TraceFile::~TraceFile() {
    ::SetUnhandledExceptionFilter(gPreviousFilter);
}

} // namespace App

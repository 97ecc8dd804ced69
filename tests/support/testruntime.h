// Loads the tests' own OpenCL runtime.
#pragma once

#include "oru/oru_ocl/ocllibrary.h"
#include "tests/support/oclruntime/callbook.h"

#include <string>

#include <windows.h>

namespace oru_test {

/// One of the runtimes beside the test program, loaded for the rest of the process.
class TestRuntime {
public:
    /// @param name the runtime's folder
    explicit TestRuntime(std::string const &name) {
        char program[MAX_PATH];
        ::GetModuleFileNameA(nullptr, program, MAX_PATH);
        std::string const path = program;
        folder_ = path.substr(0, path.find_last_of('\\') + 1) + name + '\\';
        if (HMODULE const module = ::LoadLibraryA((folder_ + "OpenCL.dll").c_str()))
            book_ = reinterpret_cast<CallBook *(*)()>(
                reinterpret_cast<void *>(::GetProcAddress(module, "OruTestCallBook")))();
    }

    /// What `Library::IsOpenCLAvailable` takes.
    std::string const &folder() const { return folder_; }

    CallBook *operator->() const { return book_; }

private:
    std::string folder_;
    CallBook *book_ = nullptr;
};

} // namespace oru_test

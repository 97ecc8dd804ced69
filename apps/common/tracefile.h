// The file that a program's trace of OpenGL calls goes to.
#pragma once

#include <fstream>
#include <string>
#include <vector>

namespace App {

/// A file stream with a buffer for some hundred lines, which makes a traced call cost half. The
/// lines before a crash, which traces are read for, are written by the crash. One at a time.
class TraceFile {
public:
    /// @throws Failure when the file cannot be written
    explicit TraceFile(std::string const &name);
    ~TraceFile();
    TraceFile(TraceFile const &) = delete;
    TraceFile &operator=(TraceFile const &) = delete;

    std::ostream &stream() { return stream_; }

private:
    std::vector<char> buffer_;
    std::ofstream stream_;
};

} // namespace App

// The base of every failure the library reports: where it happened and why.
#include "oru/core/exceptions/logicalexception.h"

#include "oru/core/memory/orumemory.h"

#include <ostream>

namespace ORU {

LogicalException::LogicalException() : LogicalException(nullptr, 0, nullptr) {}

LogicalException::LogicalException(char const *file, int line, char const *message) {
    initialize(file, line, message);
}

LogicalException::~LogicalException() = default;

ExceptionBase *LogicalException::clone() const {
    return ORU_NEW LogicalException(*this);
}

void LogicalException::write(std::ostream &os) const {
    // to_string, not the stream's number format: a caller's std::hex must not change the line.
    os << what() << ' ' << file_ << ':' << std::to_string(line_) << " (" << message() << ')';
    if (*note())
        os << ' ' << note();
}

char const *LogicalException::note() const {
    auto const end = message_.find('\0');
    return end == std::string::npos ? "" : message_.c_str() + end + 1;
}

void LogicalException::addNote(std::string const &note) {
    if (note.empty())
        return;
    message_ += (*this->note() ? ", " : std::string(1, '\0')) + note;
}

void LogicalException::initialize(char const *file, int line, char const *message) {
    static constexpr char kUndefined[] = "Undefined";
    setWhat("ORU logical exception");
    file_ = file ? file : kUndefined;
    line_ = line;
    message_ = message ? message : kUndefined;
}

} // namespace ORU

// Uses the installed library as a host does: a start-up and a failure caught by its type.
#include "oru/core/exceptions/internalexception.h"
#include "oru/oru_ogl/libraryogl.h"

#include <cstring>

int main() {
    ORU::OGL::AutoInitializer const layer;
    try {
        throw ORU::InternalException("host.cpp", 7, "a host's own");
    } catch (ORU::LogicalException const &e) {
        return e.line() == 7 && std::strcmp(e.what(), "ORU Internal exception") == 0 ? 0 : 1;
    }
}

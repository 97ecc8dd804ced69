// A part of a buffer, mapped for a scope.
#include "oru/oru_ogl/ogl/mappedrange.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"

#include <utility>

namespace ORU::OGL {

MappedRange::MappedRange(Buffer &buffer, std::int64_t offset, std::int64_t size,
                         unsigned int access)
    : buffer_(buffer), target_(buffer.target()), previous_(buffer.getBoundID()), size_(size) {
    try {
        buffer_.bind();
        data_ = buffer_.mapRange(offset, size, access);
    } catch (...) {
        internal::Release([this] { bindPrevious(); });
        throw;
    }
}

MappedRange::~MappedRange() {
    if (!data_)
        return;
    internal::Release([this] { buffer_.bind(); }, [this] { buffer_.unmap(); },
                      [this] { bindPrevious(); });
}

void MappedRange::bindPrevious() const {
    ORU_GL(BindBuffer, target_, previous_);
}

void MappedRange::requireMapping() const {
    if (!data_)
        ORU_THROW_INTERNAL("The MappedRange is no longer mapped: unmap() was called");
}

void MappedRange::flush(std::int64_t offset, std::int64_t size) {
    requireMapping();
    buffer_.bind(); // another range of the same target may have been mapped meanwhile
    buffer_.flushMappedRange(offset, size);
}

void MappedRange::unmap() {
    requireMapping();
    buffer_.bind();
    internal::Ending restore([this] { bindPrevious(); });
    data_ = nullptr;
    buffer_.unmap();
    restore.now();
}

bool MappedRange::IsSupported() {
    return internal::Supports(GL_ARB_MAP_BUFFER_RANGE);
}

} // namespace ORU::OGL

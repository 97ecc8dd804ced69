// The client's pixel storage around a transfer.
#include "oru/oru_ogl/ogl/internal/textures/pixelstorage.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/textures/texturetables.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>

namespace ORU::OGL::internal {

namespace {

/// What core contexts lack: a stack, as deep as OpenGL's has to be.
struct Stack {
    struct Entry {
        HGLRC context;
        PixelStorage storage;
    };
    std::array<Entry, 16> entries;
    std::size_t count;
};

thread_local Stack gStack;

} // namespace

void PixelStorage::read(PixelStoreRange range) {
    range_ = range;
    for (std::size_t i = 0; i < range_.count; ++i)
        ORU_GL(GetIntegerv, kPixelStoreModes.rows[range_.first + i].gl, &values_[i]);
}

void PixelStorage::set() const {
    for (std::size_t i = 0; i < range_.count; ++i)
        ORU_GL(PixelStorei, kPixelStoreModes.rows[range_.first + i].gl, values_[i]);
}

PixelStorageScope::PixelStorageScope(PixelStoreRange range) : isCore_(IsCoreContext()) {
    if (isCore_)
        saved_.read(range);
    else
        ORU_GL(PushClientAttrib, GL_CLIENT_PIXEL_STORE_BIT);
}

void PixelStorageScope::restore() {
    isPending_ = false;
    if (isCore_)
        saved_.set();
    else
        ORU_GL0(PopClientAttrib);
}

void PushPixelStorage(PixelStoreRange range) {
    if (!IsCoreContext()) {
        ORU_GL(PushClientAttrib, GL_CLIENT_PIXEL_STORE_BIT);
        return;
    }
    if (gStack.count == gStack.entries.size())
        ORU_THROW_INTERNAL(
            "No room to save pixel storage: end each PushAndSetReadbackByteAlignment "
            "and PushAndSetTransferByteAlignment with a PopPixelTransferModes");
    Stack::Entry &entry = gStack.entries[gStack.count];
    entry.context = ::wglGetCurrentContext();
    entry.storage.read(range);
    ++gStack.count;
}

void PopPixelStorage() {
    if (!IsCoreContext()) {
        ORU_GL0(PopClientAttrib);
        return;
    }
    HGLRC const current = ::wglGetCurrentContext();
    std::size_t i = gStack.count;
    while (i > 0 && gStack.entries[i - 1].context != current)
        --i;
    if (i == 0)
        ORU_THROW_INTERNAL("No pixel storage of this context was saved: call a PushAndSet... "
                           "function before each PopPixelTransferModes");
    PixelStorage const saved = gStack.entries[i - 1].storage;
    auto *const begin = gStack.entries.begin() + i;
    std::copy(begin, gStack.entries.begin() + gStack.count, begin - 1);
    --gStack.count;
    saved.set();
}

} // namespace ORU::OGL::internal

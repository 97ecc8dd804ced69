// Uses of the classes of OpenGL 3 and 4.
#pragma once

namespace sweep {

void Queries();
void VertexArrays();
void LaterTextures();
void FramebufferTransfers();
void FramebufferImages();
void Streams();
void Stages();
void Adopted();

} // namespace sweep

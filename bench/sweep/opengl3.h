// Uses of the classes of OpenGL 3 and 4.
#pragma once

namespace sweep {

void Streams();
void Stages();

} // namespace sweep

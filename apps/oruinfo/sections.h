// What fills the sections of a report; each in a file of its own. They throw what they meet: what
// was added before stays.
#pragma once

namespace OruInfo {

class Drivers;
struct Group;

/// The library, and the system that it runs on.
void GatherLibrary(Drivers &drivers, Group &section);

/// Display adapters and their outputs.
void GatherDisplays(Drivers &drivers, Group &section);

/// Who made the OpenGL, its versions, and the profiles that contexts can have.
void GatherOpenGL(Drivers &drivers, Group &section);

/// The capabilities that the library knows: which are there, and why the others are not.
void GatherCapabilities(Drivers &drivers, Group &section);

/// What windows can be drawn into with.
void GatherPixelFormats(Drivers &drivers, Group &section);

/// The numbers that OpenGL keeps within.
void GatherLimits(Drivers &drivers, Group &section);

/// Whether floating-point textures are filtered.
void GatherFiltering(Drivers &drivers, Group &section);

/// What can be done with each internal format.
void GatherFormats(Drivers &drivers, Group &section);

/// The OpenCL platforms and their devices.
void GatherOpenCL(Drivers &drivers, Group &section);

/// Whether OpenCL can work on objects of OpenGL.
void GatherSharing(Drivers &drivers, Group &section);

} // namespace OruInfo

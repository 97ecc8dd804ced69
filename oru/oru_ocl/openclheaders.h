// The OpenCL headers: their types and constants, with none of their version notices.
#pragma once

#ifndef CL_TARGET_OPENCL_VERSION
/// The headers print a message when no version is chosen. A host that has chosen one keeps it,
/// since nothing of the layer depends on it.
#define CL_TARGET_OPENCL_VERSION 300
#endif

#include <CL/cl.h>
#include <CL/cl_ext.h>
#include <CL/cl_gl.h>

// Marks what the shared library exports and what its users import.
#pragma once

/// `ORU_API` stands before every exported class, function and variable. The library's own sources
/// are compiled with `ORU_BUILDING`; a static build defines `ORU_STATIC` for itself and its users.
#if defined(_MSC_VER)
// Exported classes have members and bases of the standard library's, which are not exported. That
// is safe because library and host use one standard library, as they must: its classes cross the
// boundary.
#pragma warning(disable : 4251 4275)
#endif

#if defined(ORU_STATIC)
#define ORU_API
#elif defined(ORU_BUILDING)
#define ORU_API __declspec(dllexport)
#else
#define ORU_API __declspec(dllimport)
#endif

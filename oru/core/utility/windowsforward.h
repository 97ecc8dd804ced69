// The few Windows type names that public headers need, without windows.h.
#pragma once

// Each name repeats the platform's own declaration (with STRICT handles, its default), so that
// windows.h may be included before or after this header, or not at all.

/// @name Types of Windows
/// As windows.h declares them.
/// @{
typedef int BOOL;
typedef int INT;
typedef unsigned int UINT;
typedef unsigned char BYTE;
typedef unsigned short WORD;
typedef unsigned short USHORT;
typedef unsigned long DWORD;
typedef long LONG;
typedef long HRESULT;
typedef float FLOAT;
typedef DWORD COLORREF;
typedef void *LPVOID;
typedef char const *LPCSTR;
typedef wchar_t const *LPCWSTR;

typedef struct HDC__ *HDC;
typedef struct HGLRC__ *HGLRC;
typedef struct HWND__ *HWND;
typedef struct HMONITOR__ *HMONITOR;
typedef struct HINSTANCE__ *HINSTANCE;
typedef HINSTANCE HMODULE;
typedef struct HPBUFFERARB__ *HPBUFFERARB;

typedef long long(__stdcall *PROC)();

struct _GLYPHMETRICSFLOAT;
struct _WGLSWAP;
struct tagLAYERPLANEDESCRIPTOR;
struct tagPIXELFORMATDESCRIPTOR;

typedef _GLYPHMETRICSFLOAT *LPGLYPHMETRICSFLOAT;
typedef _WGLSWAP WGLSWAP;
typedef tagLAYERPLANEDESCRIPTOR *LPLAYERPLANEDESCRIPTOR;
typedef tagPIXELFORMATDESCRIPTOR PIXELFORMATDESCRIPTOR;
typedef tagPIXELFORMATDESCRIPTOR *LPPIXELFORMATDESCRIPTOR;
/// @}

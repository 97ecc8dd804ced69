// MinGW's header with the interfaces' identifiers where Microsoft's compiler looks for them.
#pragma once
#include_next <rpcndr.h>
#undef MIDL_INTERFACE
#define MIDL_INTERFACE(id) struct __declspec(uuid(id))

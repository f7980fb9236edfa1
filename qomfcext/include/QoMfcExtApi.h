// Linkage of the library: exported while qomfcext.dll is built, imported by
// the applications. Classes that only the library's own pages use carry no
// marker and stay inside the DLL.
#pragma once

#ifdef QOMFCEXT_BUILDING
#define QOMFCEXT_API __declspec(dllexport)
#else
#define QOMFCEXT_API __declspec(dllimport)
#endif

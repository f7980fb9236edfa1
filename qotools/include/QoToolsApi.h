// Linkage of the base library. In the Windows build qotools is one DLL: its
// classes are exported while it is built (QOTOOLS_BUILDING) and imported by
// everyone else. The native build links it statically, so the macro is empty.
#pragma once

#if defined(_WIN32)
#  if defined(QOTOOLS_BUILDING)
#    define QOTOOLS_API __declspec(dllexport)
#  else
#    define QOTOOLS_API __declspec(dllimport)
#  endif
#else
#  define QOTOOLS_API
#endif

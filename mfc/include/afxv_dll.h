// Linkage of the MFC subset: every class and function of the one MFC DLL is
// exported while the DLL itself is built and imported everywhere else.
#pragma once

#ifdef QO_BUILDING_MFC
#define AFX_API __declspec(dllexport)
#else
#define AFX_API __declspec(dllimport)
#endif

#ifndef AFXAPI
#define AFXAPI __stdcall
#endif
#ifndef AFX_CDECL
#define AFX_CDECL __cdecl
#endif

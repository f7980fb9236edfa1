// MFC's header for extension DLLs and extended controls. In this subset the
// extension-module support (AFX_EXTENSION_MODULE, AfxInitExtensionModule,
// CDynLinkLibrary) lives in afxwin.h; this header exists so that code written
// for MFC can include it as usual.
#pragma once

#include "afxwin.h"

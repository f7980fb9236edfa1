// A module that the tests load and unload: its class must be known by name only
// while it is loaded.
#include <afx.h>

class CPluginThing : public CObject {
  DECLARE_DYNCREATE(CPluginThing)
};

IMPLEMENT_DYNCREATE(CPluginThing, CObject)

extern "C" __declspec(dllexport) CRuntimeClass* PluginThingClass() { return RUNTIME_CLASS(CPluginThing); }

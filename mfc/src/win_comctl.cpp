#include "win_private.h"

namespace qownd {
namespace {

template <class F>
void Find(HMODULE module, const char* name, F& function) {
  if (module != NULL) function = reinterpret_cast<F>(reinterpret_cast<void*>(::GetProcAddress(module, name)));
}

}  // namespace

const CommonControls& ComCtl() {
  static const CommonControls functions = [] {
    CommonControls f;
    HMODULE module = ::LoadLibraryA("comctl32.dll");
    Find(module, "ImageList_Create", f.ImageListCreate);
    Find(module, "ImageList_Destroy", f.ImageListDestroy);
    Find(module, "ImageList_GetImageCount", f.ImageListGetImageCount);
    Find(module, "ImageList_ReplaceIcon", f.ImageListReplaceIcon);
    decltype(&::InitCommonControlsEx) init = nullptr;
    Find(module, "InitCommonControlsEx", init);
    if (init != nullptr) {
      INITCOMMONCONTROLSEX icc = {sizeof(icc), ICC_WIN95_CLASSES | ICC_STANDARD_CLASSES | ICC_DATE_CLASSES};
      init(&icc);
    }
    return f;
  }();
  return functions;
}

const CommonDialogs& ComDlg() {
  static const CommonDialogs functions = [] {
    ComCtl();
    CommonDialogs f;
    HMODULE module = ::LoadLibraryA("comdlg32.dll");
    Find(module, "GetOpenFileNameA", f.GetOpenFileName);
    Find(module, "GetSaveFileNameA", f.GetSaveFileName);
    return f;
  }();
  return functions;
}

}  // namespace qownd

// The part of MFC that lives in every GUI executable: WinMain hands over to
// AfxWinMain, which runs the application object's InitInstance and Run.
#include "afxwin.h"

extern "C" int WINAPI WinMain(HINSTANCE hInstance, HINSTANCE hPrevInstance, LPSTR lpCmdLine, int nCmdShow) {
  return AfxWinMain(hInstance, hPrevInstance, lpCmdLine, nCmdShow);
}

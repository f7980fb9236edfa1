// main() of console test programs: a plain application object, MFC set up as a
// console program does it, then GoogleTest. A test program that defines its own
// CWinApp object does not link this file.
#include "afxwin.h"

#include <gtest/gtest.h>

CWinApp theApp;

int main(int argc, char** argv) {
  if (!AfxWinInit(::GetModuleHandle(NULL), NULL, ::GetCommandLine(), SW_SHOW)) return 1;
  ::testing::InitGoogleTest(&argc, argv);
  return RUN_ALL_TESTS();
}

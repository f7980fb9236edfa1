// Resource ids of the window tests.
#pragma once

// Only in the extension DLL
#define IDS_EXT_ONLY 9001
#define IDD_EXT_DATA 9100
#define IDD_EXT_CHILD 9101
// In the DLL and in the test program: the program's text wins
#define IDS_BOTH 9002

#define IDC_NAME 1001
#define IDC_COUNT 1002
#define IDC_ACTIVE 1003
#define IDC_RADIO1 1004
#define IDC_RADIO2 1005
#define IDC_RADIO3 1006
#define IDC_KIND 1007
#define IDC_FACTOR 1008
#define IDC_FIRST 1010
#define IDC_SECOND 1011

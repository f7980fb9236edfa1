// Resource ids of the test program's own page.
#pragma once

#define IDD_TEST_PAGE 9500
#define IDC_PAGE_FIRST 9501
#define IDC_PAGE_SECOND 9502

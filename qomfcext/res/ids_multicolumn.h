// Resource ids of the combination field page (4038).
#pragma once

#define IDD_MULTICOLUMN_CONFIG      4038
#define IDC_MULTI_PREVIEW           4132
#define IDC_MULTI_NAMES             4133
#define IDC_MULTI_EDIT_NAME         4134
#define IDC_MULTI_FUNCTIONS         4135
#define IDC_MULTI_EDIT_FUNCTIONS    4136
#define IDC_MULTI_LBL_NAME          4152
#define IDC_MULTI_LBL_FUNCTIONS     4153
#define IDC_MULTI_NEW               4154
#define IDC_MULTI_DELETE            4155
#define IDC_MULTI_SELECT_ALL        4156
#define IDC_MULTI_FUNC_TO_NAMES     4157

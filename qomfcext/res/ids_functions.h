// Resource ids of the combination definition (4040), the function manager dialog (4039) and the field-name dialog (4042).
#pragma once

// Function manager dialog: the functions in three groups
#define IDD_FUNCTION_MANAGER        4039
#define IDC_FUNC_PREDEFINED         4136
#define IDC_FUNC_USERDEFINED        4137
#define IDC_FUNC_COMBINATIONS       4138
#define IDC_FUNC_USER_NEW           4139
#define IDC_FUNC_USER_DELETE        4141
#define IDC_FUNC_USER_EDIT          4152
#define IDC_FUNC_COMBI_NEW          4126
#define IDC_FUNC_COMBI_DELETE       4140
#define IDC_FUNC_COMBI_EDIT         4151

// Combination definition: functions on the left, the parts on the right
#define IDD_COMBI_COLUMN            4040
#define IDC_COMBI_FUNCTIONS         4142
#define IDC_COMBI_ADD               4145
#define IDC_COMBI_PARTS             4146
#define IDC_COMBI_DELETE            4149
#define IDC_COMBI_NAME              4150

// Function names as field names: the current field or all fields
#define IDD_FUNC_TO_NAMES           4042
#define IDC_FUNC_TO_NAMES_CURRENT   4158
#define IDC_FUNC_TO_NAMES_ALL       4046

// Messages of these dialogs beyond the common string table
#define IDS_NAME_EMPTY              4190
#define IDS_NO_FREE_USERDEFINED_ID  4191
#define IDS_NO_FREE_COMBINATION_ID  4192

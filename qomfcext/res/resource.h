// Resource ids of qomfcext.dll. The numbers are part of the library's
// interface: applications and tests refer to them.
#pragma once

// String table
#define IDS_LIBRARY_NAME            1
#define IDS_FIELD_N                 2
#define IDS_COLUMN_N                3
#define IDS_FILE                    4
#define IDS_TABLE                   5
#define IDS_QUERY                   6
#define IDS_SQL_STATEMENT           7
#define IDS_RECORD                  8
#define IDS_VALUE                   9
#define IDS_PASSWORD_PROMPT         10
#define IDS_EXCEL_UNREADABLE        11
#define IDS_PREVIEW_DOS_HINT        12
#define IDS_EXE_FILTER              13
#define IDS_FILE_OPEN_FAILED        14
#define IDS_ERROR_OCCURRED          15
#define IDS_FIELD_NAME              16
#define IDS_EDIT_FIELD_NAME         17
#define IDS_INPUT_TITLE             18
#define IDS_ENTER_NAME              19
#define IDS_NAME_IN_USE             20
#define IDS_COL_SEPARATOR           21
#define IDS_COL_FUNCTION            22
#define IDS_COL_ALWAYS_SEPARATE     23
#define IDS_COMBINATION_EXISTS      24
#define IDS_COMBINATION_TOO_SHORT   25
#define IDS_EDIT_FUNCTIONS          26
#define IDS_NEW_COLUMN              27
#define IDS_SELECT_ALL_WARNING      28
#define IDS_HINT_NOT_SHOWN          29
#define IDS_HINT_SHOWN              30
#define IDS_LOG_DELETE              31
#define IDS_COPY_PROGRESS           32
#define IDS_TYPE_NUMERIC            33
#define IDS_COL_FIELD               34
#define IDS_COL_TYPE                35
#define IDS_COL_LENGTH              36
#define IDS_TYPE_TEXT               37
#define IDS_COL_OFFSET              38
#define IDS_COL_POSITION            39
#define IDS_ODBC_MUST_EXIST         40
#define IDS_UNKNOWN_COLUMN_TYPE     41
#define IDS_REPAIR_SET_SPLIT        42
#define IDS_REPAIR_UNCHANGED        43
#define IDS_LENGTH_BELOW_MAX        362

// Icons
#define IDI_ERROR_ICON              4036

// Dialog templates
#define IDD_PASSWORD_DLG            4013
#define IDD_ERROR_DLG               4037

// Controls
#define IDC_PASSWORD_EDIT           4028
#define IDC_PASSWORD_PROMPT         4029
#define IDC_ERROR_MESSAGE           4130
#define IDC_ERROR_INFO              4131

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
#define IDD_FILE_OPEN_WITH          189
#define IDD_INPUT_TEXTVAR           4007
#define IDD_INFO_VIEW               4008
#define IDD_PASSWORD_DLG            4013
#define IDD_COLUMN_CONFIG           4017
#define IDD_OUTPUT_TEXTVAR          4023
#define IDD_OUTPUT_TEXTFIX          4024
#define IDD_INPUT_DIALOG            4029
#define IDD_HINT                    4034
#define IDD_ERROR_DLG               4037

// Controls
#define IDC_PASSWORD_EDIT           4028
#define IDC_PASSWORD_PROMPT         4029
#define IDC_ERROR_MESSAGE           4130
#define IDC_ERROR_INFO              4131

// Variable-length text input page (4007)
#define IDC_TEXTVAR_APPLY           4005
#define IDC_TEXTVAR_PREVIEW         4009
#define IDC_TEXTVAR_INFO            4010
#define IDC_TEXTVAR_DELIMITER       4015
#define IDC_TEXTVAR_ENCLOSER        4016
#define IDC_TEXTVAR_ESCAPE          4017
#define IDC_TEXTVAR_SKIP            4018
#define IDC_TEXTVAR_CHARSET         4019
#define IDC_TEXTVAR_LBL_DELIMITER   4084
#define IDC_TEXTVAR_LBL_ESCAPE      4085
#define IDC_TEXTVAR_LBL_CHARSET     4086
#define IDC_TEXTVAR_LBL_ENCLOSER    4087
#define IDC_TEXTVAR_LBL_SKIP        4088
#define IDC_TEXTVAR_FIRST_NAMES     4128
// Messages of the text input pages
#define IDS_TEXTVAR_NO_DELIMITER    4150
#define IDS_INPUT_NOT_TEXT          4151

// Column configuration page (4017)
#define IDC_COLUMN_PREVIEW          4033
#define IDC_COLUMN_FIELDS           4034
#define IDC_COLUMN_VALUES           4035
#define IDC_COLUMN_LBL_FIELD        4091
#define IDC_COLUMN_LBL_VALUE        4092
#define IDC_COLUMN_INSTRUCTION      4093

// Delimited text output page (4023)
#define IDC_OUTVAR_PREVIEW          4048
#define IDC_OUTVAR_REFRESH          4049
#define IDC_OUTVAR_DELIMITER        4050
#define IDC_OUTVAR_ESCAPE           4051
#define IDC_OUTVAR_CHARSET          4052
#define IDC_OUTVAR_ENCLOSER         4053
#define IDC_OUTVAR_ALWAYS_ENCLOSE   4054
#define IDC_OUTVAR_NAMES_FIRST      4055
#define IDC_OUTVAR_LBL_DELIMITER    4108
#define IDC_OUTVAR_LBL_ENCLOSER     4109
#define IDC_OUTVAR_LBL_ESCAPE       4110
#define IDC_OUTVAR_LBL_CHARSET      4111

// Fixed-length text output page (4024)
#define IDC_OUTFIX_LIST             4056
#define IDC_OUTFIX_RECLEN           4057
#define IDC_OUTFIX_FIELDLEN         4059
#define IDC_OUTFIX_APPLY            4061
#define IDC_OUTFIX_CRLF             4062
#define IDC_OUTFIX_CHARSET          4064
#define IDC_OUTFIX_INSTRUCTION      4104
#define IDC_OUTFIX_LBL_CHARSET      4105
#define IDC_OUTFIX_LBL_RECLEN       4106
#define IDC_OUTFIX_LBL_FIELDLEN     4107

// Small dialogs: information view (4008), input dialog (4029), hint (4034),
// "open with" (189)
#define IDC_INFO_TEXT               4011
#define IDC_INPUT_VALUE             4077
#define IDC_INPUT_PROMPT            4078
#define IDC_HINT_DONT_SHOW          4114
#define IDC_HINT_TEXT               4115
#define IDC_OPEN_FILE               4112
#define IDC_OPEN_DEFAULT            4113
#define IDC_OPEN_NOTEPAD            1074
#define IDC_OPEN_OTHER              1011
#define IDC_OPEN_PROGRAM            1145
#define IDC_OPEN_BROWSE             1146

// Record repair dialogs: repair (4043) and one-line correction (4044)
#define IDD_REPAIR_RECORD           4043
#define IDD_CORRECT_REPAIR          4044
#define IDC_REPAIR_CORRECTION       4120
#define IDC_REPAIR_DATA             4121
#define IDC_REPAIR_IGNORE           4124
#define IDC_REPAIR_SPIN             4160

// The column-mapping dialogs and pages, one header per group
#include "ids_outputsource.h"
#include "ids_functions.h"
#include "ids_multicolumn.h"
// Pages and controls of the fixed-length, dBase and file-database filters
#include "ids_textfix.h"
#include "ids_dbinput.h"
#include "ids_dboutput.h"
#include "ids_directory.h"

// Resource ids of the sample program. They stay clear of the library's
// (strings 1-43 and 362, dialogs 189 and 4006-4044).
#pragma once

#define IDR_MAINFRAME        128
#define IDD_MAIN             130
#define IDD_COLUMNS          131
#define IDD_ODBC_INPUT       132

#define IDC_PROJECT          1000
#define IDC_INPUT_FILE       1001
#define IDC_OUTPUT_FILE      1003
#define IDC_CONVERT          1005
#define IDC_STATUS           1006
#define IDC_INPUT_TABLE      1008
#define IDC_INPUT_BROWSE     1011
#define IDC_OUTPUT_BROWSE    1012
#define IDC_OUTPUT_FORMAT    1013
#define IDC_INPUT_PAGE       1014
#define IDC_OUTPUT_PAGE      1015
#define IDC_INPUT_GROUP      1016
#define IDC_OUTPUT_GROUP     1017
#define IDC_PROGRESS         1018
#define IDC_ABORT            1019
#define IDC_COLUMNS          1020
#define IDC_COMPOSE_PAGE     1021
#define IDC_SELECT_PAGE      1022
#define IDC_PROJECT_BROWSE   1023
#define IDC_INPUT_KIND       1024
#define IDC_INPUT_FILE_LABEL 1025
#define IDC_OUTPUT_FILE_LABEL 1026
#define IDC_INPUT_TABLE_LABEL 1027
#define IDC_ODBC_TEXT        1028
#define IDC_ODBC_PREVIEW     1029

#define IDS_APP_TITLE        5000
#define IDS_DONE             5001
#define IDS_NO_PROJECT       5002
#define IDS_NO_FOLDER        5003
#define IDS_CANNOT_READ      5004
#define IDS_BAD_PROJECT      5005

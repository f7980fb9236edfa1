// Resource ids of the dBase and file-database input pages (4011, 4012).
#pragma once

// dBase input page (4011)
#define IDD_INPUT_DBASE             4011
#define IDC_DBASE_PREVIEW           4021
#define IDC_DBASE_TEXT              4079
#define IDC_DBASE_CHARSET           4161
#define IDC_DBASE_LBL_CHARSET       4162
#define IDC_DBASE_CHARSET_HINT      4164
// File-database input page (4012)
#define IDD_INPUT_DAO               4012
#define IDC_DAO_PREVIEW             4022
#define IDC_DAO_TABLES              4030
#define IDC_DAO_LBL_TABLES          4080
// Icons of the table list: a table, a query, a workbook's sheet or range
#define IDI_DAO_TABLE               4015
#define IDI_DAO_QUERY               4016
#define IDI_DAO_WORKBOOK            4022
// Messages of the dBase and file-database input pages
#define IDS_PREVIEW_UNREADABLE      4170
#define IDS_DAO_NOT_OPEN            4171

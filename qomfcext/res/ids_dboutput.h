// Resource ids of the dBase and file-database output pages (4025, 4028).
#pragma once

#define IDD_OUTPUT_DAO              4025
#define IDD_OUTPUT_DBASE            4028

// File-database output page (4025)
#define IDC_OUTDAO_TABLE            4065
#define IDC_OUTDAO_LIST             4066
#define IDC_OUTDAO_TYPE             4067
#define IDC_OUTDAO_FIELDLEN         4068
#define IDC_OUTDAO_INDEXED          4069
#define IDC_OUTDAO_APPLY            4070
#define IDC_OUTDAO_LBL_TABLE        4095
#define IDC_OUTDAO_INSTRUCTION      4096
#define IDC_OUTDAO_INSTRUCTION2     4097
#define IDC_OUTDAO_LBL_TYPE         4098
#define IDC_OUTDAO_LBL_FIELDLEN     4099

// dBase output page (4028)
#define IDC_OUTDBF_LIST             4073
#define IDC_OUTDBF_APPLY            4074
#define IDC_OUTDBF_TYPE             4075
#define IDC_OUTDBF_FIELDLEN         4076
#define IDC_OUTDBF_INSTRUCTION      4100
#define IDC_OUTDBF_INSTRUCTION2     4101
#define IDC_OUTDBF_LBL_TYPE         4102
#define IDC_OUTDBF_LBL_FIELDLEN     4103

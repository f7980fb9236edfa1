// Resource ids of the fixed-length text input page (4009) and the text-format control.
#pragma once

#define IDD_INPUT_TEXTFIX           4009

#define IDC_TEXTFIX_VIEW            4012
#define IDC_TEXTFIX_RECORD_LEN      4013
#define IDC_TEXTFIX_APPLY           4014
#define IDC_TEXTFIX_CHARSET         4020
#define IDC_TEXTFIX_INSTRUCTION     4081
#define IDC_TEXTFIX_LBL_RECORD_LEN  4082
#define IDC_TEXTFIX_LBL_CHARSET     4083
#define IDC_TEXTFIX_SPIN            4090
#define IDC_TEXTFIX_FIRST_NAMES     4129

#define IDS_TEXTFIX_RECORD_TOO_LONG 4175
#define IDS_TEXTFIX_APPLY_FAILED    4176

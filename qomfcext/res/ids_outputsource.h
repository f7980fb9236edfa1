// Resource ids of the output source page (4030) and the separator prompt (4041).
#pragma once

// Output source page: the output columns as a check list
#define IDD_OUTPUT_SOURCE           4030
#define IDC_OUTSOURCE_COLUMNS       4094

// Separator prompt of a combination's further part
#define IDD_PREFIX                  4041
#define IDC_PREFIX_SEPARATOR        4147
#define IDC_PREFIX_ALWAYS           4148

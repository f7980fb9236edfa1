#pragma once
#define IDD_SINGLE_DIALOG 100

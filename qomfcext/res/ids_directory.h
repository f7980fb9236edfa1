// Resource ids of the directory chooser (4006).
#pragma once

#define IDD_DIRECTORY_CHOOSER       4006
#define IDC_DIRECTORY_TREE          4000
#define IDC_DIRECTORY_TEXT          4001

// Icons of the directory tree, in the order of its image list.
#define IDI_DRIVE_REMOVABLE         4002
#define IDI_DRIVE_FIXED             4003
#define IDI_DRIVE_CDROM             4001
#define IDI_DRIVE_REMOTE            4004
#define IDI_FOLDER                  4005

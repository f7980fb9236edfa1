// CQoInterActive: the points at which the base library may need the user.
//
// The library itself has no user interface. The host application says here
// whether it runs in batch mode (`SetQuiet`) and installs the dialogs through
// which a defective record is repaired: the record-repair dialog (defective data
// in, take over / skip / stop out) and the one-line correction of a record that
// still does not fit. The text filters call `RepairRecord` and `CorrectRepair`;
// without an installed hook they get a "no dialog" answer and decide themselves.
//
// The settings are process-wide and unlocked: set them on the user-interface
// thread before any filter runs.
#pragma once

#include "QoToolsApi.h"

class CQoString;

class QOTOOLS_API CQoInterActive {
public:
    // One-line correction: gets the record, returns 1 with the corrected
    // record in its argument, or 0 to give up (record unchanged).
    typedef int (*CorrectRepairFunc)(CQoString &record);

    // Record repair. `file` names the file being read (for the dialog's
    // text; a host may ignore it). `data` holds the defective record followed
    // by the data after it; `pos` is where the next correct record presumably
    // starts. The answer is one of `repairResult`; on repairTakeOver the hook
    // leaves the corrected record in `data`, and on repairTakeOver and
    // repairSkip the position where the next record starts in `pos`.
    typedef int (*RepairRecordFunc)(CQoString const &file, CQoString &data, int &pos);

    enum repairResult {
        repairNoHandler = -1, // no dialog installed: the caller decides
        repairStop = 0,       // stop reading the file
        repairTakeOver = 1,   // take the corrected record over
        repairSkip = 2        // skip the defective record
    };

    // Batch mode of the base library: false at start.
    static bool IsQuiet();
    static void SetQuiet(bool quiet);

    // Installs (or with null removes) the one-line correction.
    static void SetCorrectRepair(CorrectRepairFunc func);
    static CorrectRepairFunc GetCorrectRepair();
    // Calls the installed correction; 0 when none is installed.
    static int CorrectRepair(CQoString &record);

    // Installs (or with null removes) the record-repair dialog.
    static void SetRepairRecord(RepairRecordFunc func);
    static RepairRecordFunc GetRepairRecord();
    // Calls the installed repair dialog; repairNoHandler when none is installed.
    // The dialogs are asked in batch mode too: repairing needs the user.
    static int RepairRecord(CQoString const &file, CQoString &data, int &pos);

    CQoInterActive() = delete;
};

// qoconvert_run.dll - the conversion module of the sample program. It converts
// one project folder as its qoconvert.ini says, on whatever thread calls it:
// qoconvert.exe runs it on an executer thread (CExecuter in library mode), so
// that its window stays live, and in batch mode the same way without a window.
//
//     QoMain(argc, argv), argv[0] the module's own path, then
//         <project folder> [/batch] [/progress=<window>] [/cancel=<event name>]
//
// /batch       no window: message boxes answer with their preset, refusals go
//              to the console as well, and a defective input record is skipped
//              and logged instead of asking the record-repair dialog (the hook
//              the host installed is put aside for the run and back after it).
//              Without /batch a defective record goes to the hook the host
//              installed (CRepairRecordDlgDoIt: a modal dialog without parent,
//              on the calling thread); without a hook it ends the run.
// /progress=   a window handle (decimal, or hexadecimal with 0x) that is posted
//              WM_QOCONVERT_START once before the first record and
//              WM_QOCONVERT_PROGRESS at most 20 times a second and once at the
//              end.
// /cancel=     the name of an event (made by the caller); once it is set the
//              run stops between two records. The output is written beside
//              its target and put in place only when complete, so a cancelled
//              run leaves the previous output file as it was.
//
// Everything the run does goes into the project's log qoconvert.log: each
// defective record with its place, why and how it begins, and the result.
#pragma once

#include <windows.h>

// Result codes of QoMain (the process exit code of qoconvert.exe /batch).
// The executer's own codes -1 (module not loaded) and -2 (no entry QoMain)
// are never returned by the module.
enum QoConvertResult {
    qoConvertDone = 0,        // converted; every record written
    qoConvertFailed = 1,      // not converted (project, files, a write error, reading
                              // stopped in the repair dialog); the log says why
    qoConvertCancelled = 2,   // stopped through the cancel event; output untouched
    qoConvertSkipped = 3,     // converted, but defective records were left out
                              // (each is named in the log)
    qoConvertUsage = 4        // the arguments are not understood
};

// WM_QOCONVERT_START: lParam the input's size in bytes (-1: not a file).
#define WM_QOCONVERT_START    (WM_APP + 0x40)
// WM_QOCONVERT_PROGRESS: wParam the records written so far, lParam the byte
// offset of the input's current record (-1: not a file).
#define WM_QOCONVERT_PROGRESS (WM_APP + 0x41)

extern "C" __declspec(dllexport) int QoMain(int argc, char** argv);

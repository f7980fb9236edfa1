// Runs the conversion module the way the program's window does: on a thread of
// its own, with a window for its progress messages and a named event that
// stops it. The event is set when the first progress message arrives.
//
//     qoconvert_cancel <module> <project folder>
//
// Prints each progress message and the result; the exit code is the module's
// result, or 10 when the progress messages were wrong (none, records going
// back, a position outside the input).
#include <windows.h>

#include <cstdio>

#include "../conversion/QoConvertRun.h"

namespace {
const UINT kDone = WM_APP + 0x99;

struct Job {
    char* argv[5];
    HWND window;
};

DWORD WINAPI RunModule(void* param)
{
    Job* job = static_cast<Job*>(param);
    int result = 99;
    HMODULE module = LoadLibraryA(job->argv[0]);
    if (module != NULL) {
        typedef int (*Entry)(int, char**);
        Entry entry = (Entry)GetProcAddress(module, "QoMain");
        if (entry != NULL)
            result = entry(5, job->argv);
        FreeLibrary(module);
    }
    PostMessageA(job->window, kDone, (WPARAM)result, 0);
    return 0;
}
}

int main(int argc, char** argv)
{
    if (argc != 3) {
        std::fprintf(stderr, "usage: qoconvert_cancel <module> <project folder>\n");
        return 20;
    }
    HWND window = CreateWindowExA(0, "STATIC", "", 0, 0, 0, 0, 0, HWND_MESSAGE, NULL, NULL, NULL);
    char eventName[64];
    std::snprintf(eventName, sizeof eventName, "qoconvert-test-cancel-%lu", GetCurrentProcessId());
    HANDLE cancel = CreateEventA(NULL, TRUE, FALSE, eventName);
    char progressArg[64], cancelArg[96], batch[] = "/batch";
    std::snprintf(progressArg, sizeof progressArg, "/progress=%llu", (unsigned long long)(UINT_PTR)window);
    std::snprintf(cancelArg, sizeof cancelArg, "/cancel=%s", eventName);
    Job job = {{argv[1], argv[2], batch, progressArg, cancelArg}, window};
    HANDLE thread = CreateThread(NULL, 0, RunModule, &job, 0, NULL);

    long long size = -2;
    unsigned long lastRecords = 0;
    int messages = 0;
    bool wrong = false;
    int result = -100;
    MSG msg;
    while (result == -100 && GetMessageA(&msg, NULL, 0, 0) > 0) {
        if (msg.message == WM_QOCONVERT_START) {
            size = (long long)msg.lParam;
            std::printf("start size %lld\n", size);
        } else if (msg.message == WM_QOCONVERT_PROGRESS) {
            unsigned long records = (unsigned long)msg.wParam;
            long long position = (long long)msg.lParam;
            std::printf("progress records %lu position %lld\n", records, position);
            if (records < lastRecords || position < 0 || position > size)
                wrong = true;
            lastRecords = records;
            if (++messages == 1)
                SetEvent(cancel);
        } else if (msg.message == kDone) {
            result = (int)msg.wParam;
        } else {
            DispatchMessageA(&msg);
        }
    }
    WaitForSingleObject(thread, INFINITE);
    std::printf("result %d after %d progress messages\n", result, messages);
    if (messages == 0 || wrong || size <= 0)
        return 10;
    return result;
}

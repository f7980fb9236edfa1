// The delimited text page on large files: how long from opening the file until
// the page with its preview has painted for the first time, how long a jump
// to the preview's last row (the preview shows the file's first rows only)
// takes until that row is painted, and how long AbsoluteRow takes to the
// file's own last row once its rows are counted; beside the file's size, the
// CPU time of the runs and the process's memory before and after.
// Run by bench/preview/run.sh.
//
//   bench_preview.exe <folder> [rows ...]        (default: 1000000 10000000)
//
// The files (<folder>\preview_<rows>.csv, five fields a row) are made when they
// are missing or of another size, and kept for the next run.
#include <afxwin.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "CInputFilterConfigTextVar.h"
#include "CQoException.h"
#include "CQoInputFilterTextVar.h"
#include "BenchMeasure.h"

CWinApp theApp;

namespace {

// Milliseconds on the monotonic clock.
double Now()
{
    return 1000.0 * qobench::WallSeconds();
}

// One row: "<n>;Name <n>;Straße <n % 997>;<5-digit code>;<n * 7 % 100000>,<cents>".
std::string Row(long long n)
{
    char line[128];
    int len = std::snprintf(line, sizeof(line), "%lld;Name %lld;Stra\xDF" "e %lld;%05lld;%lld,%02lld\r\n", n, n,
                            n % 997, (n * 31) % 100000, (n * 7) % 100000, n % 100);
    return std::string(line, static_cast<size_t>(len));
}

long long FileSize(const std::string& path)
{
    WIN32_FILE_ATTRIBUTE_DATA data;
    if (!GetFileAttributesExA(path.c_str(), GetFileExInfoStandard, &data)) return -1;
    return (static_cast<long long>(data.nFileSizeHigh) << 32) | data.nFileSizeLow;
}

// Makes the file unless one of the expected size is there.
std::string MakeFile(const std::string& folder, long long rows)
{
    const std::string path = folder + "\\preview_" + std::to_string(rows) + ".csv";
    long long expected = 0;
    for (long long n = 0; n < rows; ++n) expected += static_cast<long long>(Row(n).size());
    if (FileSize(path) == expected) return path;
    FILE* f = std::fopen(path.c_str(), "wb");
    if (f == NULL) {
        std::fprintf(stderr, "cannot write %s\n", path.c_str());
        std::exit(1);
    }
    std::vector<char> buffer;
    buffer.reserve(1 << 20);
    for (long long n = 0; n < rows; ++n) {
        const std::string line = Row(n);
        buffer.insert(buffer.end(), line.begin(), line.end());
        if (buffer.size() > (1 << 20) - 128) {
            std::fwrite(buffer.data(), 1, buffer.size(), f);
            buffer.clear();
        }
    }
    std::fwrite(buffer.data(), 1, buffer.size(), f);
    std::fclose(f);
    return path;
}

void Pump()
{
    MSG msg;
    while (PeekMessageA(&msg, NULL, 0, 0, PM_REMOVE)) {
        TranslateMessage(&msg);
        DispatchMessageA(&msg);
    }
}

struct Figures {
    double open, create, paint, total, update, jump, read;
    bool lastShown;
};

Figures MeasureOnce(CFrameWnd* pFrame, const std::string& path)
{
    Figures f;
    // (a) the file opened, the page created on it and painted with its preview
    const double t0 = Now();
    CQoInputFilterTextVar filter;
    filter.Init(path.c_str());
    const double tOpened = Now();
    CInputFilterConfigTextVar page(&filter, 1);
    page.Create(pFrame);
    page.ShowWindow(SW_SHOW);
    const double tCreated = Now();
    page.UpdateWindow();
    page.m_preview.UpdateWindow();
    const double tPainted = Now();
    f.open = tOpened - t0;
    f.create = tCreated - tOpened;
    f.paint = tPainted - tCreated;
    f.total = tPainted - t0;

    // The preview's own part of the creation: what depends on the file.
    const double tUpdate = Now();
    page.m_preview.Update();
    f.update = Now() - tUpdate;

    // The filter's part of it: a fresh filter standing on the preview's last row.
    {
        CQoInputFilterTextVar fresh;
        fresh.Init(path.c_str());
        const double tRead = Now();
        fresh.AbsoluteRow(999);
        f.read = Now() - tRead;
    }

    // (b) to the last row of the preview, until it is painted
    const int last = page.m_preview.GetItemCount() - 1;
    const double t1 = Now();
    page.m_preview.EnsureVisible(last, FALSE);
    page.m_preview.UpdateWindow();
    f.jump = Now() - t1;
    f.lastShown = page.m_preview.GetTopIndex() + page.m_preview.GetCountPerPage() > last;
    page.DestroyWindow();
    Pump();
    return f;
}

double Median(std::vector<double> v)
{
    std::sort(v.begin(), v.end());
    return v[v.size() / 2];
}

void Measure(CFrameWnd* pFrame, const std::string& path, int runs)
{
    const qobench::Memory before = qobench::ReadMemory();
    const qobench::Stopwatch watch;
    std::vector<double> open, create, paint, total, update, jump, read;
    bool lastShown = true;
    for (int i = 0; i < runs; ++i) {
        const Figures f = MeasureOnce(pFrame, path);
        open.push_back(f.open);
        create.push_back(f.create);
        paint.push_back(f.paint);
        total.push_back(f.total);
        update.push_back(f.update);
        jump.push_back(f.jump);
        read.push_back(f.read);
        lastShown = lastShown && f.lastShown;
    }
    const double cpu = watch.Cpu(), wall = watch.Wall();
    const qobench::Memory after = qobench::ReadMemory();
    std::printf("%s: %.1f MiB, median of %d runs (the %d runs: %.2f s, CPU %.2f s)\n", path.c_str(),
                qobench::MiB(FileSize(path)), runs, runs, wall, cpu);
    std::printf("  (a) open+create+first paint %.1f ms (open %.1f, page created %.1f, painted %.1f; "
                "preview Update alone %.1f, of it reading rows 0-999 %.1f); best %.1f\n",
                Median(total), Median(open), Median(create), Median(paint), Median(update), Median(read),
                *std::min_element(total.begin(), total.end()));
    std::printf("  (b) jump to the preview's last row (it shows the file's first rows only) until painted %.1f ms; "
                "best %.1f; that row shown: %s\n",
                Median(jump), *std::min_element(jump.begin(), jump.end()), lastShown ? "yes" : "no");
    std::printf("  memory: working set %.1f -> %.1f MiB, private %.1f -> %.1f MiB\n", qobench::MiB(before.resident),
                qobench::MiB(after.resident), qobench::MiB(before.committed), qobench::MiB(after.committed));
    // What the preview avoids: counting every row of the file.
    CQoInputFilterTextVar counted;
    counted.Init(path.c_str());
    const double tCount = Now();
    const long rows = counted.NumRows();
    std::printf("  for comparison, NumRows() of the whole file: %ld rows in %.0f ms\n", rows, Now() - tCount);
    // The file's own last row, reached by number once the rows are counted.
    if (rows > 0) {
        CQoString value;
        const double tJump = Now();
        const bool found = counted.AbsoluteRow(rows - 1);
        counted.Value(0, value);
        std::printf("  (c) jump to the file's last row through AbsoluteRow(%ld) after the count: %.3f ms (%s '%s')\n",
                    rows - 1, Now() - tJump, found ? "found," : "NOT found,", value.GetString());
    }
    std::fflush(stdout);
}

}  // namespace

int main(int argc, char** argv)
{
    if (!AfxWinInit(GetModuleHandle(NULL), NULL, GetCommandLineA(), SW_SHOW)) return 1;
    if (argc < 2) {
        std::fprintf(stderr, "usage: bench_preview <folder> [rows ...]\n");
        return 2;
    }
    const std::string folder = argv[1];
    std::vector<long long> sizes;
    for (int i = 2; i < argc; ++i) sizes.push_back(qobench::CountArgument(argc, argv, i, 0, 100000000));
    if (sizes.empty()) sizes = {1000000, 10000000};

    CFrameWnd* pFrame = new CFrameWnd;
    pFrame->CreateEx(0, AfxRegisterWndClass(0, NULL, (HBRUSH)(COLOR_BTNFACE + 1)), "Vorschau",
                     WS_OVERLAPPEDWINDOW | WS_VISIBLE, 0, 0, 720, 520, NULL, NULL);
    pFrame->UpdateWindow();
    Pump();
    try {
        std::vector<std::string> files;
        for (long long rows : sizes) files.push_back(MakeFile(folder, rows));
        // One run to warm up the window classes and fonts, then the measured runs.
        MeasureOnce(pFrame, files.front());
        for (const std::string& file : files) Measure(pFrame, file, 7);
    } catch (const CQoException& e) {
        std::fprintf(stderr, "%s\n", e.Message());
        return 1;
    }
    pFrame->DestroyWindow();
    qobench::PrintPeakMemory("every file");
    return 0;
}

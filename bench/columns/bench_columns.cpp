// The output pages that set the columns one by one (fixed-length text, file
// database, dBase) over a source of many columns: how long the page takes to
// take the source's columns (RefreshDisplay, which keeps the settings of every
// column whose name stays) and to hand them to its filter (UpdateOutputFilter),
// beside the process's CPU time. Run by bench/columns/run.sh.
//
//   bench_columns.exe [columns ...]        (default: 1000 10000)
#include <afxwin.h>

#include <cstdio>
#include <memory>
#include <vector>

#include "BenchMeasure.h"
#include "COutputFilterConfigDao.h"
#include "COutputFilterConfigDbase.h"
#include "COutputFilterConfigTextFix.h"
#include "CQoOutputFilterDbase.h"
#include "CQoOutputFilterTextFix.h"
#include "CQoOutputFilterDao.h"
#include "CQoOutputSource.h"

CWinApp theApp;

namespace {

// A source of `columns` columns named "Spalte <n>" and no rows.
class WideSource : public CQoOutputSource
{
public:
    explicit WideSource(int columns) : m_columns(columns) {}
    int GetNumColumns() override { return m_columns; }
    long GetNumRows() override { return 0; }
    void GetValue(long, int, CQoString& value) override { value.Empty(); }
    void GetColumnName(int col, CQoString& name) override { name.Format("Spalte %d", col + 1); }

private:
    int m_columns;
};

void Pump()
{
    MSG msg;
    while (PeekMessageA(&msg, NULL, 0, 0, PM_REMOVE)) {
        TranslateMessage(&msg);
        DispatchMessageA(&msg);
    }
}

template <class Page>
void Measure(const char* name, CFrameWnd* frame, CQoOutputFilter& filter, int columns)
{
    WideSource source(columns);
    Page page(1, frame);
    page.SetSourceAndFilter(&source, &filter);
    page.Create(frame);
    Pump();
    qobench::Stopwatch first;
    page.RefreshDisplay();   // every column new
    const double firstWall = first.Wall(), firstCpu = first.Cpu();
    qobench::Stopwatch again;
    page.RefreshDisplay();   // every column kept by its name
    const double againWall = again.Wall(), againCpu = again.Cpu();
    qobench::Stopwatch write;
    page.UpdateOutputFilter(1);
    const double writeWall = write.Wall();
    Pump();
    std::printf("%-26s %6d columns: refresh %8.1f ms (cpu %7.1f), again %8.1f ms (cpu %7.1f), to the filter %7.1f ms\n",
                name, columns, 1000 * firstWall, 1000 * firstCpu, 1000 * againWall, 1000 * againCpu,
                1000 * writeWall);
    page.DestroyWindow();
}

}  // namespace

int main(int argc, char** argv)
{
    if (!AfxWinInit(GetModuleHandle(NULL), NULL, GetCommandLineA(), SW_SHOW))
        return 1;
    std::vector<int> counts;
    for (int i = 1; i < argc; ++i)
        counts.push_back(static_cast<int>(qobench::CountArgument(argc, argv, i, 1, 10000)));
    if (counts.empty())
        counts = {1000, 10000};
    CFrameWnd* frame = new CFrameWnd;
    frame->CreateEx(0, AfxRegisterWndClass(0, NULL, (HBRUSH)(COLOR_BTNFACE + 1)), "Spalten",
                    WS_OVERLAPPEDWINDOW | WS_VISIBLE, 0, 0, 720, 520, NULL, NULL);
    Pump();
    for (int columns : counts) {
        {
            CQoOutputFilterTextFix filter;
            Measure<COutputFilterConfigTextFix>("fixed-length text (4024)", frame, filter, columns);
        }
        {
            CQoOutputFilterDao filter;
            Measure<COutputFilterConfigDao>("file database (4025)", frame, filter, columns);
        }
        {
            CQoOutputFilterDbase filter;
            Measure<COutputFilterConfigDbase>("dBase (4028)", frame, filter, columns);
        }
    }
    frame->DestroyWindow();
    return 0;
}

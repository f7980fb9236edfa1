// DialogDriver.h — answers the modal dialogs and message boxes that a test opens.
//
// A modal dialog or message box blocks the thread that opens it, so a test cannot answer it
// "afterwards". Instead the test queues one script per expected dialog before it opens the first:
//
//     qotest::DialogDriver driver;                       // hooks the calling thread
//     driver.Expect([](qotest::Dialog& d) {              // the first dialog that appears
//         EXPECT_EQ("Frage", d.Title());
//         EXPECT_EQ("Weiter?", d.MessageText());
//         d.Press(IDYES);
//     });
//     int answer = MessageBoxA(nullptr, "Weiter?", "Frage", MB_YESNO);
//     EXPECT_EQ(IDYES, answer);
//     EXPECT_TRUE(driver.Done());                        // every queued script ran
//     EXPECT_EQ(0, driver.Unanswered());                 // none had to be closed by force
//
// A thread CBT hook sees each top-level dialog ("#32770") activate; a timer on the dialog, run by
// its own modal loop once it is initialised, then runs the next queued script on the test thread,
// so EXPECT_* work there (ASSERT_* only leaves the lambda). Press posts WM_COMMAND as a click does;
// a script that must see the reaction pumps with WaitFor/PumpFor, and a nested dialog opening then
// gets the next script. A dialog still open some time after its script, or one without a script,
// is closed (IDCANCEL, WM_CLOSE, EndDialog), counted in Unanswered() and, unless switched off,
// fails the test; so do scripts still queued at the end. A dialog disabled under a nested box is
// left alone until the box has gone.
#pragma once

#include <windows.h>

#include <deque>
#include <functional>
#include <string>
#include <vector>

namespace qotest {

// Pumps the calling thread's messages for about `ms` milliseconds. A WM_QUIT ends the pumping and
// is posted again for the loop that owns it. PumpWith hands each message to `pre` first (if given)
// and dispatches it only when `pre` answers false.
void PumpWith(DWORD ms, BOOL (*pre)(MSG*));
inline void PumpFor(DWORD ms) { PumpWith(ms, nullptr); }

// Pumps messages until `done()` is true or `ms` milliseconds have passed; answers `done()`.
bool WaitFor(const std::function<bool()>& done, DWORD ms);

// The window's text (empty for no window).
std::string WindowText(HWND hwnd);

namespace detail {
// Runs a driver's script; an exception from it fails the test (if `report`) naming `what`.
void RunGuarded(const std::function<void()>& script, bool report, const std::string& what);
}

// The icon that a message box shows.
enum class IconKind { None, Information, Warning, Error, Question, Other };

// A live dialog or message box handed to a script. Non-owning; valid while the script runs.
// Every action on a missing or disabled control is a test failure (gtest ADD_FAILURE) naming the
// dialog and the control, and answers false.
class Dialog {
public:
    explicit Dialog(HWND hwnd) : m_hwnd(hwnd) {}

    // Reading
    HWND Hwnd() const { return m_hwnd; }
    HWND Item(int id) const { return GetDlgItem(m_hwnd, id); }
    std::string Title() const;
    std::string Text(int id) const;        // window text of a control (empty if missing)
    std::string MessageText() const;       // the text of a message box (control 0xFFFF)
    bool Exists(int id) const { return Item(id) != nullptr; }
    bool IsVisible(int id) const;
    bool IsEnabled(int id) const;
    bool IsChecked(int id) const;          // BM_GETCHECK == BST_CHECKED
    int Selection(int comboOrListId) const;  // current selection index, -1 if none
    std::vector<std::string> ListItems(int id) const;
    std::string ClassName(int id) const;
    std::vector<int> ButtonIds() const;    // visible push buttons of a message box (IDOK, IDYES, ...)
    IconKind Icon() const;                 // icon of a message box

    // Acting as a user would
    // Replaces the text of an edit (or of a combo box's edit) as typing does, so the control
    // notifies its parent itself; other controls get WM_SETTEXT.
    bool SetText(int id, const std::string& text);
    // Gives the control the focus and sends one WM_CHAR per character, at the caret.
    bool Type(int id, const std::string& text);
    // Clicks a check box or radio button (BM_CLICK) until its state is `checked`.
    bool Check(int id, bool checked = true);
    // Selects entry `index` and notifies the parent with CBN_SELCHANGE / LBN_SELCHANGE (the latter
    // only with LBS_NOTIFY, as the list box itself does).
    bool Select(int comboOrListId, int index);
    bool SelectText(int comboOrListId, const std::string& text);  // by exact item text
    // Posts WM_COMMAND(id, BN_CLICKED) as a click on the button does (IDYES etc. for a message box).
    bool Press(int buttonId);
    // Posts WM_COMMAND(IDCANCEL) as the Escape key does, whether or not a Cancel button exists.
    void Cancel();
    LRESULT Send(int id, UINT msg, WPARAM wp = 0, LPARAM lp = 0) const;

private:
    HWND Control(int id, const char* action, bool mustBeEnabled) const;

    HWND m_hwnd;
};

using DialogScript = std::function<void(Dialog&)>;

// Runs queued scripts on the modal dialogs that appear on the thread that constructed it.
// One driver per thread at a time; not copyable.
class DialogDriver {
public:
    DialogDriver();
    ~DialogDriver();
    DialogDriver(const DialogDriver&) = delete;
    DialogDriver& operator=(const DialogDriver&) = delete;

    // Queues the script for the next dialog that appears (after the ones already queued).
    void Expect(DialogScript script);

    // How long a dialog may stay open after its script before the driver closes it (default 3000 ms).
    void SetTimeout(UINT ms) { m_timeout = ms; }
    // Whether unanswered dialogs and throwing scripts fail the running test (default true).
    void SetReportFailures(bool report) { m_reportFailures = report; }

    bool Done() const { return m_queue.empty() && m_running == 0; }  // every script ran
    int Seen() const { return m_seen; }
    int Unanswered() const { return m_unanswered; }

private:
    struct Watch {
        HWND hwnd;
        bool scripted;   // a script ran (or is running) for it
        int stage;       // how far the forced closing has gone
    };
    static LRESULT CALLBACK CbtProc(int code, WPARAM wp, LPARAM lp);
    static void CALLBACK TimerProc(HWND hwnd, UINT msg, UINT_PTR id, DWORD time);
    void OnActivate(HWND hwnd);
    void OnDestroy(HWND hwnd);
    void RunScript(HWND hwnd);
    void CheckClosed(HWND hwnd);
    Watch* Find(HWND hwnd);

    HHOOK m_hook = nullptr;
    DialogDriver* m_previous = nullptr;
    std::deque<DialogScript> m_queue;
    std::vector<Watch> m_watch;
    UINT m_delay = 80, m_timeout = 3000;
    int m_running = 0, m_seen = 0, m_unanswered = 0;
    bool m_reportFailures = true;
};

}  // namespace qotest

// Answers the dialogs and message boxes that the code under test opens on the
// calling thread: each step runs once on the next dialog (class #32770) that
// becomes the enabled, visible dialog of the thread. A thread timer drives it,
// so it works inside any modal loop that dispatches messages.
#pragma once

#include <windows.h>

#include <functional>
#include <string>
#include <vector>

class CDialogScript {
public:
  using Step = std::function<void(HWND hDlg)>;

  CDialogScript();
  ~CDialogScript();

  CDialogScript& Then(Step step);
  // Reads a message box's text and caption into Boxes() and presses nButton.
  CDialogScript& AnswerBox(int nButton);

  bool Done() const { return m_steps.empty(); }
  struct Box {
    std::string text;
    std::string caption;
  };
  const std::vector<Box>& Boxes() const { return m_boxes; }

  // Helpers for steps
  static std::string ItemText(HWND hDlg, int nID);
  static void Click(HWND hDlg, int nID);

private:
  static void CALLBACK OnTimer(HWND, UINT, UINT_PTR, DWORD);
  static HWND FindDialog();

  std::vector<Step> m_steps;
  std::vector<Box> m_boxes;
  HWND m_hLast = NULL;
  bool m_bBusy = false;
  DWORD m_dwStart;
  UINT_PTR m_nTimer;
};

// Pumps the thread's messages through MFC for about nMilliseconds.
void PumpFor(DWORD nMilliseconds);

// qo_session_desktop: holds Wine's desktop open for a whole test session.
//
// Wine closes the desktop a second after the last program that used it has
// ended, and a program that connects while the desktop is closing waits many
// seconds for it. Test programs start one after the other, and the helpers
// they start connect at their first window, so without a program that stays
// connected that moment came often. tools/session starts this program when
// it has been built and ends it with the session; it makes no window.
#include <windows.h>

int WINAPI WinMain(HINSTANCE, HINSTANCE, LPSTR, int)
{
    ::GetDesktopWindow();  // connects this thread, and so the process, to the desktop
    ::Sleep(INFINITE);
    return 0;
}

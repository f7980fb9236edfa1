// CModifiedListener - what an object implements to hear that the user changed
// a configuration, and to refuse the change.
//
// A page or control that the user edits is a CModifiedNotifier; whoever must
// know of the change registers a listener with it. The listener is called with
// the modified flag (always TRUE from the library) and the id that the
// application gave the notifier, so one listener can tell several pages apart:
//
//     int CMyView::ModifiedListenerSetModified(int bModified, int nNotifierId)
//     {
//         if (nNotifierId == ID_OUTPUT_PAGE && IsRunning())
//             return 0;            // refused: the page takes its change back
//         m_bDirty = TRUE;
//         return 1;                // accepted
//     }
//
//     page.AddModifiedListener(this);     // and before this object goes:
//     page.RemoveModifiedListener(this);
//
// A listener is not unregistered by its own destructor: remove it first, or
// let it outlive every notifier that it is registered with.
#pragma once

#include "QoMfcExtApi.h"

class QOMFCEXT_API CModifiedListener
{
public:
    CModifiedListener() {}
    // Nothing to copy: the interface has no state.
    CModifiedListener(const CModifiedListener&) {}
    CModifiedListener& operator=(const CModifiedListener&) { return *this; }
    virtual ~CModifiedListener();

    // Called by a notifier; nonzero accepts the change, 0 refuses it.
    virtual int ModifiedListenerSetModified(int bModified, int nNotifierId) = 0;
};

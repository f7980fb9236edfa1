// CModifiedNotifier - tells registered listeners that the user changed a
// configuration, and collects their verdict.
//
// A page or control derives from it, passing the id that the application chose
// for it to the constructor. When the user changes something, it calls
// NotifyListeners: the listeners are called in the order of registration with
// the flag 1 and that id; the first that answers 0 stops the pass and the
// result is 0 (the change is refused; what that means is the page's business),
// otherwise the result is 1 (also when nobody listens).
//
//     class CMyPage : public CModelessDialog, public CModifiedNotifier { ... };
//     CMyPage page(ID_MY_PAGE, pParent);       // the id reaches every listener
//     page.AddModifiedListener(&view);         // once; null and repeats ignored
//     if (!NotifyListeners()) PutOldValueBack();
//
// The listeners are not owned. A listener may register or remove listeners
// while it is being told: one added during a pass is told in that pass, and
// removing one (itself included) makes no other listener miss its call; none
// is told twice in one pass.
#pragma once

#include <afxtempl.h>

#include "CModifiedListener.h"
#include "QoMfcExtApi.h"

class QOMFCEXT_API CModifiedNotifier
{
public:
    explicit CModifiedNotifier(int nNotifierId);
    virtual ~CModifiedNotifier();

    CModifiedNotifier(const CModifiedNotifier&) = delete;
    CModifiedNotifier& operator=(const CModifiedNotifier&) = delete;

    // Appends the listener; a null pointer or one already registered is ignored.
    void AddModifiedListener(CModifiedListener* pListener);
    // Takes the listener out, the others keep their order; unknown ones are ignored.
    void RemoveModifiedListener(CModifiedListener* pListener);
    // 1 when every listener accepted (or there is none), 0 at the first refusal.
    int NotifyListeners();

private:
    int Find(CModifiedListener* pListener) const;

    CArray<CModifiedListener*, CModifiedListener*> m_arrListeners;
    const int m_nNotifierId;
};

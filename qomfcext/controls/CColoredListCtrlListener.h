// CColoredListCtrlListener - told by a CColoredListCtrl that the user dragged its
// columns into a new order.
//
// The call comes from inside the list's painting, at the first row painted after
// the change, so a listener should only note the fact (post itself a command)
// and do the real work later. Register with CColoredListCtrl::AddListener and
// remove the listener before it is destroyed: the list does not own it.
#pragma once

#include "QoMfcExtApi.h"

class QOMFCEXT_API CColoredListCtrlListener
{
public:
    virtual void ColoredListCtrlOrderChanged();
};

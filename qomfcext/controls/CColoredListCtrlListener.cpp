#include <afxwin.h>

#include "CColoredListCtrlListener.h"

void CColoredListCtrlListener::ColoredListCtrlOrderChanged()
{
}

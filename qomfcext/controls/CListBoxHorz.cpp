#include "CListBoxHorz.h"

#include "QoWidenListBox.h"

IMPLEMENT_DYNAMIC(CListBoxHorz, CListBox)

BEGIN_MESSAGE_MAP(CListBoxHorz, CListBox)
END_MESSAGE_MAP()

CListBoxHorz::CListBoxHorz() : m_nWidest(0) {}

CListBoxHorz::~CListBoxHorz() {}

int CListBoxHorz::AddString(const char* lpszItem)
{
    QoWidenListBox(*this, m_nWidest, lpszItem);
    return CListBox::AddString(lpszItem);
}

int CListBoxHorz::InsertString(int nIndex, const char* lpszItem)
{
    QoWidenListBox(*this, m_nWidest, lpszItem);
    return CListBox::InsertString(nIndex, lpszItem);
}

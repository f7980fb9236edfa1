#include "CInputCharSetChoice.h"

#include "CQoFile.h"
#include "CQoInputFilter.h"

namespace {
struct Choice {
    const char* name;
    int charSet;
};
const Choice kChoices[] = {
    {"Windows Ansi", CQoFile::ansi},
    {"DOS Ascii", CQoFile::ascii},
    {"Ansi/Ascii", CQoFile::ansimix},
};
const int kCount = sizeof(kChoices) / sizeof(kChoices[0]);
}

void CInputCharSetChoice::Fill(CComboBox& combo)
{
    combo.ResetContent();
    for (int i = 0; i < kCount; ++i) combo.AddString(kChoices[i].name);
    combo.SetCurSel(0);
}

void CInputCharSetChoice::Load(int charSet, int& index)
{
    for (int i = 0; i < kCount; ++i) {
        if (kChoices[i].charSet == charSet) {
            index = i;
            return;
        }
    }
}

void CInputCharSetChoice::Save(int index, CQoInputFilter& filter)
{
    if (index >= 0 && index < kCount) filter.CharSet(kChoices[index].charSet);
}

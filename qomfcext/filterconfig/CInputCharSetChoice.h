// CInputCharSetChoice - the character-set combo box of the text input pages.
//
// The entries "Windows Ansi", "DOS Ascii" and "Ansi/Ascii" stand, by their index,
// for the base library's CQoFile::ansi, ascii and ansimix. A page fills its
// drop-down list once, exchanges the index with DDX_CBIndex and converts here:
//
//     CInputCharSetChoice::Fill(m_comboCharSet);           // OnInitDialog, entry 0 selected
//     CInputCharSetChoice::Load(filter.CharSet(), m_nCharSet); // loading the filter
//     CInputCharSetChoice::Save(m_nCharSet, filter);           // applying
#pragma once

#include <afxwin.h>

class CQoInputFilter;

class CInputCharSetChoice
{
public:
    // Empties the combo box, adds the three entries and selects the first.
    static void Fill(CComboBox& combo);
    // The index of the filter's character set; an unknown set leaves `index` as it is.
    static void Load(int charSet, int& index);
    // Gives the filter the set of the index; an index outside 0..2 changes nothing.
    static void Save(int index, CQoInputFilter& filter);
};

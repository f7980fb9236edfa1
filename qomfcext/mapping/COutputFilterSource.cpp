#include "COutputFilterSource.h"

#include <CQoString.h>

COutputFilterSource::COutputFilterSource()
    : m_bUseCapitals(false), m_bNoUmlaute(false), m_bInitialised(0)
{
}

COutputFilterSource::~COutputFilterSource() {}

// --- the output source ------------------------------------------------------

int COutputFilterSource::GetNumColumns()
{
    return NumColumns();
}

long COutputFilterSource::GetNumRows()
{
    return NumRows();
}

void COutputFilterSource::GetValue(long row, int col, CQoString& value)
{
    // Starting from empty text: a column that does not exist yields "".
    CString text;
    GetValue(row, col, text);
    value.Assign(text.GetString(), static_cast<std::size_t>(text.GetLength()));
}

void COutputFilterSource::GetColumnName(int col, CQoString& name)
{
    CString text;
    GetName(col, text, 0);
    name.Assign(text.GetString(), static_cast<std::size_t>(text.GetLength()));
}

// --- the view over the host's columns -----------------------------------------

void COutputFilterSource::Refresh() {}

void COutputFilterSource::GetValue(long row, int col, CString& value)
{
    BuildIfNeeded();
    int entry = EntryOfColumn(col);
    if (entry < 0)
        return;
    GetSourceValue(row, m_entries[entry].GetColumn(), value);
    if (m_bNoUmlaute) {
        CQoString text(value.GetString(), value.GetLength());
        text.NoUmlaute();
        value.SetString(text.GetString(), text.GetLength());
    }
    if (m_bUseCapitals)
        value.MakeUpper();
}

void COutputFilterSource::GetName(int col, CString& name, int flag)
{
    BuildIfNeeded();
    int entry = EntryOfColumn(col);
    if (entry < 0)
        return;
    // The host is asked each time; the name stored in the entry may be stale.
    GetSourceName(m_entries[entry].GetColumn(), name, flag);
}

long COutputFilterSource::NumRows()
{
    return NumSourceRows();
}

int COutputFilterSource::NumColumns()
{
    BuildIfNeeded();
    int count = 0;
    for (INT_PTR i = 0; i < m_entries.GetSize(); ++i) {
        if (m_entries[i].GetSelected())
            ++count;
    }
    return count;
}

// --- selection and order ----------------------------------------------------------

void COutputFilterSource::InitArray()
{
    m_entries.RemoveAll();
    int columns = NumSourceColumns();
    for (int i = 0; i < columns; ++i) {
        CString name;
        GetSourceName(i, name, 0);
        CEntry entry(i, name, true);
        m_entries.Add(entry);
    }
    m_bInitialised = 1;
}

// The edits build the list first as well: an edit made before the first
// read must not be lost to a later build.
void COutputFilterSource::ToFront(const CString& name)
{
    int index = SearchEntry(name);
    if (index <= 0)
        return;   // unknown, or already in front
    CEntry entry = m_entries[index];
    m_entries.RemoveAt(index);
    m_entries.InsertAt(0, entry);
}

void COutputFilterSource::SetSelected(const CString& name, bool on)
{
    int index = SearchEntry(name);
    if (index >= 0)
        m_entries[index].SetSelected(on);
}

void COutputFilterSource::SelectAll(bool on)
{
    BuildIfNeeded();
    for (INT_PTR i = 0; i < m_entries.GetSize(); ++i)
        m_entries[i].SetSelected(on);
}

int COutputFilterSource::SearchEntry(const CString& name)
{
    BuildIfNeeded();
    for (INT_PTR i = 0; i < m_entries.GetSize(); ++i) {
        if (m_entries[i].GetName() == name)
            return static_cast<int>(i);
    }
    return -1;
}

// --- direct access to the entry list ------------------------------------------------

int COutputFilterSource::GetEntryCount()
{
    BuildIfNeeded();
    return static_cast<int>(m_entries.GetSize());
}

bool COutputFilterSource::GetEntry(int index, CEntry& entry)
{
    BuildIfNeeded();
    if (index < 0 || index >= m_entries.GetSize())
        return false;
    entry = m_entries[index];
    return true;
}

void COutputFilterSource::AddEntry(const CEntry& entry)
{
    CEntry copy(entry);
    m_entries.Add(copy);
    m_bInitialised = 1;
}

bool COutputFilterSource::SetEntry(int index, const CEntry& entry)
{
    BuildIfNeeded();
    if (index < 0 || index >= m_entries.GetSize())
        return false;
    m_entries[index] = entry;
    return true;
}

void COutputFilterSource::RemoveAllEntries()
{
    m_entries.RemoveAll();
    m_bInitialised = 1;
}

// --- helpers ----------------------------------------------------------------------

void COutputFilterSource::BuildIfNeeded()
{
    if (!m_bInitialised)
        InitArray();
}

int COutputFilterSource::EntryOfColumn(int col) const
{
    if (col < 0)
        return -1;
    int seen = 0;
    for (INT_PTR i = 0; i < m_entries.GetSize(); ++i) {
        if (!m_entries[i].GetSelected())
            continue;
        if (seen == col)
            return static_cast<int>(i);
        ++seen;
    }
    return -1;
}

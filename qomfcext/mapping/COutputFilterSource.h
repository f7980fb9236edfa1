// COutputFilterSource - an output source with a user-controlled column view.
//
// An output filter writes whatever a CQoOutputSource yields. This class lays a
// column selection and order over an inner column set that the host supplies:
// the host derives from it and answers four questions about its own data
// (GetSourceValue, GetSourceName, NumSourceColumns, NumSourceRows); the
// entry list decides which inner columns reach the output, in which order,
// and every value may be given the umlaut replacement and upper case on its
// way out.
//
// Index spaces: an output column counts only the selected entries, in list
// order; an inner column is the host's own numbering 0 .. NumSourceColumns()-1.
// Row numbers go to the host unchanged.
//
// The list is built from the host's columns on first use, reading or editing
// (all selected, in inner order). When the host's column set changes, the host calls
// InitArray() itself; nothing else notices. The selection and order are not
// persisted here: a host that wants to keep them stores them itself.
#pragma once

#include <afx.h>
#include <afxtempl.h>

#include <CQoOutputSource.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API COutputFilterSource : public CQoOutputSource
{
public:
    // One inner column as the output sees it.
    class CEntry
    {
    public:
        CEntry() : m_nColumn(0), m_bSelected(true) {}
        CEntry(int column, const CString& name, bool selected)
            : m_nColumn(column), m_strName(name), m_bSelected(selected)
        {
        }

        int GetColumn() const { return m_nColumn; }
        void SetColumn(int column) { m_nColumn = column; }
        // The inner column's name as read when the list was built.
        CString GetName() const { return m_strName; }
        void SetName(const CString& name) { m_strName = name; }
        bool GetSelected() const { return m_bSelected; }
        void SetSelected(bool on) { m_bSelected = on; }

    private:
        int m_nColumn;
        CString m_strName;
        bool m_bSelected;
    };

    COutputFilterSource();
    COutputFilterSource(const COutputFilterSource&) = delete;
    COutputFilterSource& operator=(const COutputFilterSource&) = delete;
    virtual ~COutputFilterSource();

    // --- the output source, as an output filter reads it -----------------
    virtual int GetNumColumns() override;
    virtual long GetNumRows() override;
    virtual void GetValue(long row, int col, CQoString& value) override;
    virtual void GetColumnName(int col, CQoString& name) override;

    // --- virtual functions you might override ---------------------------
    // A hook for derived sources; does nothing here.
    virtual void Refresh();
    // The converted value of output column `col`; an output column that
    // does not exist leaves `value` as it was.
    virtual void GetValue(long row, int col, CString& value);
    // The host's name of output column `col` (never converted); `flag` is
    // passed to GetSourceName. No such column: `name` stays as it was.
    virtual void GetName(int col, CString& name, int flag);
    virtual long NumRows();
    // The number of selected entries.
    virtual int NumColumns();

    // --- what the host supplies -----------------------------------------------
    virtual void GetSourceValue(long row, int column, CString& value) = 0;
    virtual void GetSourceName(int column, CString& name, int flag) = 0;
    virtual int NumSourceColumns() = 0;
    virtual long NumSourceRows() = 0;

    // --- conversion switches --------------------------------------------------
    void SetUseCapitals(bool on) { m_bUseCapitals = on; }
    bool GetUseCapitals() const { return m_bUseCapitals; }
    // Umlauts are replaced before upper-casing when both are on.
    void SetNoUmlaute(bool on) { m_bNoUmlaute = on; }
    bool GetNoUmlaute() const { return m_bNoUmlaute; }

    // --- selection and order ----------------------------------------------------
    // Rebuilds the list from the host's current columns: all selected, in
    // inner order; the user's selection and order are discarded.
    void InitArray();
    // Moves the first entry of that name to the front; unknown names change
    // nothing. Names compare exactly, case included.
    void ToFront(const CString& name);
    void SetSelected(const CString& name, bool on);
    void SelectAll(bool on);

    // Direct access to the entry list, for the page on which the user edits
    // it. Reading builds the list first if it was never built; a list that
    // was written through these calls counts as built and is kept as the
    // user's until InitArray().
    int GetEntryCount();
    // Entry `index` (0 .. GetEntryCount()-1); false and `entry` untouched
    // for an index outside the list.
    bool GetEntry(int index, CEntry& entry);
    void AddEntry(const CEntry& entry);
    // Replaces entry `index`; false for an index outside the list.
    bool SetEntry(int index, const CEntry& entry);
    void RemoveAllEntries();

protected:
    // Index of the first entry of that name (exact comparison), or -1.
    int SearchEntry(const CString& name);

private:
    void BuildIfNeeded();
    // The entry of output column `col`, or -1.
    int EntryOfColumn(int col) const;

    bool m_bUseCapitals;
    bool m_bNoUmlaute;
    int m_bInitialised;
    CArray<CEntry, CEntry&> m_entries;
};

#include "QoWorkbookReader.h"

#include <afxdao.h>

#include <CQoException.h>
#include <CQoXlsxReader.h>

#include <cstring>
#include <vector>

namespace {

class CXlsxWorkbookReader : public CDaoWorkbookReader
{
public:
    void Open(LPCTSTR path) override { Guard([&] { m_reader.Open(path); }); }
    int GetSheetCount() override { return m_reader.SheetCount(); }
    CString GetSheetName(int index) override { return CString(m_reader.SheetName(index).GetString()); }
    void OpenSheet(int index) override { Guard([&] { m_reader.OpenSheet(index); }); }
    void RewindSheet() override { Guard([&] { m_reader.RewindSheet(); }); }
    int GetColumnCount() override { return m_reader.ColumnCount(); }
    BOOL NextRow() override
    {
        bool row = false;
        Guard([&] { row = m_reader.NextRow(m_row); });
        return row ? TRUE : FALSE;
    }
    void GetCell(int column, int& type, double& value, CString& text) override
    {
        if (column < 0 || column >= (int)m_row.size()) {
            type = cellEmpty;
            value = 0;
            text.Empty();
            return;
        }
        const CQoXlsxReader::Cell& cell = m_row[(size_t)column];
        type = cell.type;
        value = cell.number;
        text = cell.text.GetString();
    }

private:
    // The reader's failures as the engine's: a workbook protected by a
    // password is DAO's 3161 (the filters then tell the user how to lift
    // the protection); every other one is a file the engine cannot read,
    // with the reader's own words.
    template <typename F> static void Guard(F&& f)
    {
        try {
            f();
        } catch (const CQoException& e) {
            long code = std::strstr(e.Message(), "Kennwort") ? 3161 : 3343;
            AfxThrowDaoError(code, e.Message());
        }
    }

    CQoXlsxReader m_reader;
    std::vector<CQoXlsxReader::Cell> m_row;
};

CDaoWorkbookReader* AFXAPI MakeReader()
{
    return new CXlsxWorkbookReader;
}

} // namespace

void QoRegisterWorkbookReader()
{
    static bool registered = false;
    if (!registered) {
        AfxDaoRegisterWorkbookReader(&MakeReader);
        registered = true;
    }
}

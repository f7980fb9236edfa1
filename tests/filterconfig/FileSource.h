// The rows of a delimited input file as the host's output source, as an
// application of the family maps its input: the output page tests write what
// a real file holds.
#pragma once

#include <COutputFilterSource.h>
#include <CQoInputFilterTextVar.h>

namespace qotest {

class FileSource : public COutputFilterSource {
public:
    explicit FileSource(CQoInputFilterTextVar& in) : m_in(in) {}
    void GetSourceValue(long row, int column, CString& value) override
    {
        CQoString text;
        if (m_in.AbsoluteRow(row)) m_in.Value(column, text);
        value = text.GetString();
    }
    void GetSourceName(int column, CString& name, int) override
    {
        CQoString text;
        m_in.ColName(column, text);
        name = text.GetString();
    }
    int NumSourceColumns() override { return m_in.NumCols(); }
    long NumSourceRows() override { return m_in.NumRows(); }

private:
    CQoInputFilterTextVar& m_in;
};

}  // namespace qotest

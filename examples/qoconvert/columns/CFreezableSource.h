// CFreezableSource - a COutputFilterSource over inner columns that a derived
// class reads (ReadValue, ReadName), with a shortcut for runs: FreezeView
// takes the written columns once, and each value then goes from the inner
// columns straight into the caller's text (no text in between, no walk over
// the entries per value). Any change of the entries afterwards needs
// FreezeView again, or ThawView. Capitals and umlaut folding change the text,
// so a view with either is never frozen.
#pragma once

#include <COutputFilterSource.h>
#include <CQoString.h>

#include <vector>

class CFreezableSource : public COutputFilterSource
{
public:
    void FreezeView();
    void ThawView() { m_frozen.clear(); m_bFrozen = false; }

    void GetValue(long row, int col, CQoString& value) override;
    using COutputFilterSource::GetValue;
    void GetSourceValue(long row, int column, CString& value) override;
    void GetSourceName(int column, CString& name, int flag) override;

protected:
    // The value of inner column `column` in `row` (left empty when there is none).
    virtual void ReadValue(long row, int column, CQoString& value) = 0;
    virtual void ReadName(int column, CQoString& name) = 0;

private:
    std::vector<int> m_frozen;   // the inner column of each written column
    bool m_bFrozen = false;
};

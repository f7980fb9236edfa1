#include "CQoColumnWidths.h"

#include "CQoConfigFile.h"

namespace {
// More columns than any record layout has: a damaged configuration must not
// make the filter allocate without bound.
constexpr int kMaxColumns = 100000;
}

bool CQoColumnWidths::SetCount(int count)
{
    if (count < 0)
        count = 0;
    if (count == Count())
        return false;
    m_widths.resize(static_cast<std::size_t>(count), 1);
    return true;
}

int CQoColumnWidths::Get(int col) const
{
    return col >= 0 && col < Count() ? m_widths[static_cast<std::size_t>(col)] : 0;
}

bool CQoColumnWidths::Set(int col, int width)
{
    if (col < 0 || col >= Count())
        return false;
    if (width < 1)
        width = 1;
    int &current = m_widths[static_cast<std::size_t>(col)];
    if (current == width)
        return false;
    current = width;
    return true;
}

int CQoColumnWidths::Offset(int col) const
{
    int offset = 0;
    for (int i = 0; i < col && i < Count(); ++i)
        offset += m_widths[static_cast<std::size_t>(i)];
    return offset;
}

int CQoColumnWidths::Total() const
{
    return Offset(Count());
}

CQoString CQoColumnWidths::Description(int col) const
{
    CQoString text;
    text.Format("Spalte %d: %d Zeichen", col + 1, Get(col));
    return text;
}

void CQoColumnWidths::WriteConfig(CQoConfigFile &cfg, char const *section) const
{
    cfg.SetValue(section, "columns", Count());
    CQoString key;
    for (int i = 0; i < Count(); ++i) {
        key.Format("collen%d", i);
        cfg.SetValue(section, key, m_widths[static_cast<std::size_t>(i)]);
    }
}

bool CQoColumnWidths::ReadConfig(CQoConfigFile const &cfg, char const *section)
{
    bool changed = false;
    int count = Count();
    if (cfg.GetValue(section, "columns", count) && count >= 0 && count <= kMaxColumns)
        changed = SetCount(count);
    CQoString key;
    for (int i = 0; i < Count(); ++i) {
        key.Format("collen%d", i);
        int width = Get(i);
        if (cfg.GetValue(section, key, width) && Set(i, width))
            changed = true;
    }
    return changed;
}

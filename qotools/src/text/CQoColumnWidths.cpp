#include "CQoColumnWidths.h"

#include "CQoConfigFile.h"
#include "CQoException.h"
#include "QoLimits.h"

#include <climits>
#include <cstdio>

namespace {
CQoString WidthKey(int col)
{
    CQoString key;
    key.Format("collen%d", col);
    return key;
}
}

CQoColumnWidths::CQoColumnWidths()
    : m_offsets(1, 0)
{
}

void CQoColumnWidths::Recount()
{
    m_offsets.resize(m_widths.size() + 1);
    long long offset = 0;
    for (std::size_t i = 0; i < m_widths.size(); ++i) {
        m_offsets[i] = static_cast<int>(offset);
        offset += m_widths[i];
    }
    m_offsets[m_widths.size()] = static_cast<int>(offset);
}

void CQoColumnWidths::CheckTotal(std::vector<int> const &widths, int col)
{
    long long total = 0;
    for (int width : widths)
        total += width;
    if (total > qolimits::maxRecordLength) {
        char text[200];
        std::snprintf(text, sizeof text,
                      "Die Spalten sind zusammen %lld Zeichen breit; h\xF6" "chstens %d sind m\xF6glich",
                      total, qolimits::maxRecordLength);
        throw CQoException(CQoException::invalidArgument, text, col >= 0 ? WidthKey(col).GetString() : "columns");
    }
}

bool CQoColumnWidths::SetCount(int count)
{
    if (count < 0)
        count = 0;
    qolimits::Checked("columns", count, 0, qolimits::maxColumns);
    if (count == Count())
        return false;
    std::vector<int> widths = m_widths;
    widths.resize(static_cast<std::size_t>(count), 1);
    CheckTotal(widths, -1);
    m_widths.swap(widths);
    Recount();
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
    if (width > qolimits::maxRecordLength)
        qolimits::Checked(WidthKey(col), width, 1, qolimits::maxRecordLength);
    int &current = m_widths[static_cast<std::size_t>(col)];
    if (current == width)
        return false;
    long long total = static_cast<long long>(Total()) - current + width;
    if (total > qolimits::maxRecordLength) {
        std::vector<int> widths = m_widths;
        widths[static_cast<std::size_t>(col)] = width;
        CheckTotal(widths, col); // raises
    }
    current = width;
    Recount();
    return true;
}

int CQoColumnWidths::Offset(int col) const
{
    if (col <= 0)
        return 0;
    return m_offsets[static_cast<std::size_t>(col < Count() ? col : Count())];
}

int CQoColumnWidths::Total() const
{
    return m_offsets.back();
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
    for (int i = 0; i < Count(); ++i)
        cfg.SetValue(section, WidthKey(i), m_widths[static_cast<std::size_t>(i)]);
}

bool CQoColumnWidths::ReadConfig(CQoConfigFile const &cfg, char const *section)
{
    // Everything is checked before anything changes: a bad project leaves
    // the layout as it was.
    std::vector<int> widths = m_widths;
    int count = Count();
    if (cfg.GetValue(section, "columns", count, 0, qolimits::maxColumns))
        widths.resize(static_cast<std::size_t>(count), 1);
    for (std::size_t i = 0; i < widths.size(); ++i) {
        CQoString key = WidthKey(static_cast<int>(i));
        int width = 0;
        if (!cfg.GetValue(section, key, width, INT_MIN, INT_MAX))
            continue;
        widths[i] = width < 1 ? 1 : qolimits::Checked(key, width, 1, qolimits::maxRecordLength);
    }
    CheckTotal(widths, -1);
    if (widths == m_widths)
        return false;
    m_widths.swap(widths);
    Recount();
    return true;
}

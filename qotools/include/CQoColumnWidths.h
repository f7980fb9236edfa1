// CQoColumnWidths: the column layout of fixed-column text, one width per
// column, each at least one character.
//
// The fixed-length record filter and the fixed-column lines filter cut their
// records with it and keep it in the configuration under the same keys
// ("columns", "collen0", "collen1", ...).
#pragma once

#include "CQoString.h"
#include "QoToolsApi.h"

#include <vector>

class CQoConfigFile;

class QOTOOLS_API CQoColumnWidths {
public:
    CQoColumnWidths();

    int Count() const { return static_cast<int>(m_widths.size()); }
    std::vector<int> const &Widths() const { return m_widths; }

    // Sets the column count (below 0 counts as 0); new columns are 1 wide.
    // True when the count changed. More than qolimits::maxColumns columns, or
    // widths adding up to more than qolimits::maxRecordLength, raise
    // CQoException and change nothing.
    bool SetCount(int count);
    // Outside 0 .. Count()-1 Get answers 0 and Set does nothing; a width
    // below 1 becomes 1; a width that makes the total exceed
    // qolimits::maxRecordLength raises CQoException naming "collen<col>".
    // Set answers true when the width changed.
    int Get(int col) const;
    bool Set(int col, int width);

    // Where column `col` starts: the sum of the widths before it.
    int Offset(int col) const;
    // The sum of all widths.
    int Total() const;

    // "Spalte 3: 12 Zeichen", for the filters' descriptions (col counts from 0).
    CQoString Description(int col) const;

    void WriteConfig(CQoConfigFile &cfg, char const *section) const;
    // Reads what WriteConfig wrote; missing values keep the current layout.
    // A count or width beyond its bound raises CQoException naming the key,
    // and the layout stays as it was. True when anything changed.
    bool ReadConfig(CQoConfigFile const &cfg, char const *section);

private:
    void Recount();
    // Raises unless the widths add up to at most qolimits::maxRecordLength.
    static void CheckTotal(std::vector<int> const &widths, int col);

    std::vector<int> m_widths;
    std::vector<int> m_offsets;    // m_offsets[i]: start of column i; the last entry is the total
};

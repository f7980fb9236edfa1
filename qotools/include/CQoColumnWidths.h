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
    int Count() const { return static_cast<int>(m_widths.size()); }
    std::vector<int> const &Widths() const { return m_widths; }

    // Sets the column count (below 0 counts as 0); new columns are 1 wide.
    // True when the count changed.
    bool SetCount(int count);
    // Outside 0 .. Count()-1 Get answers 0 and Set does nothing; a width
    // below 1 becomes 1. Set answers true when the width changed.
    int Get(int col) const;
    bool Set(int col, int width);

    // Where column `col` starts: the sum of the widths before it.
    int Offset(int col) const;
    // The sum of all widths.
    int Total() const;

    // "Spalte 3: 12 Zeichen", for the filters' descriptions (col counts from 0).
    CQoString Description(int col) const;

    void WriteConfig(CQoConfigFile &cfg, char const *section) const;
    // Reads what WriteConfig wrote; missing or unfit values keep the current
    // layout. True when anything changed.
    bool ReadConfig(CQoConfigFile const &cfg, char const *section);

private:
    std::vector<int> m_widths;
};

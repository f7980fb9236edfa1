// What the database filter tests read from a filter: the current row, every
// row in order, and the message of the CQoException an action raises.
#pragma once

#include <CQoException.h>
#include <CQoInputFilter.h>

#include <functional>
#include <string>
#include <vector>

typedef std::vector<std::string> Row;

inline Row Current(CQoInputFilter& f)
{
    Row row;
    CQoString value;
    for (int c = 0; c < f.NumCols(); ++c) {
        f.Value(c, value);
        row.push_back(value.GetString());
    }
    return row;
}

inline std::vector<Row> Walk(CQoInputFilter& f)
{
    std::vector<Row> rows;
    for (bool ok = f.FirstRow(); ok; ok = f.NextRow())
        rows.push_back(Current(f));
    return rows;
}

// Empty when the action raises nothing.
inline std::string ErrorOf(const std::function<void()>& action)
{
    try {
        action();
    } catch (const CQoException& e) {
        return e.Message();
    }
    return std::string();
}

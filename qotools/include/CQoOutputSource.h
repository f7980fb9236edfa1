// CQoOutputSource: the rows an output filter writes.
//
// A source answers how many columns and rows it has, the value at a row and
// column, and the name of a column. The application's mapping layer derives
// from it; an output filter (or a configuration page) reads it row by row:
//
//     for (long r = 0; r < src.GetNumRows(); ++r) {
//         out.InitRow();
//         for (int c = 0; c < src.GetNumColumns(); ++c) {
//             src.GetValue(r, c, value); out.Value(c, value);
//         }
//         out.WriteRow();
//     }
//
// Rows and columns count from 0. A source made by the library is released
// with Delete().
#pragma once

#include "QoToolsApi.h"

#include "CQoString.h"

class QOTOOLS_API CQoOutputSource {
public:
    CQoOutputSource() = default;

    // --- virtual operations (the order is part of the contract) -------------
    virtual ~CQoOutputSource();
    virtual int GetNumColumns() = 0;
    virtual long GetNumRows() = 0;
    // The value at row and column; outside the table `value` is emptied.
    virtual void GetValue(long row, int col, CQoString &value) = 0;
    virtual void GetColumnName(int col, CQoString &name) = 0;
    // The greatest length a column's values may have; -1 when unknown (the
    // base's answer).
    virtual int GetDataLength(int col);

    // --- plain operations ----------------------------------------------------
    // Deletes the source inside the module that created it.
    void Delete();
};

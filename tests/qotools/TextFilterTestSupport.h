// Helpers of the text filter tests: reading a whole filter into rows, and a
// scripted record-repair hook.
#pragma once

#include "CQoInputFilter.h"
#include "CQoInterActive.h"
#include "CQoString.h"

#include <string>
#include <vector>

typedef std::vector<std::string> Row;

inline Row CurrentRow(CQoInputFilter &filter)
{
    Row row;
    CQoString value;
    for (int c = 0; c < filter.NumCols(); ++c) {
        filter.Value(c, value);
        row.emplace_back(value.Str());
    }
    return row;
}

inline std::vector<Row> AllRows(CQoInputFilter &filter)
{
    std::vector<Row> rows;
    for (bool ok = filter.FirstRow(); ok; ok = filter.NextRow())
        rows.push_back(CurrentRow(filter));
    return rows;
}

// The repair hook answers from a script; it records what it was given.
struct RepairScript {
    struct Call {
        std::string data;
        int pos;
    };
    static inline std::vector<Call> calls;
    static inline std::vector<int> answers;        // one per call; repairStop when used up
    static inline std::vector<std::string> records; // the corrected records of take-overs
    static inline int newPos = -1;                  // -1: leave pos as offered

    static int Hook(CQoString const &, CQoString &data, int &pos)
    {
        calls.push_back({std::string(data.Str()), pos});
        std::size_t i = calls.size() - 1;
        int answer = i < answers.size() ? answers[i] : CQoInterActive::repairStop;
        if (answer == CQoInterActive::repairTakeOver && i < records.size())
            data = records[i].c_str();
        if (newPos >= 0)
            pos = newPos;
        return answer;
    }

    // Installs the hook with the given answers; removes it on destruction.
    explicit RepairScript(std::vector<int> a, std::vector<std::string> r = {}, int p = -1)
    {
        calls.clear();
        answers = std::move(a);
        records = std::move(r);
        newPos = p;
        CQoInterActive::SetRepairRecord(&Hook);
    }
    ~RepairScript()
    {
        CQoInterActive::SetRepairRecord(nullptr);
        CQoInterActive::SetCorrectRepair(nullptr);
    }
};

// Fuzz target of the delimited reader: the first bytes choose the dialect and
// how defective records are answered, the rest is the file. Besides not
// crashing, every row read in sequence must read the same through AbsoluteRow.
#include "CQoException.h"
#include "CQoInputFilterTextVar.h"
#include "CQoInterActive.h"

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>
#include <unistd.h>

namespace {
int answerMode = 0;
int calls = 0;

int Repair(CQoString const &, CQoString &data, int &pos)
{
    ++calls;
    switch ((answerMode + calls) % 4) {
    case 0: return CQoInterActive::repairStop;
    case 1: return CQoInterActive::repairSkip;
    case 2: data = data.Left(pos); return CQoInterActive::repairTakeOver;
    default: pos = pos / 2; return CQoInterActive::repairSkip;
    }
}

int Correct(CQoString &record)
{
    record = "x";
    return calls % 2;
}

std::string const &Path()
{
    static std::string path = "/tmp/fuzz_textvar_" + std::to_string(getpid()) + ".csv";
    return path;
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *data, size_t size)
{
    if (size < 4)
        return 0;
    static char const delimiters[] = {';', ',', '\t', '|'};
    static char const enclosers[] = {'"', '\'', 0, '"'};
    static char const escapes[] = {0, '\\', 0, '"'};
    CQoInputFilterTextVar f;
    f.Delimiter(delimiters[data[0] & 3]);
    f.Encloser(enclosers[(data[0] >> 2) & 3]);
    f.Escape(escapes[(data[0] >> 4) & 3]);
    f.SetFirstRowHasNames(data[0] & 0x40);
    f.Skip(data[1] % 3);
    answerMode = data[2] & 7;
    calls = 0;
    CQoInterActive::SetRepairRecord(answerMode < 6 ? &Repair : nullptr);
    CQoInterActive::SetCorrectRepair(&Correct);
    uint8_t const pick = data[3];
    data += 4;
    size -= 4;
    if (std::FILE *fp = std::fopen(Path().c_str(), "wb")) {
        std::fwrite(data, 1, size, fp);
        std::fclose(fp);
    }
    try {
        f.Init(Path().c_str());
        std::vector<std::vector<std::string>> rows;
        CQoString value;
        for (bool ok = f.FirstRow(); ok; ok = f.NextRow()) {
            std::vector<std::string> row;
            for (int c = 0; c < f.NumCols(); ++c) {
                f.Value(c, value);
                row.push_back(value.Str());
            }
            rows.push_back(row);
        }
        if (static_cast<long>(rows.size()) != f.NumRows())
            std::abort();
        for (size_t k = 0; k < rows.size(); ++k) {
            long r = static_cast<long>((k * 7 + pick) % rows.size());
            if (!f.AbsoluteRow(r))
                std::abort();
            for (int c = 0; c < f.NumCols(); ++c) {
                f.Value(c, value);
                if (value.Str() != rows[r][c])
                    std::abort();
            }
        }
        if (f.AbsoluteRow(static_cast<long>(rows.size())))
            std::abort();
    } catch (CQoException const &) {
        // A clear error is a valid answer to bad input.
    }
    return 0;
}

// Fuzz target of the dBase reader: any bytes as a .dbf file must give either a
// table or a CQoException - never a crash, a hang or a read outside the
// record. What it reads must also agree with itself: the row found by
// AbsoluteRow is the row found by walking. The last bytes double as values
// for the dBase output's number, date and logical fields.
#include "CQoArray.h"
#include "CQoException.h"
#include "CQoInputFilterDbase34.h"
#include "CQoOutputFilterDbase.h"
#include "FuzzSupport.h"

namespace {

using fuzz::Row;

void ReadAll(std::string const &path, bool skipDeleted)
{
    CQoInputFilterDbase34 dbf;
    dbf.SkipDeleted(skipDeleted);
    try {
        dbf.Init(path.c_str());
    } catch (CQoException const &) {
        return;
    }
    std::vector<std::vector<std::string>> rows;
    try {
        CQoString name;
        for (int c = 0; c < dbf.NumCols(); ++c)
            dbf.ColName(c, name);
        for (bool ok = dbf.FirstRow(); ok && rows.size() < 2000; ok = dbf.NextRow())
            rows.push_back(Row(dbf));
    } catch (CQoException const &) {
        // a file shorter than declared: what was read stays valid
    }
    // A row that was walked to must be found again, without an exception.
    for (std::size_t r = rows.size(); r-- > 0;)
        if (!dbf.AbsoluteRow(long(r)) || Row(dbf) != rows[r])
            std::abort();
    try {
        dbf.NumRows();
        dbf.AbsoluteRow(long(rows.size()) + 1);
    } catch (CQoException const &) {
    }
}

void FormatValues(std::uint8_t const *data, std::size_t size)
{
    std::string text(reinterpret_cast<char const *>(data), size > 24 ? 24 : size);
    CQoArray<CDbaseField> fields;
    fields.Add(CDbaseField("N", 'N', 12, 3));
    fields.Add(CDbaseField("M", 'N', 4));
    fields.Add(CDbaseField("D", 'D', 8));
    fields.Add(CDbaseField("L", 'L', 1));
    fields.Add(CDbaseField("C", 'C', 5));
    for (int c = 0; c < fields.GetSize(); ++c) {
        CQoOutputFilterDbase out;
        out.SetFieldDescs(&fields);
        out.InitRow();
        out.Value(c, text.c_str());
        CQoString record;
        try {
            out.WriteRow(&record);
        } catch (CQoException const &) {
            continue;
        }
        if (record.GetLength() != 1 + 12 + 4 + 8 + 1 + 5)
            std::abort();
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size)
{
    std::string const path = fuzz::WriteFile("fuzz_dbase", data, size, ".dbf");
    ReadAll(path, true);
    ReadAll(path, false);
    FormatValues(data + (size > 24 ? size - 24 : 0), size > 24 ? 24 : size);
    return 0;
}

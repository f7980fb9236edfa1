// A mapped output source as an output filter sees it: written to a real file
// by the delimited text output, through the user's selection, order and
// conversions.
#include "MappingTestSource.h"

#include <CQoFile.h>
#include <CQoOutputFilterTextVar.h>

#include <windows.h>

#include <cstdio>
#include <fstream>
#include <sstream>

using mappingtest::TableSource;

namespace {

TableSource Customers()
{
    return TableSource({"Nr", "Name", "Ort"},
                       {{"1", "Müller", "Köln"}, {"2", "Weiß; Söhne", "Gießen"}});
}

// Writes every row of the source as an output filter does, with the source's
// column names as header line, and returns the file's bytes.
std::string WriteDelimited(CQoOutputSource& source)
{
    char folder[MAX_PATH];
    GetTempPathA(MAX_PATH, folder);
    char path[MAX_PATH];
    GetTempFileNameA(folder, "map", 0, path);

    CQoOutputFilterTextVar out;
    out.Delimiter(';');
    out.WriteHeaderFlag(true);
    out.NumCols(source.GetNumColumns());
    for (int c = 0; c < source.GetNumColumns(); ++c) {
        CQoString name;
        source.GetColumnName(c, name);
        out.ColumnName(c, name);
    }
    CQoFile file;
    EXPECT_TRUE(file.Open(path, CQoFile::create | CQoFile::binary));
    out.UseFile(&file, true);
    EXPECT_TRUE(out.Init());
    out.WriteHeader();
    for (long r = 0; r < source.GetNumRows(); ++r) {
        out.InitRow();
        for (int c = 0; c < source.GetNumColumns(); ++c) {
            CQoString value;
            source.GetValue(r, c, value);
            out.Value(c, value);
        }
        out.WriteRow();
    }
    out.ReleaseFile();

    std::ifstream in(path, std::ios::binary);
    std::stringstream bytes;
    bytes << in.rdbuf();
    in.close();
    DeleteFileA(path);
    return bytes.str();
}

} // namespace

TEST(OutputThroughFilters, TextOutputWritesTheSelectedColumnsInTheUsersOrder)
{
    TableSource s = Customers();
    s.SetSelected("Nr", false);
    s.ToFront("Ort");
    s.SetNoUmlaute(true);
    s.SetUseCapitals(true);
    EXPECT_EQ("Ort;Name\r\n"
              "KOELN;MUELLER\r\n"
              "GIESSEN;\"WEISS; SOEHNE\"\r\n",
              WriteDelimited(s));
}

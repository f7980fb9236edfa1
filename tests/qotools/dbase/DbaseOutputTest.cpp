// The dBase output filter: files it writes are read back by python3-dbfread
// and by the library's own dBase input; values that do not fit their field
// raise instead of corrupting the file.
#include "CQoArray.h"
#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoFile.h"
#include "CQoInputFilterDbase34.h"
#include "CQoOutputFilterDbase.h"

#include "PythonPeer.h"
#include "TempFolder.h"
#include "TextFilterTestSupport.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

CQoArray<CDbaseField> Fields(std::vector<CDbaseField> const &list)
{
    CQoArray<CDbaseField> fields;
    for (CDbaseField const &f : list)
        fields.Add(f);
    return fields;
}

void Put(CQoOutputFilterDbase &out, std::vector<std::string> const &values)
{
    out.InitRow();
    for (std::size_t c = 0; c < values.size(); ++c)
        out.Value(int(c), values[c].c_str());
    ASSERT_TRUE(out.WriteRow());
}

// The text of one field as the filter formats it (through the preview form).
std::string Formatted(CDbaseField const &field, char const *value)
{
    CQoOutputFilterDbase out;
    CQoArray<CDbaseField> fields = Fields({field});
    out.SetFieldDescs(&fields);
    out.InitRow();
    out.Value(0, value);
    CQoString record;
    out.WriteRow(&record);
    return std::string(record.Str().substr(1));
}

std::string FormatError(CDbaseField const &field, char const *value)
{
    try {
        Formatted(field, value);
    } catch (CQoException const &e) {
        return e.Message();
    }
    return std::string();
}

} // namespace

TEST(DbaseOutputPeer, DbfreadReadsNamesTypesAndValuesInBothCodePages)
{
    PeerFolder folder;
    if (!folder.Usable())
        PEER_UNAVAILABLE();
    for (int charSet : {CQoFile::ascii, CQoFile::ansi}) {
        std::string name = charSet == CQoFile::ascii ? "dos.dbf" : "win.dbf";
        CQoOutputFilterDbase out;
        out.FileCharSet(charSet);
        CQoArray<CDbaseField> fields =
            Fields({CDbaseField("Stra\xDF" "e", 'C', 30), CDbaseField("Betrag in EUR", 'N', 10, 2),
                    CDbaseField("Menge", 'N', 8), CDbaseField("Datum", 'D', 8), CDbaseField("Aktiv", 'L', 1),
                    CDbaseField("Betrag in EUR", 'C', 5)});
        out.SetFieldDescs(&fields);
        CQoFile file;
        ASSERT_TRUE(file.Open(folder.Path(name.c_str()).c_str(), CQoFile::write | CQoFile::create));
        out.UseFile(&file, true);
        ASSERT_TRUE(out.Init());
        Put(out, {"M\xFCller-Stra\xDF" "e 1", "12,5", "42", "31.01.2024", "ja", "x"});
        Put(out, {"", "-0,125", "", "", "", ""});
        Put(out, {"\xC4" "a;\"b\"", "999999.99", "-1234567", "2024-02-29", "F", "zu lang"});
        out.ReleaseFile();
        EXPECT_EQ(1, out.TruncatedValues());
    }

    bool ran = RunPython(folder, "read", R"(
import dbfread
for name in ('dos.dbf', 'win.dbf'):
    table = dbfread.DBF(os.path.join(folder, name))
    with open(os.path.join(folder, name + '.txt'), 'w', encoding='utf-8') as out:
        out.write(table.encoding + '\n')
        out.write(' '.join('%s:%s:%d:%d' % (f.name, f.type, f.length, f.decimal_count) for f in table.fields) + '\n')
        for rec in table:
            out.write(repr(list(rec.values())) + '\n')
)");
    if (!ran)
        PEER_UNAVAILABLE();
    for (char const *name : {"dos.dbf", "win.dbf"}) {
        SCOPED_TRACE(name);
        std::vector<std::string> lines = ReadPeerLines(folder.Path((std::string(name) + ".txt").c_str()));
        ASSERT_EQ(5u, lines.size());
        EXPECT_EQ(std::string(name) == "dos.dbf" ? "cp850" : "cp1252", lines[0]);
        EXPECT_EQ("STRASSE:C:30:0 BETRAG_IN_:N:10:2 MENGE:N:8:0 DATUM:D:8:0 AKTIV:L:1:0 BETRAG_I_1:C:5:0", lines[1]);
        // (dbfread's own text, UTF-8)
        EXPECT_EQ("['M\xC3\xBCller-Stra\xC3\x9F" "e 1', 12.5, 42, datetime.date(2024, 1, 31), True, 'x']", lines[2]);
        EXPECT_EQ("['', -0.13, None, None, None, '']", lines[3]);
        EXPECT_EQ("['\xC3\x84" "a;\"b\"', 999999.99, -1234567, datetime.date(2024, 2, 29), False, 'zu la']",
                  lines[4]);
    }
}

TEST(DbaseOutputValues, NumbersDatesLogicalsAndTextAreFormattedOrRefused)
{
    CDbaseField money("B", 'N', 10, 2);
    EXPECT_EQ("      1.01", Formatted(money, " 1.005 "));
    EXPECT_EQ("    100.00", Formatted(money, "99.999"));
    EXPECT_EQ("      0.00", Formatted(money, "-0.001"));
    CDbaseField whole("N", 'N', 8);
    EXPECT_EQ("      42", Formatted(whole, "0042"));
    EXPECT_EQ("    12.5", Formatted(whole, "12,5")); // no decimals declared: nothing is rounded away

    EXPECT_NE(std::string::npos, FormatError(whole, "123456789").find("Feldl\xE4nge 8"));
    EXPECT_NE(std::string::npos, FormatError(money, "99999999.995").find("passt nicht"));
    for (char const *bad : {"1.2.3", "+", "1 2", "1e5"})
        EXPECT_NE(std::string::npos, FormatError(whole, bad).find("keine Zahl")) << bad;
    std::string message = FormatError(whole, "zw\xF6lf");
    EXPECT_NE(std::string::npos, message.find("Satz 1, Feld N")) << message;

    CDbaseField date("D", 'D', 8);
    EXPECT_EQ("20240305", Formatted(date, "5.3.2024"));
    EXPECT_EQ("        ", Formatted(date, " "));
    for (char const *bad : {"2023-02-29", "1.13.2024", "gestern", "1900-02-29", "5555555555.1.2024"})
        EXPECT_NE(std::string::npos, FormatError(date, bad).find("kein Datum")) << bad;

    CDbaseField logical("L", 'L', 1);
    EXPECT_EQ("T", Formatted(logical, "Wahr"));
    EXPECT_EQ(" ", Formatted(logical, ""));
    EXPECT_NE(std::string::npos, FormatError(logical, "vielleicht").find("kein Wahrheitswert"));

    CDbaseField text("T", 'C', 4);
    EXPECT_EQ("ab  ", Formatted(text, "ab"));
    EXPECT_EQ("abcd", Formatted(text, "abcdef"));
}

TEST(DbaseOutputFile, HeaderCountsRecordsAndUnusableSettingsAreRefused)
{
    TempFolder tmp;
    std::string path = tmp.Path("out.dbf");
    WriteBytes(path, std::string(5000, 'x')); // old content that must go
    {
        // Record length 10: the header holds a 0x0A byte, which a text-mode
        // file would turn into CR LF.
        CQoFile file; // outlives the filter
        CQoOutputFilterDbase out;
        CQoArray<CDbaseField> fields = Fields({CDbaseField("A", 'C', 9)});
        out.SetFieldDescs(&fields);
        ASSERT_TRUE(file.Open(path.c_str(), CQoFile::write)); // text mode, appending
        out.UseFile(&file, false);
        ASSERT_TRUE(out.Init());
        for (int i = 0; i < 1000; ++i)
            Put(out, {std::to_string(i)});
        // Not released: the destructor finishes the file.
    }
    std::string bytes = ReadBytes(path);
    ASSERT_EQ(32u + 32 + 1 + 1000 * 10 + 1, bytes.size());
    EXPECT_EQ(1000 & 0xFF, static_cast<unsigned char>(bytes[4]));
    EXPECT_EQ(1000 >> 8, bytes[5]);
    EXPECT_EQ(0x1A, bytes.back());
    CQoInputFilterDbase34 dbf;
    dbf.Init(path.c_str());
    EXPECT_EQ("999", AllRows(dbf).at(999)[0]);

    // Settings that cannot make a file are refused clearly.
    auto initError = [&](std::vector<CDbaseField> const &list) {
        CQoOutputFilterDbase filter;
        CQoArray<CDbaseField> fields = Fields(list);
        filter.SetFieldDescs(&fields);
        filter.UseFile(path.c_str());
        try {
            filter.Init();
        } catch (CQoException const &e) {
            return std::string(e.Message());
        }
        return std::string();
    };
    EXPECT_NE(std::string::npos, initError({}).find("mindestens ein Feld"));
    EXPECT_NE(std::string::npos, initError({CDbaseField("Ort", 'C', 256)}).find("zwischen 1 und 255"));
    EXPECT_NE(std::string::npos, initError({CDbaseField("X", 'N', 21)}).find("1 und 20"));
    EXPECT_NE(std::string::npos, initError({CDbaseField("X", 'N', 5, 4)}).find("Nachkommastellen"));
    EXPECT_NE(std::string::npos, initError({CDbaseField("X", 'M', 10)}).find("Unbekannter Feldtyp"));
    EXPECT_NE(std::string::npos, initError(std::vector<CDbaseField>(300, CDbaseField("W", 'C', 255)))
                                     .find("h\xF6" "chstens 255 Felder"));
}

TEST(DbaseOutputConfig, FieldsRoundTripThroughTheConfigurationFile)
{
    CQoOutputFilterDbase out;
    out.FileCharSet(CQoFile::ansi);
    CQoArray<CDbaseField> fields =
        Fields({CDbaseField("Name", 'C', 40), CDbaseField("Preis", 'N', 12, 3), CDbaseField("Tag", 'D', 8)});
    out.SetFieldDescs(&fields);
    CQoConfigFile cfg;
    out.WriteConfig(cfg, "Ausgabe");
    CQoOutputFilterDbase copy;
    copy.ReadConfig(cfg, "Ausgabe");
    EXPECT_EQ(CQoFile::ansi, copy.FileCharSet());
    ASSERT_EQ(3, copy.NumCols());
    for (int i = 0; i < 3; ++i) {
        CDbaseField field;
        ASSERT_TRUE(copy.GetFieldDesc(i, field));
        EXPECT_EQ(fields[i], field) << i;
    }
    // The array handed over is copied: changing it later changes nothing.
    fields[0].Length(1);
    out.SetFieldDescs(&fields);
    fields.RemoveAll();
    CDbaseField first;
    ASSERT_TRUE(out.GetFieldDesc(0, first));
    EXPECT_EQ(1, first.Length());
}

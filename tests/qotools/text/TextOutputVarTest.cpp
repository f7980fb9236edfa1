// The delimited text output: its dialects read back by Python's csv module,
// the preview text, bad settings and the configuration keys.
#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoFile.h"
#include "CQoOutputFilterTextVar.h"

#include "PythonPeer.h"
#include "TempFolder.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

std::string Line(CQoOutputFilterTextVar &out, std::vector<std::string> const &values)
{
    out.NumCols(int(values.size()));
    out.InitRow();
    for (std::size_t c = 0; c < values.size(); ++c)
        out.Value(int(c), values[c].c_str());
    CQoString text;
    EXPECT_TRUE(out.WriteRow(&text));
    return std::string(text.Str());
}

// Values that test the quoting: delimiters, enclosers, escapes, line
// breaks, blanks, empty fields and umlauts.
std::vector<std::vector<std::string>> const kRows = {
    {"a", "b;c", "say \"hi\"", ""},
    {"", "", "", ""},
    {"zwei\r\nZeilen", "nur\nLF", "back\\slash", "tab\there"},
    {" blank ", "\"", "'quoted'", "\xE4\xF6\xFC\xDF\xC4"},
    {"a,b", "x|y", "\\\"", "end;"},
};

struct Dialect {
    char const *name;
    char delimiter, encloser, escape;
    bool force;
    char const *python; // the csv.reader arguments that read it
};

std::vector<Dialect> const kDialects = {
    {"semicolon", ';', '"', 0, false, "delimiter=';', quotechar='\"', doublequote=True"},
    {"forced", ';', '"', 0, true, "delimiter=';', quotechar='\"', doublequote=True"},
    {"escape", ';', '"', '\\', false, "delimiter=';', quotechar='\"', doublequote=False, escapechar='\\\\'"},
    {"no encloser", ',', 0, '\\', false, "delimiter=',', quoting=csv.QUOTE_NONE, escapechar='\\\\'"},
};

} // namespace

TEST(TextOutputVarPeer, PythonCsvReadsEveryDialectBack)
{
    PeerFolder folder;
    if (!folder.Usable())
        PEER_UNAVAILABLE();
    std::string script = "import csv\nresults = []\n";
    for (Dialect const &d : kDialects) {
        std::string path = folder.Path((std::string(d.name) + ".csv").c_str());
        CQoFile file;
        ASSERT_TRUE(file.Open(path.c_str(), CQoFile::write | CQoFile::create | CQoFile::binary));
        CQoOutputFilterTextVar out;
        out.Delimiter(d.delimiter);
        out.Encloser(d.encloser);
        out.Escape(d.escape);
        out.ForceEncloser(d.force);
        out.WriteHeaderFlag(true);
        out.NumCols(4);
        char const *names[] = {"Name", "Stra\337e", "a;b", "\"x\""};
        for (int c = 0; c < 4; ++c)
            out.ColumnName(c, names[c]);
        out.UseFile(&file, true);
        ASSERT_TRUE(out.Init()) << d.name;
        ASSERT_TRUE(out.WriteHeader());
        for (auto const &row : kRows) {
            out.InitRow();
            for (std::size_t c = 0; c < row.size(); ++c)
                out.Value(int(c), row[c].c_str());
            ASSERT_TRUE(out.WriteRow());
        }
        out.ReleaseFile();
        script += std::string("with open(os.path.join(folder, '") + d.name +
                  ".csv'), newline='', encoding='cp1252') as f:\n    results.append(list(csv.reader(f, " +
                  d.python + ")))\n";
    }
    // Every row as its fields in hex, joined by '|'; one line per row, dialects one after another.
    script += "with open(os.path.join(folder, 'rows.txt'), 'w') as out:\n"
              "    for rows in results:\n"
              "        for row in rows:\n"
              "            out.write('|'.join(f.encode('cp1252').hex() for f in row) + '\\n')\n";
    if (!RunPython(folder, "readcsv", script))
        PEER_UNAVAILABLE();

    auto hex = [](std::vector<std::string> const &row) {
        std::string out;
        for (std::size_t c = 0; c < row.size(); ++c) {
            out += c ? "|" : "";
            for (unsigned char b : row[c])
                out += "0123456789abcdef"[b >> 4], out += "0123456789abcdef"[b & 15];
        }
        return out;
    };
    std::vector<std::string> expected = {hex({"Name", "Stra\xDF" "e", "a;b", "\"x\""})};
    for (auto const &row : kRows)
        expected.push_back(hex(row));
    std::vector<std::string> lines = ReadPeerLines(folder.Path("rows.txt"));
    ASSERT_EQ(kDialects.size() * expected.size(), lines.size());
    for (std::size_t i = 0; i < lines.size(); ++i)
        EXPECT_EQ(expected[i % expected.size()], lines[i]) << kDialects[i / expected.size()].name << " row " << i % expected.size();
}

TEST(TextOutputVar, PreviewTextIsExactlyTheLine)
{
    CQoOutputFilterTextVar out; // ';' and '"', no escape
    EXPECT_EQ("a;\"b;c\";\"x\"\"y\";\r\n", Line(out, {"a", "b;c", "x\"y", ""}));
    out.ForceEncloser(true);
    EXPECT_EQ("\"a\";\"\"\r\n", Line(out, {"a", ""}));
    out.ForceEncloser(false);

    // A single empty column is not an empty line.
    EXPECT_EQ("\"\"\r\n", Line(out, {""}));
    EXPECT_EQ(0, out.wroteBytes()) << "the preview writes nothing anywhere";

    // A stop byte anywhere in a longer value: values are scanned eight bytes
    // at a time and their tails byte by byte.
    for (std::size_t length = 1; length <= 20; ++length)
        for (std::size_t at = 0; at < length; ++at)
            for (char stop : {';', '"', '\n'}) {
                std::string value(length, 'v');
                value[at] = stop;
                std::string enclosed = value;
                if (stop == '"')
                    enclosed.insert(at, 1, '"');
                ASSERT_EQ("\"" + enclosed + "\"\r\n", Line(out, {value})) << length << " " << at;
            }
    EXPECT_EQ(std::string(20, 'v') + "\r\n", Line(out, {std::string(20, 'v')}));

    out.Delimiter('\t');
    out.Encloser(0);
    out.Escape('\\');
    EXPECT_EQ("a\\\tb\t\\\\\tz\\\r\\\n\r\n", Line(out, {"a\tb", "\\", "z\r\n"}));
}

TEST(TextOutputVar, SettingsThatCannotMakeAReadableFileAreRefused)
{
    TempFolder tmp;
    std::string path = tmp.Path("bad.csv");
    CQoFile file;
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::write | CQoFile::create | CQoFile::binary));
    CQoOutputFilterTextVar out;
    out.UseFile(&file, false);
    auto initError = [&]() {
        try {
            out.Init();
        } catch (CQoException const &e) {
            return std::string(e.Message());
        }
        return std::string();
    };
    out.Delimiter(0);
    EXPECT_NE(std::string::npos, initError().find("kein Trennzeichen"));
    out.Delimiter('"');
    EXPECT_NE(std::string::npos, initError().find("nicht gleich"));
    out.Delimiter(';');
    out.Escape(';');
    EXPECT_NE(std::string::npos, initError().find("Escape"));
    out.Escape(0);

    // Neither encloser nor escape: a value with the delimiter cannot be written.
    out.Encloser(0);
    ASSERT_TRUE(out.Init());
    out.NumCols(2);
    out.InitRow();
    out.Value(0, "ok");
    ASSERT_TRUE(out.WriteRow());
    out.Value(1, "a;b");
    EXPECT_THROW(out.WriteRow(), CQoException);
    out.Value(1, "zwei\nZeilen");
    EXPECT_THROW(out.WriteRow(), CQoException);
    out.ReleaseFile();
    file.Close();
    EXPECT_EQ("ok;\r\n", ReadBytes(path));
}

TEST(TextOutputVar, DosCharacterSetAndSettingsRoundTrip)
{
    TempFolder tmp;
    std::string path = tmp.Path("dos.csv");
    CQoFile file;
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::write | CQoFile::create));
    CQoOutputFilterTextVar out;
    out.FileCharSet(CQoFile::ascii);
    out.Delimiter('|');
    out.Encloser('\'');
    out.Escape('\\');
    out.ForceEncloser(true);
    out.WriteHeaderFlag(true);
    out.NumCols(1);
    out.ColumnName(0, "Gr\xF6\xDF" "e");
    out.UseFile(&file, true);
    ASSERT_TRUE(out.Init());
    out.WriteHeader();
    out.InitRow();
    out.Value(0, "\xC4rger's");
    out.WriteRow();
    out.ReleaseFile();
    EXPECT_EQ("'Gr\x94\xE1" "e'\r\n'\x8Erger\\'s'\r\n", ReadBytes(path));

    CQoConfigFile cfg;
    out.WriteConfig(cfg, "Csv");
    CQoOutputFilterTextVar copy;
    copy.ReadConfig(cfg, "Csv");
    EXPECT_EQ((std::vector<int>{'|', '\'', '\\', 1, 1, CQoFile::ascii}),
              (std::vector<int>{copy.Delimiter(), copy.Encloser(), copy.Escape(), copy.ForceEncloser(),
                                copy.WriteHeaderFlag(), copy.FileCharSet()}));

    // A tab survives as a tab, "none" as none.
    out.Delimiter('\t');
    out.Escape(0);
    out.WriteConfig(cfg, "Csv");
    copy.ReadConfig(cfg, "Csv");
    EXPECT_EQ('\t', copy.Delimiter());
    EXPECT_EQ(0, copy.Escape());
}

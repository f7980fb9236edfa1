// The dBase input filter on real files: files written by python3-dbf and
// checked against python3-dbfread, hand-made dBase III/IV files, and damaged
// files of every kind.
#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoFile.h"
#include "CQoInputFilterDbase34.h"

#include "PythonPeer.h"
#include "TempFolder.h"
#include "TextFilterTestSupport.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <string>
#include <vector>

namespace {

struct Field {
    std::string name;
    char type;
    int length;
    int decimals;
};

// A dBase file built byte by byte here, independent of the library.
std::string MakeDbf(std::vector<Field> const &fields, std::vector<std::string> const &records,
                    unsigned char version = 0x03, unsigned char driver = 0x00, long declared = -1)
{
    int recordLength = 1;
    for (Field const &f : fields)
        recordLength += f.length;
    int headerLength = 32 + 32 * int(fields.size()) + 1;
    std::string h(std::size_t(headerLength), '\0');
    unsigned long count = declared < 0 ? records.size() : std::size_t(declared);
    h[0] = char(version);
    for (int i = 0; i < 4; ++i)
        h[4 + i] = char((count >> (8 * i)) & 0xFF);
    for (int i = 0; i < 2; ++i) {
        h[8 + i] = char((headerLength >> (8 * i)) & 0xFF);
        h[10 + i] = char((recordLength >> (8 * i)) & 0xFF);
    }
    h[29] = char(driver);
    for (std::size_t i = 0; i < fields.size(); ++i) {
        std::size_t d = 32 + 32 * i;
        std::copy(fields[i].name.begin(), fields[i].name.end(), h.begin() + long(d));
        h[d + 11] = fields[i].type;
        h[d + 16] = char(fields[i].length);
        h[d + 17] = char(fields[i].decimals);
    }
    h[std::size_t(headerLength) - 1] = 0x0D;
    for (std::string const &r : records) {
        EXPECT_EQ(std::size_t(recordLength), r.size()) << "test data: record length";
        h += r;
    }
    return h + '\x1A';
}

std::vector<Field> const kTwoFields = {{"NAME", 'C', 10, 0}, {"NUM", 'N', 5, 0}};

std::string Rec(std::string const &name, std::string const &num, bool deleted = false)
{
    return std::string(1, deleted ? '*' : ' ') + name + std::string(10 - name.size(), ' ') +
           std::string(5 - num.size(), ' ') + num;
}

std::string InitError(std::string const &path)
{
    CQoInputFilterDbase34 dbf;
    try {
        dbf.Init(path.c_str());
    } catch (CQoException const &e) {
        return e.Message();
    }
    return std::string();
}

// A line of the peer: tab-separated fields, each as hex of its Windows-1252 bytes.
Row HexFields(std::string const &line)
{
    Row fields(1);
    for (std::size_t i = 0; i < line.size(); ++i) {
        if (line[i] == '\t')
            fields.emplace_back();
        else if (i + 1 < line.size())
            fields.back() += char(std::stoi(line.substr(i++, 2), nullptr, 16));
    }
    return fields;
}

} // namespace

TEST(DbaseInputPeer, EveryValueAndRowPositionAgreesWithDbfread)
{
    PeerFolder folder;
    if (!folder.Usable())
        PEER_UNAVAILABLE();
    // 300 records, every seventh deleted; dbfread (raw bytes) gives the
    // expected text of every live record, and the field names in the file's
    // code page (one with an umlaut).
    bool ran = RunPython(folder, "bigfile", R"(
import dbf, dbfread, random
random.seed(7)
path = os.path.join(folder, 'big.dbf')
t = dbf.Table(path, 'ID N(8,0); TEXT C(40); GR\u00d6SSE N(12,3); TAG D', dbf_type='db3', codepage='cp850')
t.open(dbf.READ_WRITE)
letters = 'abc XYZ\u00e4\u00f6\u00fc\u00df;"\''
for i in range(300):
    text = ''.join(random.choice(letters) for _ in range(random.randint(0, 40))).rstrip()
    t.append((i, text, random.randint(-10**6, 10**6) / 1000.0, None))
for i in range(0, 300, 7):
    dbf.delete(t[i])
t.close()
with open(os.path.join(folder, 'names.txt'), 'w') as out:
    out.write('\t'.join(n.encode('cp1252').hex() for n in dbfread.DBF(path, encoding='cp850').field_names))
with open(os.path.join(folder, 'expected.txt'), 'w') as out:
    for rec in dbfread.DBF(path, raw=True, encoding='cp850'):
        vals = []
        for name, value in rec.items():
            text = value.decode('cp850')
            text = text.rstrip(' \0') if name == 'TEXT' else text.strip(' \0')
            vals.append(text.encode('cp1252').hex())
        out.write('\t'.join(vals) + '\n')
)");
    if (!ran)
        PEER_UNAVAILABLE();

    std::vector<Row> expected;
    for (std::string const &line : ReadPeerLines(folder.Path("expected.txt")))
        expected.push_back(HexFields(line));
    ASSERT_EQ(300u - 43u, expected.size());

    CQoInputFilterDbase34 dbf;
    dbf.Init(folder.Path("big.dbf").c_str());
    EXPECT_EQ(long(expected.size()), dbf.NumRows());
    EXPECT_EQ(expected, AllRows(dbf));
    Row names;
    CQoString name;
    for (int c = 0; c < dbf.NumCols(); ++c) {
        dbf.ColName(c, name);
        names.emplace_back(name.Str());
    }
    EXPECT_EQ(HexFields(ReadPeerLines(folder.Path("names.txt")).at(0)), names);

    EXPECT_FALSE(dbf.AbsoluteRow(long(expected.size())));
}

TEST(DbaseInputFormat, TheCodePageByteOrElseTheFilterDecides)
{
    TempFolder tmp;
    std::string path = tmp.Path("four.dbf");
    // Code page byte 0: the filter's character set decides (DOS by default).
    // Text keeps its leading blanks, numbers lose theirs.
    WriteBytes(path, MakeDbf(kTwoFields, {Rec("\x84\x94\x81", "1"), Rec("  x", "-22")}, 0x04, 0x00));
    CQoInputFilterDbase34 dbf;
    dbf.Init(path.c_str());
    EXPECT_EQ(CQoInputFilter::filterDbase4, dbf.InputFilterType());
    EXPECT_EQ((std::vector<Row>{{"\xE4\xF6\xFC", "1"}, {"  x", "-22"}}), AllRows(dbf));
    dbf.CharSet(CQoFile::ansi);
    dbf.Init(path.c_str());
    EXPECT_EQ("\x84\x94\x81", AllRows(dbf)[0][0]);

    // Byte 0x03 marks Windows text: read as it is, whatever the filter's setting.
    WriteBytes(path, MakeDbf(kTwoFields, {Rec("\xE4\x80", "1")}, 0x03, 0x03));
    dbf.CharSet(CQoFile::ascii);
    dbf.Init(path.c_str());
    EXPECT_EQ(CQoFile::ansi, dbf.RecordCharSet());
    EXPECT_EQ("\xE4\x80", AllRows(dbf)[0][0]);

    // The settings round-trip through the configuration file.
    dbf.SkipDeleted(false);
    dbf.CharSet(CQoFile::ansi); // not the default
    CQoConfigFile cfg;
    dbf.WriteConfig(cfg, "Eingabe");
    CQoInputFilterDbase34 copy;
    copy.ReadConfig(cfg, "Eingabe");
    EXPECT_FALSE(copy.SkipDeleted());
    EXPECT_EQ(CQoFile::ansi, copy.CharSet());
}

TEST(DbaseInputFormat, EmptyTablesAndDeletedRecordsEverywhere)
{
    TempFolder tmp;
    std::string path = tmp.Path("del.dbf");
    WriteBytes(path, MakeDbf(kTwoFields, {}));
    CQoInputFilterDbase34 dbf;
    dbf.Init(path.c_str());
    EXPECT_EQ(0, dbf.NumRows());
    EXPECT_FALSE(dbf.FirstRow());

    // Deleted at the start, in a run and at the end; rows are found from the back.
    std::vector<std::string> recs, live;
    for (int i = 0; i < 40; ++i) {
        bool deleted = i < 3 || (i >= 10 && i < 20) || i >= 37 || i % 5 == 4;
        recs.push_back(Rec("r" + std::to_string(i), std::to_string(i), deleted));
        if (!deleted)
            live.push_back("r" + std::to_string(i));
    }
    WriteBytes(path, MakeDbf(kTwoFields, recs));
    dbf.Init(path.c_str());
    ASSERT_EQ(long(live.size()), dbf.NumRows());
    for (long r = long(live.size()) - 1; r >= 0; --r) {
        ASSERT_TRUE(dbf.AbsoluteRow(r));
        EXPECT_EQ(live[std::size_t(r)], CurrentRow(dbf)[0]);
    }
    // With deleted records read, the mark tells them apart.
    dbf.SkipDeleted(false);
    ASSERT_TRUE(dbf.AbsoluteRow(12));
    EXPECT_TRUE(dbf.IsDeleted());
    EXPECT_EQ("r12", CurrentRow(dbf)[0]);
}

TEST(DbaseInputDamaged, HeadersThatAreNotDbaseRaiseClearErrors)
{
    TempFolder tmp;
    std::string path = tmp.Path("bad.dbf");
    std::string good = MakeDbf(kTwoFields, {Rec("a", "1")});
    EXPECT_NE(std::string::npos, InitError(tmp.Path("missing.dbf")).find("missing.dbf"));

    // Each case: the good file with some bytes changed.
    struct Case {
        char const *what;
        std::string bytes;
        char const *expect;
    };
    auto changed = [&](std::vector<std::pair<std::size_t, char>> const &bytes) {
        std::string file = good;
        for (auto const &b : bytes)
            file[b.first] = b.second;
        return file;
    };
    std::vector<Case> cases = {
        {"zero bytes", "", "zu kurz"},
        {"ten bytes", good.substr(0, 10), "zu kurz"},
        {"header only half there", good.substr(0, 50), "abgeschnitten"},
        {"version", changed({{0, char(0x30)}}), "Kennung 0x30"},
        {"header longer than file", changed({{8, char(0xFF)}, {9, char(0x7F)}}), "abgeschnitten"},
        {"header shorter than possible", changed({{8, char(20)}, {9, 0}}), "L\xE4nge des dBase-Dateikopfs"},
        {"descriptor cut", changed({{8, char(32 + 32 + 16)}}), "Feldes 2 ist abgeschnitten"},
        {"field of length 0", changed({{32 + 16, 0}}), "NAME hat die L\xE4nge 0"},
        {"unknown field type", changed({{32 + 11, 'X'}}), "0x58"},
        {"fields longer than record", changed({{10, char(5)}}), "passen nicht"},
        {"no fields", changed({{32, 0x0D}}), "keine Felder"},
        {"record length 0", changed({{10, 0}}), "Satzl\xE4nge"},
        // the header ends with the descriptors, without 0x0D
        {"descriptions without end mark", changed({{8, char(32 + 64)}}), "Endemarke 0x0D"},
    };
    for (Case const &c : cases) {
        SCOPED_TRACE(c.what);
        WriteBytes(path, c.bytes);
        std::string message = InitError(path);
        EXPECT_NE(std::string::npos, message.find(c.expect)) << message;
        EXPECT_NE(std::string::npos, message.find("bad.dbf")) << message;
    }

    // After a failed Init the filter is closed and harmless.
    CQoInputFilterDbase34 dbf;
    WriteBytes(path, cases[3].bytes);
    EXPECT_THROW(dbf.Init(path.c_str()), CQoException);
    EXPECT_FALSE(dbf.FirstRow());
    EXPECT_EQ(0, dbf.NumRows());
}

TEST(DbaseInputDamaged, RecordsMissingAtTheEndOrCutWhileReadingRaise)
{
    TempFolder tmp;
    std::string path = tmp.Path("short.dbf");
    // Declares 5 records; holds 3 and half of the fourth.
    std::string bytes = MakeDbf(kTwoFields, {Rec("a", "1"), Rec("b", "2"), Rec("c", "3")}, 0x03, 0, 5);
    bytes.pop_back(); // the end mark
    bytes += Rec("d", "4").substr(0, 7);
    WriteBytes(path, bytes);

    CQoInputFilterDbase34 dbf;
    dbf.SkipDeleted(false);
    dbf.Init(path.c_str());
    EXPECT_EQ(5, dbf.NumRows());
    ASSERT_TRUE(dbf.AbsoluteRow(2));
    EXPECT_EQ("c", CurrentRow(dbf)[0]);
    try {
        dbf.NextRow();
        FAIL() << "the missing record went unnoticed";
    } catch (CQoException const &e) {
        EXPECT_NE(std::string::npos, std::string(e.Message()).find("Satz 4 von 5")) << e.Message();
    }
    EXPECT_THROW(dbf.AbsoluteRow(4), CQoException);
    EXPECT_TRUE(dbf.AbsoluteRow(0)); // what is there stays readable

    // A count far beyond the file (2^31 and more: negative as a 32-bit row
    // number) is held to the records there and the first missing one.
    for (unsigned long declared : {0x80000000ul, 0xFFFFFFFFul}) {
        SCOPED_TRACE(declared);
        std::string huge = MakeDbf(kTwoFields, {Rec("a", "1"), Rec("b", "2")});
        for (int i = 0; i < 4; ++i)
            huge[4 + i] = char((declared >> (8 * i)) & 0xFF);
        WriteBytes(path, huge);
        CQoInputFilterDbase34 big;
        big.SkipDeleted(false);
        big.Init(path.c_str());
        EXPECT_EQ(3, big.NumRows());
        EXPECT_EQ(static_cast<long long>(declared), big.DeclaredRecords());
        EXPECT_TRUE(big.AbsoluteRow(1));
        EXPECT_THROW(big.AbsoluteRow(2), CQoException);
    }

    // A file cut by another program while it is read.
    path = tmp.Path("vanish.dbf");
    std::vector<std::string> recs;
    for (int i = 0; i < 20000; ++i)
        recs.push_back(Rec("n" + std::to_string(i), std::to_string(i % 1000)));
    WriteBytes(path, MakeDbf(kTwoFields, recs));
    CQoInputFilterDbase34 cut;
    cut.Init(path.c_str());
    ASSERT_TRUE(cut.FirstRow());
    // Another program cuts the file down to its header.
    std::filesystem::resize_file(path, 32 + 64 + 1);
    bool raised = false;
    try {
        for (int i = 0; i < 20000 && cut.NextRow(); ++i) {
        }
    } catch (CQoException const &e) {
        raised = true;
        EXPECT_NE(std::string::npos, std::string(e.Message()).find("vorzeitig")) << e.Message();
    }
    EXPECT_TRUE(raised);
}

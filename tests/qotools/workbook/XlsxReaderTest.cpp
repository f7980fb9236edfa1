// The workbook reader on real files: workbooks written by python3-xlsxwriter
// (shared strings, rich text) in both date systems, every cell checked against
// what openpyxl reads from the same file (a chart sheet between them is no
// table); and damaged or foreign files, which must raise a clear error.
#include "CQoException.h"
#include "CQoXlsxReader.h"

#include "PythonPeer.h"
#include "TempFolder.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

namespace {

using Cell = CQoXlsxReader::Cell;

char const writeWorkbooks[] = R"(
import datetime, xlsxwriter
rows = [
    ['Name', 'Betrag', 'Datum', 'Aktiv', 'Bemerkung'],
    ['M\u00fcller & S\u00f6hne <GmbH>', 1234.5, datetime.datetime(2024, 2, 29, 12, 30), True, '  Leerzeichen  '],
    ['\u00c4rger \u20ac \u201ezitiert\u201c', -0.125, datetime.date(1900, 1, 1), False, 'Zeile 1\nZeile 2'],
    [None, 1e20, datetime.datetime(1999, 12, 31, 23, 59, 59), None, 'Griechisch \u03a9 und \u4e2d'],
    [],
    ['nach der L\u00fccke', 7, None, True, None],
]
other = [['x', 'y'], [1, None], [None, 'z\u00df']]
for epoch in (1900, 1904):
    wb = xlsxwriter.Workbook(os.path.join(folder, 'xlsxwriter%d.xlsx' % epoch), {'date_1904': epoch == 1904})
    ws = wb.add_worksheet('Tabelle1')
    datefmt = wb.add_format({'num_format': 'dd/mm/yy hh:mm'})
    bold = wb.add_format({'bold': True})
    for r, row in enumerate(rows):
        for c, v in enumerate(row):
            if isinstance(v, (datetime.date, datetime.datetime)):
                ws.write_datetime(r, c, v, datefmt)
            elif v is not None:
                ws.write(r, c, v)
    ws.write_rich_string(len(rows), 0, 'reich ', bold, 'formatiert', ' \u00e4')
    ws.write_blank(len(rows) + 3, 8, None, bold)
    chart = wb.add_chart({'type': 'line'})
    chart.add_series({'values': "='Tabelle1'!$B$2:$B$4"})
    wb.add_chartsheet('Diagramm').set_chart(chart)
    ws2 = wb.add_worksheet('Gr\u00fc\u00dfe')
    for r, row in enumerate(other, 2):
        for c, v in enumerate(row, 2):
            if v is not None:
                ws2.write(r + (1 if r > 2 else 0), c, v)
    wb.close()

escapes = ['_x0041_ w\u00f6rtlich', 'a\x01b', 'Zeile\r\nZwei', 'Tab\tEnde', '_x005F_', '\u20ac_x20AC_']
for name, options in (('escapes_shared', {}), ('escapes_inline', {'constant_memory': True})):
    wb = xlsxwriter.Workbook(os.path.join(folder, name + '.xlsx'), options)
    ws = wb.add_worksheet()
    for r, text in enumerate(escapes):
        ws.write_string(r, 0, text)
    wb.close()
)";

// What openpyxl reads: per sheet its name, then every cell holding a value
// as row, column, kind and value (text as Windows-1252 bytes in hex).
char const readWorkbooks[] = R"(
import datetime, openpyxl
from openpyxl.utils.datetime import to_excel
for name in ('xlsxwriter1900', 'xlsxwriter1904'):
    wb = openpyxl.load_workbook(os.path.join(folder, name + '.xlsx'))
    out = []
    for ws in wb.worksheets:
        out.append('sheet\t' + ws.title.encode('cp1252', 'replace').hex())
        for row in ws.iter_rows():
            for cell in row:
                v = cell.value
                if v is None:
                    continue
                if isinstance(v, bool):
                    kind, text = 'b', str(int(v))
                elif isinstance(v, (int, float)):
                    kind, text = 'n', repr(float(v))
                elif isinstance(v, (datetime.datetime, datetime.date, datetime.time)):
                    kind, text = 'd', repr(float(to_excel(v)))
                elif cell.data_type == 'e':
                    kind, text = 'e', v.encode('cp1252', 'replace').hex()
                else:
                    kind, text = 's', str(v).encode('cp1252', 'replace').hex()
                out.append('%d\t%d\t%s\t%s' % (cell.row, cell.column, kind, text))
    open(os.path.join(folder, name + '.peer'), 'w').write('\n'.join(out))
)";

std::string FromHex(std::string const &hex)
{
    std::string bytes;
    for (std::size_t i = 0; i + 1 < hex.size(); i += 2)
        bytes += char(std::strtol(hex.substr(i, 2).c_str(), nullptr, 16));
    return bytes;
}

std::string Number(int type, double value)
{
    char text[40];
    std::snprintf(text, sizeof text, type == Cell::typeDate ? "%.6f" : "%.17g", value);
    return text;
}

struct PeerSheet {
    std::string name;
    std::map<std::pair<long, int>, std::pair<int, std::string>> cells;   // (row, col) -> (kind, value)
};

std::vector<PeerSheet> ReadPeer(std::string const &path)
{
    std::vector<PeerSheet> sheets;
    for (std::string const &line : ReadPeerLines(path)) {
        std::vector<std::string> p;
        std::istringstream fields(line);
        for (std::string part; std::getline(fields, part, '\t');)
            p.push_back(part);
        p.resize(4);
        if (p[0] == "sheet") {
            sheets.push_back(PeerSheet{FromHex(p[1]), {}});
            continue;
        }
        int kind = p[2] == "b" ? Cell::typeBoolean : p[2] == "n" ? Cell::typeNumber
                 : p[2] == "d" ? Cell::typeDate : p[2] == "e" ? Cell::typeError : Cell::typeText;
        std::string value = kind == Cell::typeText || kind == Cell::typeError ? FromHex(p[3]) : p[3];
        sheets.back().cells[{std::atol(p[0].c_str()), std::atoi(p[1].c_str())}] = {kind, value};
    }
    return sheets;
}

TEST(XlsxPeer, EveryCellAndEscapeReadsAsOpenpyxlReadsIt)
{
    PeerFolder folder;
    if (!folder.Usable() || !RunPython(folder, "write", writeWorkbooks) || !RunPython(folder, "read", readWorkbooks))
        PEER_UNAVAILABLE();
    for (char const *name : {"xlsxwriter1900", "xlsxwriter1904"}) {
        SCOPED_TRACE(name);
        std::vector<PeerSheet> peer = ReadPeer(folder.Path((std::string(name) + ".peer").c_str()));
        CQoXlsxReader reader;
        reader.Open(folder.Path((std::string(name) + ".xlsx").c_str()).c_str());
        EXPECT_EQ(std::string(name).find("1904") != std::string::npos, reader.Date1904());
        ASSERT_EQ(int(peer.size()), reader.SheetCount());
        for (int sheet = 0; sheet < reader.SheetCount(); ++sheet) {
            PeerSheet const &expected = peer[std::size_t(sheet)];
            SCOPED_TRACE(expected.name);
            EXPECT_EQ(expected.name, reader.SheetName(sheet).Str());
            long top = expected.cells.begin()->first.first, bottom = expected.cells.rbegin()->first.first;
            int left = 1 << 30, right = 0;
            for (auto const &c : expected.cells) {
                left = std::min(left, c.first.second);
                right = std::max(right, c.first.second);
            }
            reader.OpenSheet(sheet);
            ASSERT_EQ(right - left + 1, reader.ColumnCount());
            ASSERT_EQ(bottom - top + 1, reader.RowCount());
            EXPECT_EQ(top, reader.FirstRowNumber());
            EXPECT_EQ(left, reader.FirstColumnNumber());
            // Numbers to the last bit; dates to the microsecond openpyxl rounds to.
            auto expectedCells = expected.cells;
            for (auto &c : expectedCells)
                if (c.second.first == Cell::typeNumber || c.second.first == Cell::typeDate)
                    c.second.second = Number(c.second.first, std::strtod(c.second.second.c_str(), nullptr));
            std::map<std::pair<long, int>, std::pair<int, std::string>> got;
            std::vector<Cell> row;
            for (long r = top; reader.NextRow(row); ++r)
                for (std::size_t c = 0; c < row.size(); ++c) {
                    Cell const &cell = row[c];
                    if (cell.type == Cell::typeText || cell.type == Cell::typeError)
                        got[{r, left + int(c)}] = {cell.type, std::string(cell.text.Str())};
                    else if (cell.type != Cell::typeEmpty)
                        got[{r, left + int(c)}] = {cell.type, Number(cell.type, cell.number)};
                }
            EXPECT_EQ(expectedCells, got);
        }
    }

    // Escaped characters read as written, from shared and inline strings.
    std::vector<std::string> const expected = {"_x0041_ w\xF6rtlich", "a\x01" "b", "Zeile\r\nZwei",
                                               "Tab\tEnde", "_x005F_", "\x80_x20AC_"};
    for (char const *name : {"escapes_shared.xlsx", "escapes_inline.xlsx"}) {
        SCOPED_TRACE(name);
        CQoXlsxReader reader;
        reader.Open(folder.Path(name).c_str());
        reader.OpenSheet(0);
        std::vector<std::string> got;
        std::vector<Cell> row;
        while (reader.NextRow(row))
            got.emplace_back(row.at(0).text.Str());
        EXPECT_EQ(expected, got);
    }
}

// A workbook written part by part (Python's zipfile as the container):
// namespace prefixes, rows and cells without numbers, every cell type,
// rich text with a phonetic guide, entities, custom number formats, an
// unknown style index, absolute and relative part targets, an empty sheet.
char const writeHandMade[] = R"(
import zipfile
ns = 'xmlns="http://schemas.openxmlformats.org/spreadsheetml/2006/main" '
rel = 'http://schemas.openxmlformats.org/officeDocument/2006/relationships'
parts = {
 '[Content_Types].xml': '<Types xmlns="http://schemas.openxmlformats.org/package/2006/content-types">'
   '<Override PartName="/xl/workbook.xml" ContentType="application/vnd.openxmlformats-officedocument.spreadsheetml.sheet.main+xml"/></Types>',
 'xl/workbook.xml': '<workbook ' + ns + 'xmlns:r="' + rel + '"><sheets>'
   '<sheet name="Daten &amp; mehr" sheetId="1" r:id="rId1"/><sheet name="Leer" sheetId="2" r:id="rId2"/></sheets></workbook>',
 'xl/_rels/workbook.xml.rels': '<Relationships xmlns="http://schemas.openxmlformats.org/package/2006/relationships">'
   '<Relationship Id="rId1" Type="' + rel + '/worksheet" Target="/xl/worksheets/a.xml"/>'
   '<Relationship Id="rId2" Type="' + rel + '/worksheet" Target="worksheets/../worksheets/b.xml"/>'
   '<Relationship Id="rId3" Type="' + rel + '/sharedStrings" Target="sharedStrings.xml"/>'
   '<Relationship Id="rId4" Type="' + rel + '/styles" Target="styles.xml"/></Relationships>',
 'xl/sharedStrings.xml': '<sst ' + ns + 'count="1"><si><r><t>Kurs</t></r><r><rPr><b/></rPr>'
   '<t xml:space="preserve"> &#x20AC;&#8364;&apos;</t></r><rPh sb="0" eb="1"><t>\u3075\u308a</t></rPh></si></sst>',
 'xl/styles.xml': '<styleSheet ' + ns + '><numFmts count="3">'
   '<numFmt numFmtId="164" formatCode="&quot;Jahr &quot;0"/><numFmt numFmtId="165" formatCode="[Red]0.00"/>'
   '<numFmt numFmtId="166" formatCode="[h]:mm"/></numFmts><cellXfs count="5"><xf numFmtId="0"/>'
   '<xf numFmtId="14"/><xf numFmtId="164"/><xf numFmtId="166"/><xf numFmtId="165"/></cellXfs></styleSheet>',
 'xl/worksheets/a.xml': '<?xml version="1.0" encoding="UTF-8"?><!-- von Hand -->'
   '<x:worksheet xmlns:x="http://schemas.openxmlformats.org/spreadsheetml/2006/main"><x:sheetData>'
   '<x:row><x:c><x:v>1</x:v></x:c><x:c t="str"><x:f>A1</x:f><x:v>Formel &amp; Text</x:v></x:c></x:row>'
   '<x:row><x:c r="B3" t="e"><x:v>#DIV/0!</x:v></x:c></x:row>'
   '<x:row><x:c t="b"><x:v>1</x:v></x:c><x:c s="1"/><x:c t="d"><x:v>2026-12-06T12:00:00</x:v></x:c></x:row>'
   '<x:row r="6"><x:c r="A6" t="s"><x:v>0</x:v></x:c><x:c r="C6" s="1"><x:v>45000.25</x:v></x:c>'
   '<x:c r="D6" s="2"><x:v>3</x:v></x:c><x:c r="E6" s="3"><x:v>1.5</x:v></x:c>'
   '<x:c r="F6" s="99"><x:v>7</x:v></x:c><x:c r="G6" s="4"><x:v>2</x:v></x:c></x:row>'
   '</x:sheetData></x:worksheet>',
 'xl/worksheets/b.xml': '<worksheet ' + ns + '><sheetData/></worksheet>',
}
with zipfile.ZipFile(os.path.join(folder, 'handmade.xlsx'), 'w', zipfile.ZIP_DEFLATED) as z:
    for name, text in parts.items():
        z.writestr(name, text.encode('utf-8'))
)";

TEST(XlsxHandMade, EveryCellKindAndLayoutReads)
{
    PeerFolder folder;
    if (!folder.Usable() || !RunPython(folder, "handmade", writeHandMade))
        PEER_UNAVAILABLE();
    CQoXlsxReader reader;
    reader.Open(folder.Path("handmade.xlsx").c_str());
    ASSERT_EQ(2, reader.SheetCount());
    EXPECT_EQ("Daten & mehr", reader.SheetName(0).Str());
    EXPECT_EQ(1, reader.FindSheet("LEER$"));

    struct Expected {
        long row;
        int column;
        int type;
        double number;
        char const *text;
    } const cells[] = {
        {1, 1, Cell::typeNumber, 1, ""},
        {1, 2, Cell::typeText, 0, "Formel & Text"},
        {3, 2, Cell::typeError, 0, "#DIV/0!"},
        {4, 1, Cell::typeBoolean, 1, ""},
        {4, 3, Cell::typeDate, 46362.5, ""},
        {6, 1, Cell::typeText, 0, "Kurs \x80\x80'"},
        {6, 3, Cell::typeDate, 45000.25, ""},   // built-in date format 14
        {6, 4, Cell::typeNumber, 3, ""},        // "Jahr "0: the letters are quoted
        {6, 5, Cell::typeDate, 1.5, ""},        // [h]:mm, elapsed time
        {6, 6, Cell::typeNumber, 7, ""},        // unknown style: General
        {6, 7, Cell::typeNumber, 2, ""},        // [Red]0.00: a colour, no date
    };
    reader.OpenSheet(0);
    ASSERT_EQ(7, reader.ColumnCount());
    ASSERT_EQ(6, reader.RowCount());
    std::vector<std::vector<Cell>> rows;
    std::vector<Cell> row;
    while (reader.NextRow(row))
        rows.push_back(row);
    ASSERT_EQ(6u, rows.size());
    std::size_t valued = 0;
    for (auto const &r : rows)
        for (Cell const &c : r)
            valued += c.type != Cell::typeEmpty;
    EXPECT_EQ(sizeof cells / sizeof *cells, valued);
    for (Expected const &e : cells) {
        SCOPED_TRACE(std::to_string(e.row) + "/" + std::to_string(e.column));
        Cell const &c = rows[std::size_t(e.row - 1)][std::size_t(e.column - 1)];
        EXPECT_EQ(e.type, c.type);
        EXPECT_DOUBLE_EQ(e.number, c.number);
        EXPECT_EQ(std::string(e.text), c.text.Str());
    }

    reader.OpenSheet(1);
    EXPECT_EQ(0, reader.ColumnCount());
    EXPECT_EQ(0, reader.RowCount());
    EXPECT_FALSE(reader.NextRow(row));
}

char const writeFaults[] = R"(
import io, zipfile, xlwt, openpyxl
wb = openpyxl.Workbook()
ws = wb.active
for r in range(1, 200):
    ws.append(['Zeile %d' % r, r * 1.5, 'Text %d' % (r * 7)])
good = os.path.join(folder, 'good.xlsx')
wb.save(good)
data = open(good, 'rb').read()
open(os.path.join(folder, 'truncated.xlsx'), 'wb').write(data[:len(data) // 2])

def rewrite(name, change, compression=zipfile.ZIP_DEFLATED):
    src = zipfile.ZipFile(good)
    buf = io.BytesIO()
    with zipfile.ZipFile(buf, 'w', compression) as out:
        for info in src.infolist():
            body = change(info.filename, src.read(info.filename))
            if body is not None:
                out.writestr(info.filename, body)
    open(os.path.join(folder, name), 'wb').write(buf.getvalue())

rewrite('noworkbook.xlsx', lambda n, b: None if n in ('xl/workbook.xml', '[Content_Types].xml') else b)
rewrite('badxml.xlsx', lambda n, b: b[:len(b) // 2] if n == 'xl/worksheets/sheet1.xml' else b)
rewrite('stored.xlsx', lambda n, b: b, zipfile.ZIP_STORED)

def member(path, name):
    z = zipfile.ZipFile(path)
    info = z.getinfo(name)
    raw = open(path, 'rb').read()
    start = info.header_offset + 30 + int.from_bytes(raw[info.header_offset + 26:info.header_offset + 28], 'little') \
        + int.from_bytes(raw[info.header_offset + 28:info.header_offset + 30], 'little')
    return bytearray(raw), info.header_offset, start, info.compress_size

raw, header, start, size = member(good, 'xl/worksheets/sheet1.xml')
for i in range(start + size // 3, start + size // 3 + 40):
    raw[i] ^= 0x5A
open(os.path.join(folder, 'deflate.xlsx'), 'wb').write(bytes(raw))

raw, header, start, size = member(os.path.join(folder, 'stored.xlsx'), 'xl/worksheets/sheet1.xml')
raw[start + size // 2] ^= 0x01
open(os.path.join(folder, 'crc.xlsx'), 'wb').write(bytes(raw))

raw, header, start, size = member(good, 'xl/worksheets/sheet1.xml')
raw[header + 14:header + 26] = bytes(12)
open(os.path.join(folder, 'zerolocal.xlsx'), 'wb').write(bytes(raw))

def declare(name, size):
    raw = bytearray(data)
    pos = raw.find(b'PK\x01\x02')
    while pos >= 0:
        n = int.from_bytes(raw[pos + 28:pos + 30], 'little')
        if raw[pos + 46:pos + 46 + n] == b'xl/worksheets/sheet1.xml':
            raw[pos + 24:pos + 28] = size(int.from_bytes(raw[pos + 20:pos + 24], 'little')).to_bytes(4, 'little')
        pos = raw.find(b'PK\x01\x02', pos + 4)
    open(os.path.join(folder, name), 'wb').write(bytes(raw))

declare('huge.xlsx', lambda packed: 0x7FFFFFFF)
declare('bomb.xlsx', lambda packed: packed * 300 + (2 << 20))

book = xlwt.Workbook()
book.add_sheet('Tabelle1').write(0, 0, 'alt')
book.save(os.path.join(folder, 'old.xls'))
)";

TEST(XlsxFaults, DamagedAndForeignFilesRaiseAClearErrorOddButSoundOnesRead)
{
    PeerFolder folder;
    if (!folder.Usable() || !RunPython(folder, "faults", writeFaults))
        PEER_UNAVAILABLE();
    // Password-protected: an OLE file naming the stream EncryptedPackage.
    std::string ole("\xD0\xCF\x11\xE0\xA1\xB1\x1A\xE1", 8);
    ole.resize(1024, '\0');
    for (char c : std::string("EncryptedPackage"))
        ole += std::string(1, c) + '\0';
    ole.resize(2048, '\0');
    WriteBytes(folder.Path("protected.xlsx"), ole);
    WriteBytes(folder.Path("text.xlsx"), "Name;Betrag\nM\374ller;12\n");

    struct {
        char const *file;
        bool atOpen;        // else when the first sheet is read
        char const *says;
    } const cases[] = {
        {"missing.xlsx", true, "nicht gefunden"},
        {"text.xlsx", true, "keine Excel-Arbeitsmappe"},
        {"truncated.xlsx", true, "besch\344digt"},
        {"noworkbook.xlsx", true, "keine Excel-Arbeitsmappe"},
        {"old.xls", true, "im alten Excel-Format (.xls)"},
        {"protected.xlsx", true, "Kennwortschutz in Excel entfernen"},
        {"badxml.xlsx", false, "besch\344digt"},
        {"deflate.xlsx", false, "besch\344digt"},
        {"crc.xlsx", false, "Pr\374fsumme"},
        {"huge.xlsx", false, "gr\366\337er als 1 GB"},
        {"bomb.xlsx", false, "ungew\366hnlich stark komprimiert"},
    };
    for (auto const &c : cases) {
        SCOPED_TRACE(c.file);
        std::string path = folder.Path(c.file);
        CQoXlsxReader reader;
        try {
            reader.Open(path.c_str());
            ASSERT_FALSE(c.atOpen) << "opened";
            reader.OpenSheet(0);
            std::vector<Cell> row;
            while (reader.NextRow(row)) {
            }
            ADD_FAILURE() << "read without error";
        } catch (CQoException const &e) {
            EXPECT_NE(std::string::npos, std::string(e.Message()).find(c.says)) << e.Message();
            EXPECT_NE(std::string::npos, std::string(e.Message()).find(path)) << e.Message();
        }
        if (c.atOpen)
            EXPECT_FALSE(reader.IsOpen());
    }

    // Sizes come from the central directory: stored and zeroed local headers read alike.
    auto firstColumn = [&](char const *file) {
        CQoXlsxReader reader;
        reader.Open(folder.Path(file).c_str());
        reader.OpenSheet(0);
        std::vector<std::string> texts;
        std::vector<Cell> row;
        while (reader.NextRow(row))
            texts.push_back(std::string(row[0].text.Str()) + "|" + std::string(row[2].text.Str()));
        return texts;
    };
    std::vector<std::string> good = firstColumn("good.xlsx");
    ASSERT_EQ(199u, good.size());
    EXPECT_EQ("Zeile 199|Text 1393", good.back());
    EXPECT_EQ(good, firstColumn("stored.xlsx"));
    EXPECT_EQ(good, firstColumn("zerolocal.xlsx"));
}

} // namespace

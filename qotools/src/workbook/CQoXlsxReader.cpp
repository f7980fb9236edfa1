#include "CQoXlsxReader.h"

#include "CQoException.h"
#include "../core/QoPathParts.h"
#include "QoXmlScanner.h"
#include "QoZipArchive.h"

#include <charconv>
#include <cstdint>
#include <cmath>
#include <map>

namespace {

// Excel's own limits of a sheet; a reference beyond them is a damaged file.
constexpr long maxRow = 1048576;
constexpr int maxColumn = 16384;
// Days between the 1904 and the 1900 date systems.
constexpr double days1904 = 1462;
// Shared strings of a workbook (4 bytes of index each, besides the text) and
// entries of its style tables: far more than Excel itself writes (it stops
// at 64,000 cell formats), few enough that a crafted part cannot make the
// tables outgrow the part.
constexpr std::size_t maxSharedStrings = 1u << 24;
constexpr std::size_t maxStyles = 1u << 16;

bool EndsWith(std::string_view text, std::string_view tail)
{
    return text.size() >= tail.size() && text.substr(text.size() - tail.size()) == tail;
}

std::string Decoded(std::string_view raw)
{
    std::string out;
    QoXmlScanner::Decode(raw, out);
    return out;
}

std::string Ansi(std::string_view utf8)
{
    std::string out;
    QoAppendUtf8AsAnsi(utf8, out);
    return out;
}

// "xl/" for "xl/workbook.xml".
std::string Folder(std::string const &part)
{
    std::size_t slash = part.rfind('/');
    return slash == std::string::npos ? std::string() : part.substr(0, slash + 1);
}

// A relationship target, absolute in the package or relative to `base`,
// as a zip member name.
std::string ResolveTarget(std::string const &base, std::string const &target)
{
    std::string joined = !target.empty() && target[0] == '/' ? target.substr(1) : base + target;
    std::string out;
    for (std::string const &p : QoPathParts(joined))
        out += (out.empty() ? "" : "/") + p;
    return out;
}

// Whether a number format shows a date or a time: it has a date or time
// letter outside quoted text, escapes and bracketed parts (colours,
// conditions, locales); an elapsed-time bracket such as [h] counts.
bool IsDateFormat(std::string_view code)
{
    for (std::size_t i = 0; i < code.size(); ++i) {
        char c = code[i];
        switch (c) {
        case '"': {
            std::size_t close = code.find('"', i + 1);
            if (close == std::string_view::npos)
                return false;
            i = close;
            break;
        }
        case '\\':
        case '_':
        case '*':
            ++i;
            break;
        case '[': {
            std::size_t close = code.find(']', i + 1);
            if (close == std::string_view::npos)
                return false;
            std::string_view inside = code.substr(i + 1, close - i - 1);
            if (!inside.empty() && inside.find_first_not_of("hHmMsS") == std::string_view::npos)
                return true;
            i = close;
            break;
        }
        case 'd': case 'D': case 'm': case 'M': case 'y': case 'Y':
        case 'h': case 'H': case 's': case 'S':
            return true;
        default:
            break;
        }
    }
    return false;
}

bool IsBuiltinDateFormat(long id) { return (id >= 14 && id <= 22) || (id >= 45 && id <= 47); }

bool ParseLong(std::string_view text, long &value)
{
    while (!text.empty() && (text.front() == ' ' || text.front() == '\t'))
        text.remove_prefix(1);
    while (!text.empty() && (text.back() == ' ' || text.back() == '\t'))
        text.remove_suffix(1);
    auto result = std::from_chars(text.data(), text.data() + text.size(), value);
    return result.ec == std::errc() && result.ptr == text.data() + text.size();
}

bool ParseDouble(std::string_view text, double &value)
{
    while (!text.empty() && (text.front() == ' ' || text.front() == '\t' || text.front() == '\n' || text.front() == '\r'))
        text.remove_prefix(1);
    while (!text.empty() && (text.back() == ' ' || text.back() == '\t' || text.back() == '\n' || text.back() == '\r'))
        text.remove_suffix(1);
    if (!text.empty() && text.front() == '+')
        text.remove_prefix(1);
    if (text.empty())
        return false;
    auto result = std::from_chars(text.data(), text.data() + text.size(), value);
    return result.ec == std::errc() && result.ptr == text.data() + text.size() && std::isfinite(value);
}

// Days since 1970-01-01 of a date in the proleptic Gregorian calendar.
long DaysFromCivil(long y, long m, long d)
{
    y -= m <= 2;
    long era = (y >= 0 ? y : y - 399) / 400;
    long yoe = y - era * 400;
    long doy = (153 * (m + (m > 2 ? -3 : 9)) + 2) / 5 + d - 1;
    long doe = yoe * 365 + yoe / 4 - yoe / 100 + doy;
    return era * 146097 + doe - 719468;
}

// An ISO 8601 date ("2026-12-06", optionally "T10:30:00.5") as an Excel
// serial in the 1900 system, which counts the nonexistent 1900-02-29.
bool ParseIsoDate(std::string_view text, double &serial)
{
    int y = 0, mo = 0, d = 0, h = 0, mi = 0;
    double s = 0;
    auto number = [&](std::size_t at, std::size_t digits, int &out) {
        if (at + digits > text.size())
            return false;
        auto r = std::from_chars(text.data() + at, text.data() + at + digits, out);
        return r.ec == std::errc() && r.ptr == text.data() + at + digits;
    };
    if (!number(0, 4, y) || text.size() < 10 || text[4] != '-' || !number(5, 2, mo) || text[7] != '-' ||
        !number(8, 2, d))
        return false;
    if (mo < 1 || mo > 12 || d < 1 || d > 31 || y < 1900 || y > 9999)
        return false;
    if (text.size() > 10) {
        if (text[10] != 'T' || !number(11, 2, h) || text.size() < 19 || text[13] != ':' || !number(14, 2, mi) ||
            text[16] != ':')
            return false;
        std::string_view rest = text.substr(17);
        if (!rest.empty() && rest.back() == 'Z')
            rest.remove_suffix(1);
        if (!ParseDouble(rest, s) || h > 23 || mi > 59 || s < 0 || s >= 61)
            return false;
    }
    long days = DaysFromCivil(y, mo, d) - DaysFromCivil(1899, 12, 30);
    if (days < 61)
        days -= 1;   // before 1900-03-01 Excel's count is one lower
    serial = double(days) + (h * 3600.0 + mi * 60.0 + s) / 86400.0;
    return true;
}

// "B3" -> column 2, row 3; either part may be absent in some writers' output
// but here both must be present and within Excel's limits.
bool ParseReference(std::string_view ref, int &column, long &row)
{
    std::size_t i = 0;
    column = 0;
    while (i < ref.size() && ((ref[i] >= 'A' && ref[i] <= 'Z') || (ref[i] >= 'a' && ref[i] <= 'z'))) {
        char c = ref[i] >= 'a' ? char(ref[i] - 'a' + 'A') : ref[i];
        column = column * 26 + (c - 'A' + 1);
        if (column > maxColumn)
            return false;
        ++i;
    }
    if (i == 0 || i == ref.size())
        return false;
    long r = 0;
    if (!ParseLong(ref.substr(i), r) || r < 1 || r > maxRow)
        return false;
    row = r;
    return true;
}

// Text of a cell as Excel stores it: characters XML cannot carry are
// written as _xHHHH_ (and a literal "_x" sequence as _x005F_x...).
void Unescape(std::string &text)
{
    std::size_t at = text.find("_x");
    if (at == std::string::npos)
        return;
    std::string out(text, 0, at);
    auto hex = [](char c) {
        return c >= '0' && c <= '9' ? c - '0' : c >= 'a' && c <= 'f' ? c - 'a' + 10 : c >= 'A' && c <= 'F' ? c - 'A' + 10 : -1;
    };
    while (at < text.size()) {
        if (text.compare(at, 2, "_x") == 0 && at + 7 <= text.size() && text[at + 6] == '_') {
            int value = 0;
            bool good = true;
            for (std::size_t k = at + 2; k < at + 6; ++k) {
                int digit = hex(text[k]);
                good = good && digit >= 0;
                value = value * 16 + digit;
            }
            if (good) {
                std::string utf8;
                QoXmlScanner::Decode("&#" + std::to_string(value) + ";", utf8);
                out += utf8;
                at += 7;
                continue;
            }
        }
        out += text[at++];
    }
    text.swap(out);
}

std::string ColumnName(int column)
{
    std::string name;
    for (; column > 0; column = (column - 1) / 26)
        name.insert(name.begin(), char('A' + (column - 1) % 26));
    return name;
}

} // namespace

struct CQoXlsxReader::Impl {
    struct Sheet {
        std::string name;   // Windows-1252
        std::string part;
    };

    QoZipArchive zip;
    std::string path;
    bool open = false;
    bool date1904 = false;
    std::vector<Sheet> sheets;
    std::string sharedText;            // Windows-1252, one after the other
    std::vector<std::uint32_t> sharedEnd;   // end of each shared string in sharedText
    std::vector<char> xfIsDate;

    // The open sheet.
    int sheet = -1;
    std::string xml;
    std::unique_ptr<QoXmlScanner> scan;
    bool sheetDone = false;
    bool hasRange = false;
    long firstRow = 0, lastRow = 0;
    int firstCol = 0, lastCol = 0;
    long nextRow = 0;        // number of the row NextRow answers next
    long parsedRow = 0;      // number of the last <row> parsed
    bool pending = false;    // rawCells hold row parsedRow, not yet answered
    std::vector<int> rawColumns;
    std::vector<Cell> rawCells;
    std::size_t rawCount = 0;
    std::string utf8;        // scratch for text

    std::string Where(std::string const &part) const { return path + ", " + part; }
    std::string SheetWhere() const { return path + ", Tabellenblatt " + sheets[std::size_t(sheet)].name; }

    void LoadWorkbook();
    void LoadSharedStrings(std::string const &part);
    void LoadStyles(std::string const &part);
    void AddShared(std::string &utf8Text, QoXmlScanner const &s);
    void StartSheet();
    bool ReadRawRow();
    void ReadCell(long &row, bool &rowKnown, int &previousColumn);
    void CollectText(char const *endName);
};

void CQoXlsxReader::Impl::LoadWorkbook()
{
    if (!zip.Has("[Content_Types].xml") && !zip.Has("xl/workbook.xml"))
        CQoException::Throw("Die Datei ist ein ZIP-Archiv, aber keine Excel-Arbeitsmappe (.xlsx)", path.c_str());

    std::string workbook;
    if (zip.Has("[Content_Types].xml")) {
        std::string types = zip.Read("[Content_Types].xml");
        QoXmlScanner s(types.data(), types.size(), Where("[Content_Types].xml"));
        for (QoXmlScanner::Kind k; (k = s.Next()) != QoXmlScanner::finished;) {
            std::string_view type, name;
            if (k != QoXmlScanner::startTag || s.Name() != "Override" || !s.Attribute("ContentType", type) ||
                !s.Attribute("PartName", name))
                continue;
            if (type.find("sheet.binary.macroEnabled.main") != std::string_view::npos)
                CQoException::Throw("Die Arbeitsmappe ist im Excel-Bin\344rformat (.xlsb) gespeichert; dieses Format "
                                    "wird nicht unterst\374tzt. Bitte in Excel als Arbeitsmappe (.xlsx) speichern",
                                    path.c_str());
            if (EndsWith(type, ".main+xml") && (type.find("spreadsheetml") != std::string_view::npos ||
                                                type.find("ms-excel") != std::string_view::npos))
                workbook = ResolveTarget("", Decoded(name));
        }
    }
    if (workbook.empty() || !zip.Has(workbook))
        workbook = "xl/workbook.xml";
    if (!zip.Has(workbook))
        CQoException::Throw("Die Datei ist ein ZIP-Archiv, aber keine Excel-Arbeitsmappe (.xlsx)", path.c_str());

    std::string base = Folder(workbook);
    std::string relsPart = base + "_rels/" + workbook.substr(base.size()) + ".rels";
    struct Rel {
        std::string type, target;
    };
    std::map<std::string, Rel> rels;
    std::string sharedPart, stylesPart;
    {
        std::string relsXml = zip.Read(relsPart);
        QoXmlScanner s(relsXml.data(), relsXml.size(), Where(relsPart));
        for (QoXmlScanner::Kind k; (k = s.Next()) != QoXmlScanner::finished;) {
            std::string_view id, type, target, mode;
            if (k != QoXmlScanner::startTag || s.Name() != "Relationship" || !s.Attribute("Id", id) ||
                !s.Attribute("Type", type) || !s.Attribute("Target", target))
                continue;
            if (s.Attribute("TargetMode", mode) && mode == "External")
                continue;
            Rel rel{std::string(type), ResolveTarget(base, Decoded(target))};
            if (EndsWith(type, "/sharedStrings"))
                sharedPart = rel.target;
            else if (EndsWith(type, "/styles"))
                stylesPart = rel.target;
            rels.emplace(Decoded(id), std::move(rel));
        }
    }

    std::string xml = zip.Read(workbook);
    QoXmlScanner s(xml.data(), xml.size(), Where(workbook));
    for (QoXmlScanner::Kind k; (k = s.Next()) != QoXmlScanner::finished;) {
        if (k != QoXmlScanner::startTag)
            continue;
        std::string_view value;
        if (s.Name() == "workbookPr") {
            date1904 = s.Attribute("date1904", value) && (value == "1" || value == "true");
        } else if (s.Name() == "sheet") {
            std::string_view name, id;
            if (!s.Attribute("name", name) || !s.Attribute("id", id))
                s.Fail("ein Tabellenblatt hat keinen Namen oder keinen Verweis");
            auto rel = rels.find(Decoded(id));
            if (rel == rels.end())
                s.Fail("der Verweis eines Tabellenblatts fehlt");
            // Chart sheets and dialog sheets hold no table.
            if (!EndsWith(rel->second.type, "/worksheet"))
                continue;
            sheets.push_back(Sheet{Ansi(Decoded(name)), rel->second.target});
        }
    }
    if (!sharedPart.empty() && zip.Has(sharedPart))
        LoadSharedStrings(sharedPart);
    if (!stylesPart.empty() && zip.Has(stylesPart))
        LoadStyles(stylesPart);
}

void CQoXlsxReader::Impl::LoadSharedStrings(std::string const &part)
{
    std::string xml = zip.Read(part);
    QoXmlScanner s(xml.data(), xml.size(), Where(part));
    std::string text;
    bool inItem = false;
    for (QoXmlScanner::Kind k; (k = s.Next()) != QoXmlScanner::finished;) {
        if (k == QoXmlScanner::startTag) {
            if (s.Name() == "si") {
                text.clear();
                inItem = !s.Empty();
                if (!inItem)
                    AddShared(text, s);
            } else if (s.Name() == "rPh" || s.Name() == "phoneticPr") {
                // Phonetic guides repeat the reading of East Asian text; they are not part of the value.
                s.SkipElement();
            } else if (s.Name() == "t" && inItem && !s.Empty()) {
                for (QoXmlScanner::Kind t; (t = s.Next()) != QoXmlScanner::endTag;)
                    if (t == QoXmlScanner::text)
                        s.AppendText(text);
                    else if (t == QoXmlScanner::startTag)
                        s.SkipElement();
            }
        } else if (k == QoXmlScanner::endTag && s.Name() == "si") {
            inItem = false;
            AddShared(text, s);
        }
    }
}

void CQoXlsxReader::Impl::AddShared(std::string &utf8Text, QoXmlScanner const &s)
{
    if (sharedEnd.size() >= maxSharedStrings)
        s.Fail("mehr als 16777216 gemeinsame Texte");
    Unescape(utf8Text);
    QoAppendUtf8AsAnsi(utf8Text, sharedText);
    // The part is at most 1 GiB and its text only shrinks on the way to Windows-1252.
    sharedEnd.push_back(std::uint32_t(sharedText.size()));
}

void CQoXlsxReader::Impl::LoadStyles(std::string const &part)
{
    std::string xml = zip.Read(part);
    QoXmlScanner s(xml.data(), xml.size(), Where(part));
    std::map<long, bool> custom;
    std::vector<long> formats;
    bool inCellXfs = false;
    for (QoXmlScanner::Kind k; (k = s.Next()) != QoXmlScanner::finished;) {
        std::string_view value;
        if (k == QoXmlScanner::startTag) {
            if (s.Name() == "numFmt") {
                std::string_view code;
                long id = 0;
                if (custom.size() >= maxStyles)
                    s.Fail("mehr als 65536 Zahlenformate");
                if (s.Attribute("numFmtId", value) && ParseLong(value, id) && s.Attribute("formatCode", code))
                    custom[id] = IsDateFormat(Decoded(code));
            } else if (s.Name() == "cellXfs") {
                inCellXfs = !s.Empty();
            } else if (s.Name() == "xf" && inCellXfs) {
                long id = 0;
                if (s.Attribute("numFmtId", value) && !ParseLong(value, id))
                    id = 0;
                if (formats.size() >= maxStyles)
                    s.Fail("mehr als 65536 Zellformate");
                formats.push_back(id);
            }
        } else if (k == QoXmlScanner::endTag && s.Name() == "cellXfs") {
            inCellXfs = false;
        }
    }
    xfIsDate.reserve(formats.size());
    for (long id : formats) {
        auto found = custom.find(id);
        xfIsDate.push_back(found != custom.end() ? found->second : IsBuiltinDateFormat(id));
    }
}

void CQoXlsxReader::Impl::StartSheet()
{
    scan.reset(new QoXmlScanner(xml.data(), xml.size(), SheetWhere()));
    sheetDone = true;
    parsedRow = 0;
    pending = false;
    for (QoXmlScanner::Kind k; (k = scan->Next()) != QoXmlScanner::finished;)
        if (k == QoXmlScanner::startTag && scan->Name() == "sheetData") {
            sheetDone = scan->Empty();
            return;
        }
}

// Appends the decoded text up to the end tag `endName` (of the element just
// started) to utf8; for <is> and <si> only the <t> elements count.
void CQoXlsxReader::Impl::CollectText(char const *endName)
{
    QoXmlScanner &s = *scan;
    bool direct = std::string_view(endName) == "v";
    int depth = s.Depth();
    for (QoXmlScanner::Kind k; (k = s.Next()) != QoXmlScanner::finished;) {
        if (k == QoXmlScanner::endTag && s.Depth() == depth)
            return;
        if (k == QoXmlScanner::text && direct)
            s.AppendText(utf8);
        else if (k == QoXmlScanner::startTag && !direct) {
            if (s.Name() == "rPh" || s.Name() == "phoneticPr")
                s.SkipElement();
            else if (s.Name() == "t" && !s.Empty()) {
                for (QoXmlScanner::Kind t; (t = s.Next()) != QoXmlScanner::endTag;) {
                    if (t == QoXmlScanner::text)
                        s.AppendText(utf8);
                    else if (t == QoXmlScanner::startTag)
                        s.SkipElement();
                }
            }
        }
    }
}

// A row without a number takes it from its first cell reference, else it
// follows the row before.
void CQoXlsxReader::Impl::ReadCell(long &row, bool &rowKnown, int &previousColumn)
{
    QoXmlScanner &s = *scan;
    std::string_view value;
    int column = previousColumn + 1;
    if (s.Attribute("r", value)) {
        long cellRow = 0;
        if (!ParseReference(value, column, cellRow))
            s.Fail(("ung\374ltiger Zellbezug \"" + std::string(value) + "\"").c_str());
        if (!rowKnown) {
            if (cellRow <= parsedRow)
                s.Fail(("Zeile " + std::to_string(cellRow) + " steht nicht in aufsteigender Reihenfolge").c_str());
            row = cellRow;
        } else if (cellRow != row) {
            s.Fail(("Zelle " + std::string(value) + " steht in Zeile " + std::to_string(row)).c_str());
        }
    }
    rowKnown = true;
    auto cellName = [&] { return ColumnName(column) + std::to_string(row); };
    if (column > maxColumn)
        s.Fail(("Zelle hinter Spalte XFD in Zeile " + std::to_string(row)).c_str());
    if (column <= previousColumn)
        s.Fail(("Zelle " + cellName() + " steht nicht in aufsteigender Reihenfolge").c_str());
    previousColumn = column;

    std::string type = s.Attribute("t", value) ? std::string(value) : std::string("n");
    bool isDate = false;
    if (s.Attribute("s", value)) {
        long style = 0;
        // An unknown style index formats as General, as Excel repairs it.
        if (ParseLong(value, style) && style >= 0 && style < long(xfIsDate.size()))
            isDate = xfIsDate[std::size_t(style)] != 0;
    }
    bool hasValue = false, hasInline = false;
    utf8.clear();
    if (!s.Empty()) {
        int depth = s.Depth();
        for (QoXmlScanner::Kind k; (k = s.Next()) != QoXmlScanner::finished;) {
            if (k == QoXmlScanner::endTag && s.Depth() == depth)
                break;
            if (k != QoXmlScanner::startTag)
                continue;
            if (s.Name() == "v") {
                hasValue = true;
                if (!s.Empty())
                    CollectText("v");
            } else if (s.Name() == "is") {
                hasInline = true;
                if (!s.Empty())
                    CollectText("is");
            } else {
                s.SkipElement();
            }
        }
    }

    if (rawCount == rawCells.size()) {
        rawCells.emplace_back();
        rawColumns.push_back(0);
    }
    Cell &cell = rawCells[rawCount];
    cell.type = Cell::typeEmpty;
    cell.number = 0;
    cell.text.Empty();
    auto bad = [&](char const *what) {
        s.Fail(("Zelle " + cellName() + ": " + what + " \"" + Ansi(utf8) + "\"").c_str());
    };
    if (type == "inlineStr") {
        if (!hasInline && !hasValue)
            return;
        cell.type = Cell::typeText;
    } else if (!hasValue) {
        return;   // formatting only, or a formula without a cached result
    } else if (type == "n") {
        if (utf8.find_first_not_of(" \t\r\n") == std::string::npos)
            return;
        if (!ParseDouble(utf8, cell.number))
            bad("keine g\374ltige Zahl");
        cell.type = isDate ? Cell::typeDate : Cell::typeNumber;
        if (isDate && date1904) {
            cell.number += days1904;
            // The 1900 system counts a 29 February 1900 that the 1904 system does not.
            if (cell.number < 61)
                cell.number -= 1;
        }
    } else if (type == "s") {
        long index = 0;
        if (!ParseLong(utf8, index) || index < 0 || index >= long(sharedEnd.size()))
            bad("Verweis auf einen nicht vorhandenen gemeinsamen Text");
        cell.type = Cell::typeText;
        std::size_t begin = index == 0 ? 0 : sharedEnd[std::size_t(index) - 1];
        cell.text.Assign(sharedText.data() + begin, sharedEnd[std::size_t(index)] - begin);
    } else if (type == "str") {
        cell.type = Cell::typeText;
    } else if (type == "b") {
        if (utf8 == "1" || utf8 == "true")
            cell.number = 1;
        else if (utf8 != "0" && utf8 != "false")
            bad("kein g\374ltiger Wahrheitswert");
        cell.type = Cell::typeBoolean;
    } else if (type == "e") {
        cell.type = Cell::typeError;
    } else if (type == "d") {
        if (!ParseIsoDate(utf8, cell.number))
            bad("kein g\374ltiges Datum");
        cell.type = Cell::typeDate;
    } else {
        s.Fail(("Zelle " + cellName() + ": unbekannter Zelltyp \"" + type + "\"").c_str());
    }
    if ((cell.type == Cell::typeText || cell.type == Cell::typeError) && type != "s") {
        if (type == "inlineStr")
            Unescape(utf8);
        std::string ansi;
        QoAppendUtf8AsAnsi(utf8, ansi);
        cell.text = CQoString(std::move(ansi));
    }
    rawColumns[rawCount++] = column;
}

// Parses the next <row> of sheetData into rawCells; false at its end.
bool CQoXlsxReader::Impl::ReadRawRow()
{
    QoXmlScanner &s = *scan;
    while (!sheetDone) {
        QoXmlScanner::Kind k = s.Next();
        if (k == QoXmlScanner::finished || (k == QoXmlScanner::endTag && s.Name() == "sheetData")) {
            sheetDone = true;
            break;
        }
        if (k != QoXmlScanner::startTag)
            continue;
        if (s.Name() != "row") {
            s.SkipElement();
            continue;
        }
        long row = parsedRow + 1;
        std::string_view value;
        bool rowKnown = s.Attribute("r", value);
        if (rowKnown && (!ParseLong(value, row) || row < 1 || row > maxRow))
            s.Fail(("ung\374ltige Zeilennummer \"" + std::string(value) + "\"").c_str());
        if (row <= parsedRow)
            s.Fail(("Zeile " + std::to_string(row) + " steht nicht in aufsteigender Reihenfolge").c_str());
        if (row > maxRow)
            s.Fail("mehr als 1048576 Zeilen");
        rawCount = 0;
        if (!s.Empty()) {
            int depth = s.Depth();
            int previousColumn = 0;
            for (QoXmlScanner::Kind c; (c = s.Next()) != QoXmlScanner::finished;) {
                if (c == QoXmlScanner::endTag && s.Depth() == depth)
                    break;
                if (c != QoXmlScanner::startTag)
                    continue;
                if (s.Name() == "c")
                    ReadCell(row, rowKnown, previousColumn);
                else
                    s.SkipElement();
            }
        }
        parsedRow = row;
        return true;
    }
    return false;
}

CQoXlsxReader::CQoXlsxReader() : m_impl(new Impl) {}
CQoXlsxReader::~CQoXlsxReader() = default;

void CQoXlsxReader::Open(char const *path)
{
    Close();
    m_impl->path = path ? path : "";
    try {
        m_impl->zip.Open(m_impl->path.c_str());
        m_impl->LoadWorkbook();
    } catch (...) {
        Close();
        throw;
    }
    m_impl->open = true;
}

void CQoXlsxReader::Close()
{
    std::string path = m_impl->path;
    m_impl.reset(new Impl);
    m_impl->path = path;
}

bool CQoXlsxReader::IsOpen() const { return m_impl->open; }
int CQoXlsxReader::SheetCount() const { return int(m_impl->sheets.size()); }
bool CQoXlsxReader::Date1904() const { return m_impl->date1904; }

CQoString CQoXlsxReader::SheetName(int index) const
{
    if (index < 0 || index >= SheetCount())
        CQoException::Throw(CQoException::indexError, m_impl->path.c_str());
    return CQoString(m_impl->sheets[std::size_t(index)].name);
}

int CQoXlsxReader::FindSheet(char const *name) const
{
    CQoString wanted(name ? name : "");
    // A sheet may itself end in '$': the name as given wins over the one without it.
    for (int pass = 0; pass < 2; ++pass) {
        if (pass == 1) {
            if (wanted.IsEmpty() || wanted.GetAt(wanted.GetLength() - 1) != '$')
                break;
            wanted = wanted.Left(wanted.GetLength() - 1);
        }
        for (int i = 0; i < SheetCount(); ++i)
            if (CQoString(m_impl->sheets[std::size_t(i)].name).CompareNoCase(wanted) == 0)
                return i;
    }
    return -1;
}

void CQoXlsxReader::OpenSheet(int index)
{
    Impl &m = *m_impl;
    if (!m.open)
        CQoException::Throw(CQoException::notOpen, m.path.c_str());
    if (index < 0 || index >= SheetCount())
        CQoException::Throw(CQoException::indexError, m.path.c_str());
    m.sheet = -1;
    m.scan.reset();
    m.xml.clear();
    m.hasRange = false;
    m.sheet = index;
    try {
        m.xml = m.zip.Read(m.sheets[std::size_t(index)].part);
        // The range is where values are: one pass over the sheet finds it.
        m.StartSheet();
        while (m.ReadRawRow())
            for (std::size_t i = 0; i < m.rawCount; ++i) {
                if (m.rawCells[i].type == Cell::typeEmpty)
                    continue;
                int col = m.rawColumns[i];
                if (!m.hasRange) {
                    m.hasRange = true;
                    m.firstRow = m.parsedRow;
                    m.firstCol = m.lastCol = col;
                }
                m.lastRow = m.parsedRow;
                m.firstCol = std::min(m.firstCol, col);
                m.lastCol = std::max(m.lastCol, col);
            }
        m.StartSheet();
        m.nextRow = m.firstRow;
    } catch (...) {
        m.sheet = -1;
        m.scan.reset();
        m.xml.clear();
        m.xml.shrink_to_fit();
        m.hasRange = false;
        throw;
    }
}

void CQoXlsxReader::RewindSheet()
{
    Impl &m = *m_impl;
    if (m.sheet < 0)
        CQoException::Throw(CQoException::notOpen, m.path.c_str());
    m.StartSheet();
    m.nextRow = m.firstRow;
}

bool CQoXlsxReader::NextRow(std::vector<Cell> &row)
{
    Impl &m = *m_impl;
    if (m.sheet < 0)
        CQoException::Throw(CQoException::notOpen, m.path.c_str());
    if (!m.hasRange || m.nextRow > m.lastRow)
        return false;
    while (!m.pending || m.parsedRow < m.nextRow) {
        if (!m.ReadRawRow())
            break;
        m.pending = true;
    }
    row.resize(std::size_t(ColumnCount()));
    for (Cell &cell : row) {
        cell.type = Cell::typeEmpty;
        cell.number = 0;
        cell.text.Empty();
    }
    if (m.pending && m.parsedRow == m.nextRow) {
        for (std::size_t i = 0; i < m.rawCount; ++i) {
            Cell &from = m.rawCells[i];
            if (from.type == Cell::typeEmpty)
                continue;
            Cell &to = row[std::size_t(m.rawColumns[i] - m.firstCol)];
            to.type = from.type;
            to.number = from.number;
            std::swap(to.text, from.text);
        }
        m.pending = false;
    }
    ++m.nextRow;
    return true;
}

int CQoXlsxReader::ColumnCount() const
{
    return m_impl->hasRange ? m_impl->lastCol - m_impl->firstCol + 1 : 0;
}

long CQoXlsxReader::RowCount() { return m_impl->hasRange ? m_impl->lastRow - m_impl->firstRow + 1 : 0; }
long CQoXlsxReader::FirstRowNumber() const { return m_impl->hasRange ? m_impl->firstRow : 0; }
int CQoXlsxReader::FirstColumnNumber() const { return m_impl->hasRange ? m_impl->firstCol : 0; }

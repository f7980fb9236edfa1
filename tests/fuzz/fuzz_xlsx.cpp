// Fuzz target of the workbook reader: any bytes must give either the sheets
// of a workbook or a CQoException - never a crash, a hang or an allocation
// beyond the reader's bounds. Rows must agree with the reader's own counts
// and read the same after a rewind.
//
// The first byte picks how the rest is used. Even: the rest is the file, so
// the zip container itself is fuzzed. Odd: the rest is the XML of the parts,
// separated by 0xFF bytes, packed here into a valid stored zip; a mutated
// part would otherwise almost always fail its CRC and the XML would stay
// unexplored.
#include "CQoException.h"
#include "CQoXlsxReader.h"
#include "FuzzSupport.h"

#include <zlib.h>

#include <cstdint>
#include <cstdlib>
#include <initializer_list>
#include <string>
#include <vector>

namespace {

using Cell = CQoXlsxReader::Cell;

char const *const partNames[] = {
    "[Content_Types].xml", "xl/workbook.xml",         "xl/_rels/workbook.xml.rels", "xl/sharedStrings.xml",
    "xl/styles.xml",       "xl/worksheets/sheet1.xml", "xl/worksheets/sheet2.xml",
};

// Little-endian fields of `bytes` bytes each.
void Put(std::string &out, std::initializer_list<unsigned long> values, int bytes)
{
    for (unsigned long v : values)
        for (int b = 0; b < bytes; ++b)
            out += char((v >> (8 * b)) & 0xFF);
}

// A zip of stored members with correct CRCs and sizes.
std::string StoredZip(std::vector<std::string> const &parts)
{
    std::string file, directory;
    unsigned long count = 0;
    for (std::size_t i = 0; i < parts.size() && i < sizeof partNames / sizeof *partNames; ++i) {
        std::string const name = partNames[i], &body = parts[i];
        unsigned long const crc = crc32(0L, reinterpret_cast<Bytef const *>(body.data()), uInt(body.size()));
        unsigned long const offset = file.size();
        // version, flags, method (stored), time and date; CRC and both sizes; the name's length
        Put(file, {0x04034b50}, 4);
        Put(file, {20, 0, 0, 0, 0}, 2);
        Put(file, {crc, body.size(), body.size()}, 4);
        Put(file, {name.size(), 0}, 2);
        file += name + body;
        Put(directory, {0x02014b50}, 4);
        Put(directory, {20, 20, 0, 0, 0, 0}, 2);
        Put(directory, {crc, body.size(), body.size()}, 4);
        Put(directory, {name.size(), 0, 0, 0, 0}, 2);
        Put(directory, {0, offset}, 4);
        directory += name;
        ++count;
    }
    unsigned long const directoryOffset = file.size();
    file += directory;
    Put(file, {0x06054b50}, 4);
    Put(file, {0, 0, count, count}, 2);
    Put(file, {directory.size(), directoryOffset}, 4);
    Put(file, {0}, 2);
    return file;
}

std::string Key(std::vector<Cell> const &row)
{
    std::string key;
    for (Cell const &c : row)
        key += std::to_string(c.type) + ":" + std::to_string(c.number) + ":" + std::string(c.text.Str()) + "|";
    return key;
}

void ReadSheet(CQoXlsxReader &reader, int sheet)
{
    try {
        reader.OpenSheet(sheet);
    } catch (CQoException const &) {
        return;
    }
    long const rows = reader.RowCount();
    int const columns = reader.ColumnCount();
    if (rows < 0 || columns < 0 || (rows == 0) != (columns == 0))
        std::abort();
    std::vector<Cell> row;
    std::vector<std::string> first;
    long read = 0;
    try {
        // A tiny sheet may span a million rows of 16384 cells: read a slice.
        while (read < 300 && reader.NextRow(row)) {
            if (int(row.size()) != columns)
                std::abort();
            first.push_back(Key(row));
            ++read;
        }
    } catch (CQoException const &) {
        return;
    }
    if (read < 300 && read != rows)
        std::abort();
    reader.RewindSheet();
    for (std::string const &expected : first)
        if (!reader.NextRow(row) || Key(row) != expected)
            std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size)
{
    if (size < 1)
        return 0;
    std::string path;
    if (data[0] & 1) {
        std::vector<std::string> parts(1);
        for (std::size_t i = 1; i < size; ++i) {
            if (data[i] == 0xFF)
                parts.emplace_back();
            else
                parts.back() += char(data[i]);
        }
        std::string zip = StoredZip(parts);
        path = fuzz::WriteFile("fuzz_xlsx", reinterpret_cast<std::uint8_t const *>(zip.data()), zip.size());
    } else {
        path = fuzz::WriteFile("fuzz_xlsx", data + 1, size - 1);
    }
    CQoXlsxReader reader;
    try {
        reader.Open(path.c_str());
    } catch (CQoException const &) {
        return 0;
    }
    for (int sheet = 0; sheet < reader.SheetCount(); ++sheet) {
        if (reader.FindSheet((reader.SheetName(sheet) + "$").GetString()) < 0)
            std::abort();
        ReadSheet(reader, sheet);
    }
    return 0;
}

#include "DbaseFormat.h"

#include "CQoException.h"
#include "CQoFile.h"

#include <cstdarg>
#include <cstdio>
#include <ctime>

namespace qodbase {

namespace {

[[noreturn]] void Bad(char const *fileName, char const *format, ...)
{
    char text[300];
    va_list args;
    va_start(args, format);
    std::vsnprintf(text, sizeof text, format, args);
    va_end(args);
    CQoException::Throw(text, fileName);
}

bool KnownType(char type)
{
    return type == 'C' || type == 'N' || type == 'F' || type == 'D' || type == 'L' || type == 'M';
}

} // namespace

int HeaderLength(unsigned char const *first32) { return Get16(first32 + 8); }

void ParseHeader(unsigned char const *data, std::size_t size, char const *fileName, Header &header)
{
    header = Header();
    if (size < headerSize)
        Bad(fileName, "Die Datei ist zu kurz f\374r einen dBase-Dateikopf (%u Bytes)", unsigned(size));
    header.version = data[0];
    if ((header.version & 0x07) != 3 && (header.version & 0x07) != 4)
        Bad(fileName, "Keine dBase III/IV-Datei (Kennung 0x%02X)", header.version);
    header.year = 1900 + data[1];
    header.month = data[2];
    header.day = data[3];
    header.recordCount = Get32(data + 4);
    header.headerLength = Get16(data + 8);
    header.recordLength = Get16(data + 10);
    header.languageDriver = data[29];
    if (header.headerLength < headerSize + 1)
        Bad(fileName, "Ung\374ltige L\344nge des dBase-Dateikopfs (%d)", header.headerLength);
    if (std::size_t(header.headerLength) > size)
        Bad(fileName, "Der dBase-Dateikopf ist abgeschnitten (%d Bytes angegeben, %u vorhanden)",
            header.headerLength, unsigned(size));
    if (header.recordLength < 2)
        Bad(fileName, "Ung\374ltige Satzl\344nge im dBase-Dateikopf (%d)", header.recordLength);

    int offset = 1; // byte 0 of a record is the deleted flag
    int pos = headerSize;
    while (pos < header.headerLength && data[pos] != fieldTerminator) {
        if (pos + descriptorSize > header.headerLength)
            Bad(fileName, "Die Beschreibung des Feldes %d ist abgeschnitten", int(header.fields.size()) + 1);
        unsigned char const *d = data + pos;
        int nameLength = 0;
        while (nameLength < 11 && d[nameLength] != 0)
            ++nameLength;
        CQoString name(reinterpret_cast<char const *>(d), nameLength);
        name.Trim();
        char type = static_cast<char>(d[11]);
        int length = d[16];
        int decimals = d[17];
        int number = int(header.fields.size()) + 1;
        if (name.IsEmpty())
            name.Format("FELD%d", number);
        if (!KnownType(type))
            Bad(fileName, "Feld %s: der Feldtyp 0x%02X wird nicht unterst\374tzt", name.GetString(),
                static_cast<unsigned char>(type));
        if (length == 0)
            Bad(fileName, "Feld %s hat die L\344nge 0", name.GetString());
        header.fields.emplace_back(name, type, length, decimals);
        header.offsets.push_back(offset);
        offset += length;
        pos += descriptorSize;
    }
    if (pos >= header.headerLength)
        Bad(fileName, "Die Feldbeschreibungen enden nicht mit der Endemarke 0x0D (Dateikopf %d Bytes)",
            header.headerLength);
    if (header.fields.empty())
        Bad(fileName, "Die dBase-Datei beschreibt keine Felder");
    if (offset > header.recordLength)
        Bad(fileName, "Die Felder (%d Bytes) passen nicht in die Satzl\344nge %d", offset, header.recordLength);
}

std::string BuildHeader(Header &header)
{
    int count = int(header.fields.size());
    header.headerLength = headerSize + count * descriptorSize + 1;
    header.offsets.clear();
    int offset = 1;
    for (CDbaseField const &field : header.fields) {
        header.offsets.push_back(offset);
        offset += field.Length();
    }
    header.recordLength = offset;
    if (header.year == 0) {
        std::time_t now = std::time(nullptr);
        std::tm parts{};
#ifdef _WIN32
        localtime_s(&parts, &now);
#else
        localtime_r(&now, &parts);
#endif
        header.year = 1900 + parts.tm_year;
        header.month = parts.tm_mon + 1;
        header.day = parts.tm_mday;
    }

    std::string bytes(std::size_t(header.headerLength), '\0');
    auto *p = reinterpret_cast<unsigned char *>(&bytes[0]);
    p[0] = header.version;
    p[1] = static_cast<unsigned char>(header.year - 1900);
    p[2] = static_cast<unsigned char>(header.month);
    p[3] = static_cast<unsigned char>(header.day);
    Put32(p + 4, header.recordCount);
    Put16(p + 8, header.headerLength);
    Put16(p + 10, header.recordLength);
    p[29] = header.languageDriver;
    for (int i = 0; i < count; ++i) {
        unsigned char *d = p + headerSize + i * descriptorSize;
        CQoString const &name = header.fields[std::size_t(i)].Name();
        for (int k = 0; k < name.GetLength() && k < CDbaseField::maxNameLength; ++k)
            d[k] = static_cast<unsigned char>(name.GetAt(k));
        d[11] = static_cast<unsigned char>(header.fields[std::size_t(i)].Type());
        d[16] = static_cast<unsigned char>(header.fields[std::size_t(i)].Length());
        d[17] = static_cast<unsigned char>(header.fields[std::size_t(i)].Decimals());
    }
    p[header.headerLength - 1] = fieldTerminator;
    return bytes;
}

int CharSetOfLanguageDriver(unsigned char driver, int fallback)
{
    switch (driver) {
    case 0x01: // DOS USA (437): the German letters sit where 850 has them
    case 0x02: // DOS international (850)
    case 0x37: // DOS English, secondary (850)
        return CQoFile::ascii;
    case 0x03: // Windows ANSI
    case 0x57: // ANSI (1252)
    case 0x58: // Western European ANSI
    case 0x59: // Spanish ANSI
        return CQoFile::ansi;
    default:
        return fallback;
    }
}

unsigned char LanguageDriverOfCharSet(int charSet) { return charSet == CQoFile::ascii ? 0x02 : 0x03; }

} // namespace qodbase

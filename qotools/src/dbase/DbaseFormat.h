// The dBase III/IV file layout, shared by the dBase input and output filters.
// Not part of the library's interface.
//
//   header      32 bytes: version, date of last change (YY-1900, MM, DD),
//               record count (32 bit), header length (16 bit), record length
//               (16 bit), ..., language driver (byte 29)
//   fields      32 bytes each: name (11 bytes, NUL padded), type letter,
//               4 bytes unused, length, decimals, 14 bytes unused
//   0x0D        end of the field descriptions
//   records     record length bytes each: the deleted flag (' ' or '*'),
//               then the fields one after another, without separators
//   0x1A        end of the file (optional)
// All numbers little endian.
#pragma once

#include "CDbaseField.h"

#include <cstdint>
#include <string>
#include <vector>

namespace qodbase {

enum {
    headerSize = 32,
    descriptorSize = 32,
    fieldTerminator = 0x0D,
    endOfFile = 0x1A,
    deletedFlag = '*',
    liveFlag = ' ',
    maxFields = 255        // dBase IV's limit; the header length has 16 bits
};

struct Header {
    unsigned char version = 0x03;
    int year = 0, month = 0, day = 0;          // date of the last change
    std::uint32_t recordCount = 0;             // as declared in the file
    int headerLength = 0;
    int recordLength = 0;
    unsigned char languageDriver = 0;
    std::vector<CDbaseField> fields;
    std::vector<int> offsets;                  // start of each field in a record (the flag is byte 0)
};

// Bytes 4-11 of the first 32 bytes: the record count, header length and
// record length, enough to know how much of the file is header.
int HeaderLength(unsigned char const *first32);

// Parses a complete header (`size` bytes, at least its declared length).
// Raises CQoException (formatError text) naming `fileName` for anything that
// is not a readable dBase III/IV header.
void ParseHeader(unsigned char const *data, std::size_t size, char const *fileName, Header &header);

// The header bytes for `fields` (already checked with CDbaseField::Problem),
// including the 0x0D terminator; fills offsets, lengths and the date.
std::string BuildHeader(Header &header);

// Character set of the records by the file's language driver byte; `fallback`
// for a file that declares none (or one the library does not know).
int CharSetOfLanguageDriver(unsigned char driver, int fallback);
unsigned char LanguageDriverOfCharSet(int charSet);

// Little-endian helpers.
inline std::uint32_t Get32(unsigned char const *p)
{
    return std::uint32_t(p[0]) | std::uint32_t(p[1]) << 8 | std::uint32_t(p[2]) << 16 | std::uint32_t(p[3]) << 24;
}
inline int Get16(unsigned char const *p) { return int(p[0]) | int(p[1]) << 8; }
inline void Put32(unsigned char *p, std::uint32_t v)
{
    p[0] = static_cast<unsigned char>(v);
    p[1] = static_cast<unsigned char>(v >> 8);
    p[2] = static_cast<unsigned char>(v >> 16);
    p[3] = static_cast<unsigned char>(v >> 24);
}
inline void Put16(unsigned char *p, int v)
{
    p[0] = static_cast<unsigned char>(v);
    p[1] = static_cast<unsigned char>(v >> 8);
}

} // namespace qodbase

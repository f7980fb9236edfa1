#include "CQoFile.h"

#include "QoBytes.h"

#include "CQoException.h"
#include "QoPathParts.h"

#include <cerrno>
#include <cstring>
#include <string>
#include <vector>
#include <sys/stat.h>

#ifdef _WIN32
#include <io.h>
#include <windows.h>
#else
#include <unistd.h>
#endif

namespace {

// DOS code page 850 -> Windows-1252 for the bytes 0x80-0xFF. Characters that
// Windows-1252 lacks (box drawing, shades, dotless i, ...) get their nearest
// plain form, see the header.
unsigned char const kDos850ToAnsi[128] = {
    0xC7, 0xFC, 0xE9, 0xE2, 0xE4, 0xE0, 0xE5, 0xE7, 0xEA, 0xEB, 0xE8, 0xEF, 0xEE, 0xEC, 0xC4, 0xC5,  // 0x80
    0xC9, 0xE6, 0xC6, 0xF4, 0xF6, 0xF2, 0xFB, 0xF9, 0xFF, 0xD6, 0xDC, 0xF8, 0xA3, 0xD8, 0xD7, 0x83,  // 0x90
    0xE1, 0xED, 0xF3, 0xFA, 0xF1, 0xD1, 0xAA, 0xBA, 0xBF, 0xAE, 0xAC, 0xBD, 0xBC, 0xA1, 0xAB, 0xBB,  // 0xA0
    0x23, 0x23, 0x23, 0x7C, 0x2B, 0xC1, 0xC2, 0xC0, 0xA9, 0x2B, 0x7C, 0x2B, 0x2B, 0xA2, 0xA5, 0x2B,  // 0xB0
    0x2B, 0x2B, 0x2B, 0x2B, 0x2D, 0x2B, 0xE3, 0xC3, 0x2B, 0x2B, 0x2B, 0x2B, 0x2B, 0x2D, 0x2B, 0xA4,  // 0xC0
    0xF0, 0xD0, 0xCA, 0xCB, 0xC8, 0x69, 0xCD, 0xCE, 0xCF, 0x2B, 0x2B, 0x23, 0x23, 0xA6, 0xCC, 0x23,  // 0xD0
    0xD3, 0xDF, 0xD4, 0xD2, 0xF5, 0xD5, 0xB5, 0xFE, 0xDE, 0xDA, 0xDB, 0xD9, 0xFD, 0xDD, 0xAF, 0xB4,  // 0xE0
    0xAD, 0xB1, 0x3D, 0xBE, 0xB6, 0xA7, 0xF7, 0xB8, 0xB0, 0xA8, 0xB7, 0xB9, 0xB3, 0xB2, 0x3F, 0xA0,  // 0xF0
};

// Windows-1252 -> DOS code page 850 for the bytes 0x80-0xFF. Every character
// that exists in both maps back exactly; the typographic characters of the
// 0x80 row get their plain forms, the five unassigned bytes '?'.
unsigned char const kAnsiToDos850[128] = {
    0x45, 0x3F, 0x27, 0x9F, 0x22, 0x2E, 0x2B, 0x2B, 0x5E, 0x25, 0x53, 0x3C, 0x4F, 0x3F, 0x5A, 0x3F,  // 0x80
    0x3F, 0x27, 0x27, 0x22, 0x22, 0x2A, 0x2D, 0x2D, 0x7E, 0x54, 0x73, 0x3E, 0x6F, 0x3F, 0x7A, 0x59,  // 0x90
    0xFF, 0xAD, 0xBD, 0x9C, 0xCF, 0xBE, 0xDD, 0xF5, 0xF9, 0xB8, 0xA6, 0xAE, 0xAA, 0xF0, 0xA9, 0xEE,  // 0xA0
    0xF8, 0xF1, 0xFD, 0xFC, 0xEF, 0xE6, 0xF4, 0xFA, 0xF7, 0xFB, 0xA7, 0xAF, 0xAC, 0xAB, 0xF3, 0xA8,  // 0xB0
    0xB7, 0xB5, 0xB6, 0xC7, 0x8E, 0x8F, 0x92, 0x80, 0xD4, 0x90, 0xD2, 0xD3, 0xDE, 0xD6, 0xD7, 0xD8,  // 0xC0
    0xD1, 0xA5, 0xE3, 0xE0, 0xE2, 0xE5, 0x99, 0x9E, 0x9D, 0xEB, 0xE9, 0xEA, 0x9A, 0xED, 0xE8, 0xE1,  // 0xD0
    0x85, 0xA0, 0x83, 0xC6, 0x84, 0x86, 0x91, 0x87, 0x8A, 0x82, 0x88, 0x89, 0x8D, 0xA1, 0x8C, 0x8B,  // 0xE0
    0xD0, 0xA4, 0x95, 0xA2, 0x93, 0xE4, 0x94, 0xF6, 0x9B, 0x97, 0xA3, 0x96, 0x81, 0xEC, 0xE7, 0x98,  // 0xF0
};

// Mixed files: only the DOS umlauts and ß are taken as DOS characters; every
// other byte is Windows-1252. (0x81 and 0x8D are unassigned in Windows-1252, and
// 0x84 0x94 0x8E 0x99 0x9A 0xE1 are rare typographic or accented characters there,
// so the umlauts win.)
struct MixTable {
    unsigned char map[256];
    MixTable()
    {
        for (int c = 0; c < 256; ++c)
            map[c] = static_cast<unsigned char>(c);
        for (int c : {0x84, 0x94, 0x81, 0x8E, 0x99, 0x9A, 0xE1})
            map[c] = kDos850ToAnsi[c - 0x80];
    }
};

MixTable const kMix;

// Writing to a DOS file as a full byte table, so that the write loop needs no
// branch per byte.
struct DosOutTable {
    unsigned char map[256];
    DosOutTable()
    {
        for (int c = 0; c < 256; ++c)
            map[c] = static_cast<unsigned char>(c < 0x80 ? c : kAnsiToDos850[c - 0x80]);
    }
};

DosOutTable const kDosOut;

int CharSetOfMode(int mode)
{
    if (mode & CQoFile::ascii)
        return CQoFile::ascii;
    if (mode & CQoFile::ansimix)
        return CQoFile::ansimix;
    return CQoFile::ansi;
}

int SeekRaw(std::FILE *fp, std::int64_t offset, int origin)
{
#ifdef _WIN32
    return _fseeki64(fp, offset, origin);
#else
    return fseeko(fp, static_cast<off_t>(offset), origin);
#endif
}

std::int64_t TellRaw(std::FILE *fp)
{
#ifdef _WIN32
    return _ftelli64(fp);
#else
    return static_cast<std::int64_t>(ftello(fp));
#endif
}

#ifdef _WIN32
// The wide form of a path for the file functions. Past the old 260-character
// limit an absolute path gets the \\?\ prefix (the limit does not apply to
// it), so that a long output path works wherever the same input path does.
std::wstring WidePath(char const *path)
{
    int n = MultiByteToWideChar(CP_ACP, 0, path, -1, nullptr, 0);
    if (n <= 0)
        return std::wstring();
    std::wstring wide(static_cast<std::size_t>(n), L'\0');
    MultiByteToWideChar(CP_ACP, 0, path, -1, &wide[0], n);
    wide.resize(static_cast<std::size_t>(n - 1));
    // A temporary name beside the file adds up to 20 characters.
    if (wide.size() < MAX_PATH - 20 || wide.compare(0, 4, L"\\\\?\\") == 0)
        return wide;
    DWORD need = GetFullPathNameW(wide.c_str(), 0, nullptr, nullptr);
    if (need == 0)
        return wide;
    std::wstring full(need, L'\0');
    DWORD got = GetFullPathNameW(wide.c_str(), need, &full[0], nullptr);
    if (got == 0 || got >= need)
        return wide;
    full.resize(got);
    for (wchar_t &c : full)
        if (c == L'/')
            c = L'\\';
    if (full.compare(0, 2, L"\\\\") == 0)
        return L"\\\\?\\UNC\\" + full.substr(2);
    if (full.size() >= 3 && full[1] == L':' && full[2] == L'\\')
        return L"\\\\?\\" + full;
    return wide;
}
#endif

std::FILE *OpenStream(char const *path, char const *how)
{
#ifdef _WIN32
    wchar_t wideHow[8] = {};
    for (std::size_t i = 0; how[i] && i + 1 < sizeof wideHow / sizeof *wideHow; ++i)
        wideHow[i] = static_cast<wchar_t>(how[i]);
    return _wfopen(WidePath(path).c_str(), wideHow);
#else
    return std::fopen(path, how);
#endif
}

// A target that must not be written: read-only (Windows refuses to replace
// it, Wine's MoveFileEx does not), or natively without any write permission.
bool IsWriteProtected(char const *path)
{
#ifdef _WIN32
    DWORD attributes = GetFileAttributesW(WidePath(path).c_str());
    return attributes != INVALID_FILE_ATTRIBUTES && !(attributes & FILE_ATTRIBUTE_DIRECTORY)
           && (attributes & FILE_ATTRIBUTE_READONLY);
#else
    struct stat info;
    return stat(path, &info) == 0 && S_ISREG(info.st_mode) && !(info.st_mode & (S_IWUSR | S_IWGRP | S_IWOTH));
#endif
}

constexpr std::size_t kBlock = 64 * 1024;
// After a jump the buffer is refilled with this much first, and with twice as
// much on every following refill up to the buffer's size: reading a record
// at a random place costs a small read, reading on from there soon reads
// whole buffers again.
constexpr std::size_t kFirstFill = 4096;

} // namespace

// ---------------------------------------------------------------------------
// construction

CQoFile::CQoFile(int bufferBlocks)
    : m_bufferSize(static_cast<std::size_t>(bufferBlocks < 1 ? 1 : bufferBlocks) * kBlock),
      m_fillSize(kFirstFill)
{
}

CQoFile::CQoFile(char const *path, int mode, int bufferBlocks) : CQoFile(bufferBlocks)
{
    Open(path, mode);
}

CQoFile::~CQoFile()
{
    CloseQuietly();
}

void CQoFile::Fail(int code) const
{
    CQoException::Throw(code, m_name.c_str());
}

// ---------------------------------------------------------------------------
// opening and closing

bool CQoFile::Open(char const *path, int mode)
{
    Close();
    if (!path || !*path)
        return false;

    bool const wantWrite = (mode & (write | create)) != 0;
    bool const wantRead = (mode & read) != 0 || !wantWrite;
    std::FILE *fp = nullptr;
    if (mode & create) {
        fp = OpenStream(path, wantRead ? "w+b" : "wb");
    } else if (wantWrite) {
        // Keep an existing file; create a missing one.
        fp = OpenStream(path, "r+b");
        if (!fp && errno == ENOENT)
            fp = OpenStream(path, "w+b");
    } else {
        fp = OpenStream(path, "rb");
    }
    if (!fp)
        return false;

#ifndef _WIN32
    // fopen opens a folder for reading here; it is not a file, though.
    struct stat info;
    if (fstat(fileno(fp), &info) != 0 || S_ISDIR(info.st_mode)) {
        std::fclose(fp);
        return false;
    }
    bool const positioned = S_ISREG(info.st_mode);
#else
    // Positioned reads (ReadFile with an offset) take the slow asynchronous
    // path under Wine; a seek and a plain read are much cheaper there.
    bool const positioned = false;
#endif
    // We buffer ourselves; a second buffer in stdio would only copy.
    std::setvbuf(fp, nullptr, _IONBF, 0);

    std::int64_t position = 0;
    if (wantWrite && !(mode & create) && !(mode & begin)) {
        if (SeekRaw(fp, 0, SEEK_END) != 0) {
            std::fclose(fp);
            return false;
        }
        position = TellRaw(fp);
    }

    if (!m_buffer)
        m_buffer.reset(new char[m_bufferSize]);
    m_fp = fp;
    m_name = path;
    m_mode = mode | (wantRead ? read : 0) | (wantWrite ? write : 0);
    m_charSet = CharSetOfMode(mode);
    m_pos = m_end = 0;
    m_filePos = position;
    m_state = idle;
    m_lastWasCR = false;
    m_fillSize = kFirstFill;
    m_positioned = positioned;
    m_systemPosStale = false;
    return true;
}

void CQoFile::OpenOrThrow(char const *path, int mode)
{
    if (Open(path, mode))
        return;
    bool missing = !(mode & (write | create)) && !Exists(path);
    CQoException::Throw(missing ? CQoException::fileNotFound : CQoException::cannotOpen, path);
}

void CQoFile::Close()
{
    if (!m_fp)
        return;
    bool failed = false;
    try {
        FlushBuffer();
    } catch (CQoException const &) {
        failed = true;
    }
    if (std::fclose(m_fp) != 0 && (m_mode & write))
        failed = true;
    m_fp = nullptr;
    m_pos = m_end = 0;
    m_state = idle;
    if (failed)
        Fail(CQoException::writeError);
}

void CQoFile::CloseQuietly()
{
    try {
        Close();
    } catch (CQoException const &) {
        // A destructor must not throw; callers that care call Close themselves.
    }
}

void CQoFile::FileCharSet(int charSet)
{
    if (charSet == ansi || charSet == ascii || charSet == ansimix)
        m_charSet = charSet;
}

// ---------------------------------------------------------------------------
// buffer handling

void CQoFile::FlushBuffer()
{
    if (m_state != writing || m_end == 0)
        return;
    std::size_t pending = m_end;
    m_end = 0;
    SyncSystemPosition();
    std::size_t written = std::fwrite(m_buffer.get(), 1, pending, m_fp);
    m_filePos += static_cast<std::int64_t>(written);
    if (written != pending)
        Fail(CQoException::writeError);
}

void CQoFile::SwitchTo(state wanted)
{
    if (m_state == wanted)
        return;
    if (m_state == writing)
        FlushBuffer();
    // The C library wants a seek between reading and writing; it also puts
    // the system position back where the caller is (unread buffer dropped).
    std::int64_t logical = Tell();
    if (m_state != idle) {
        if (m_positioned)
            m_systemPosStale = true;
        else if (SeekRaw(m_fp, logical, SEEK_SET) != 0)
            Fail(CQoException::seekError);
    }
    m_filePos = logical;
    m_pos = m_end = 0;
    m_bufferConverted = false;
    m_state = wanted;
}

bool CQoFile::FillBuffer(bool throwOnError)
{
    m_pos = m_end = 0;
    m_bufferConverted = false;
    std::size_t want = m_fillSize < m_bufferSize ? m_fillSize : m_bufferSize;
    if (m_fillSize < m_bufferSize)
        m_fillSize *= 2;
    bool failed = false;
    std::size_t got = RawRead(m_buffer.get(), want, failed);
    if (failed) {
        if (throwOnError)
            Fail(CQoException::readError);
        return false;
    }
    m_end = got;
    return got > 0;
}

std::size_t CQoFile::RawRead(void *buffer, std::size_t count, bool &failed)
{
    failed = false;
    if (!m_positioned) {
        std::size_t n = std::fread(buffer, 1, count, m_fp);
        if (n == 0 && std::ferror(m_fp)) {
            std::clearerr(m_fp);
            failed = true;
        }
        m_filePos += static_cast<std::int64_t>(n);
        return n;
    }
#ifdef _WIN32
    return 0; // not reached: no file is positioned here (see Open)
#else
    // A disk file: read at m_filePos without moving the system's position,
    // one call instead of a seek and a read.
    char *out = static_cast<char *>(buffer);
    std::size_t got = 0;
    bool error = false;
    while (got < count) {
        ssize_t n = pread(fileno(m_fp), out + got, count - got, static_cast<off_t>(m_filePos));
        if (n < 0) {
            if (errno == EINTR)
                continue;
            error = true;
            break;
        }
        if (n == 0)
            break;
        got += static_cast<std::size_t>(n);
        m_filePos += static_cast<std::int64_t>(n);
    }
    m_systemPosStale = true;
    failed = error && got == 0;
    return got;
#endif
}

void CQoFile::SyncSystemPosition()
{
    if (!m_systemPosStale)
        return;
    if (SeekRaw(m_fp, m_filePos, SEEK_SET) != 0)
        Fail(CQoException::seekError);
    m_systemPosStale = false;
}

void CQoFile::ConvertIn(char *data, std::size_t count) const
{
    ConvertToAnsi(m_charSet, data, count);
}

void CQoFile::ConvertToAnsi(int charSet, char *data, std::size_t count)
{
    if (charSet != ascii && charSet != ansimix)
        return;
    auto *p = reinterpret_cast<unsigned char *>(data);
    if (charSet == ascii) {
        for (std::size_t i = 0; i < count; ++i)
            if (p[i] >= 0x80)
                p[i] = kDos850ToAnsi[p[i] - 0x80];
    } else {
        for (std::size_t i = 0; i < count; ++i)
            p[i] = kMix.map[p[i]];
    }
}

// ---------------------------------------------------------------------------
// reading

std::size_t CQoFile::Read(void *buffer, std::size_t count, bool throwOnError)
{
    if (!m_fp || !(m_mode & read)) {
        if (throwOnError)
            Fail(m_fp ? CQoException::readError : CQoException::notOpen);
        return 0;
    }
    SwitchTo(reading);
    char *out = static_cast<char *>(buffer);
    std::size_t got = 0;
    bool const text = !(m_mode & binary);
    while (got < count) {
        if (m_pos == m_end) {
            if (!text && count - got >= (m_fillSize < m_bufferSize ? m_fillSize : m_bufferSize)) {
                // Binary reads at least as large as the next refill go
                // straight into the caller's memory. The buffer no longer
                // ends at the file position then: empty it, so that a Seek
                // does not take its bytes for the ones just read.
                m_pos = m_end = 0;
                bool failed = false;
                std::size_t n = RawRead(out + got, count - got, failed);
                if (failed) {
                    if (throwOnError)
                        Fail(CQoException::readError);
                    break;
                }
                got += n;
                if (n == 0)
                    break;
                continue;
            }
            if (!FillBuffer(throwOnError))
                break;
        }
        char const *src = m_buffer.get() + m_pos;
        std::size_t avail = m_end - m_pos;
        std::size_t want = count - got;
        if (!text) {
            std::size_t n = avail < want ? avail : want;
            std::memcpy(out + got, src, n);
            m_pos += n;
            got += n;
            continue;
        }
        // Text mode: copy up to the next CR, then decide whether it starts CR LF.
        std::size_t n = avail < want ? avail : want;
        void const *cr = std::memchr(src, '\r', n);
        std::size_t plain = cr ? static_cast<std::size_t>(static_cast<char const *>(cr) - src) : n;
        std::memcpy(out + got, src, plain);
        m_pos += plain;
        got += plain;
        if (!cr)
            continue;
        ++m_pos; // the CR
        if (m_pos == m_end && !FillBuffer(throwOnError)) {
            out[got++] = '\r'; // CR at the end of the file stays
            break;
        }
        if (m_buffer[m_pos] != '\n')
            out[got++] = '\r';
        // A CR LF pair: the LF is copied as the next byte.
    }
    ConvertIn(out, got);
    return got;
}

bool CQoFile::ReadString(CQoString &line, bool throwOnError)
{
    line.Empty();
    if (!m_fp || !(m_mode & read)) {
        if (throwOnError)
            Fail(m_fp ? CQoException::readError : CQoException::notOpen);
        return false;
    }
    SwitchTo(reading);
    bool any = false;
    for (;;) {
        if (m_pos == m_end && !FillBuffer(throwOnError))
            break;
        char *start = m_buffer.get() + m_pos;
        std::size_t avail = m_end - m_pos;
        any = true;
        // CR LF, LF and CR all end a line.
        char *lf = static_cast<char *>(std::memchr(start, '\n', avail));
        char *cr = static_cast<char *>(std::memchr(start, '\r', lf ? static_cast<std::size_t>(lf - start) : avail));
        char *stop = cr ? cr : lf;
        std::size_t n = stop ? static_cast<std::size_t>(stop - start) : avail;
        // Converting in place is safe: these bytes are consumed now, and a
        // later Seek drops the buffer.
        if (m_charSet != ansi) {
            ConvertIn(start, n);
            m_bufferConverted = true;
        }
        line.Append(start, n);
        if (!stop) {
            m_pos = m_end;
            continue;
        }
        m_pos += n + 1;
        // The LF of a CR LF may wait in the next block.
        if (cr && (m_pos < m_end || FillBuffer(throwOnError)) && m_buffer[m_pos] == '\n')
            ++m_pos;
        break;
    }
    return any;
}

// ---------------------------------------------------------------------------
// writing

void CQoFile::Write(void const *data, std::size_t count)
{
    if (!m_fp)
        Fail(CQoException::notOpen);
    if (!(m_mode & write))
        Fail(CQoException::writeError);
    if (count == 0)
        return;
    SwitchTo(writing);
    auto const *src = static_cast<unsigned char const *>(data);
    bool const text = !(m_mode & binary);
    bool const dos = m_charSet == ascii;

    if (!text && !dos) {
        if (count >= m_bufferSize) {
            FlushBuffer();
            SyncSystemPosition();
            std::size_t written = std::fwrite(src, 1, count, m_fp);
            m_filePos += static_cast<std::int64_t>(written);
            if (written != count)
                Fail(CQoException::writeError);
            return;
        }
        while (count > 0) {
            std::size_t room = m_bufferSize - m_end;
            std::size_t n = count < room ? count : room;
            qobytes::Copy(m_buffer.get() + m_end, src, n);
            m_end += n;
            src += n;
            count -= n;
            if (m_end == m_bufferSize)
                FlushBuffer();
        }
        return;
    }

    // Converted and line-end translated: the bytes go in runs up to the next
    // LF (text mode) or the end of the buffer, each run through the table.
    unsigned char const *map = dos ? kDosOut.map : nullptr;
    auto *buffer = reinterpret_cast<unsigned char *>(m_buffer.get());
    while (count > 0) {
        std::size_t run = count;
        if (text) {
            void const *lf = std::memchr(src, '\n', count);
            if (lf == src) {
                // An LF gets its CR unless the byte before was one.
                if (!m_lastWasCR) {
                    if (m_end == m_bufferSize)
                        FlushBuffer();
                    buffer[m_end++] = '\r';
                }
                if (m_end == m_bufferSize)
                    FlushBuffer();
                buffer[m_end++] = '\n';
                m_lastWasCR = false;
                ++src;
                --count;
                continue;
            }
            if (lf)
                run = static_cast<std::size_t>(static_cast<unsigned char const *>(lf) - src);
        }
        if (m_end == m_bufferSize)
            FlushBuffer();
        std::size_t room = m_bufferSize - m_end;
        if (run > room)
            run = room;
        unsigned char *out = buffer + m_end;
        if (map) {
            for (std::size_t i = 0; i < run; ++i)
                out[i] = map[src[i]];
        } else {
            std::memcpy(out, src, run);
        }
        m_end += run;
        // CR is plain ASCII in every character set, so the converted byte
        // tells as well as the source byte.
        m_lastWasCR = out[run - 1] == '\r';
        src += run;
        count -= run;
    }
}

void CQoFile::Write(CQoString const &text)
{
    Write(text.GetString(), static_cast<std::size_t>(text.GetLength()));
}

void CQoFile::Flush(bool toDisk)
{
    if (!m_fp)
        return;
    FlushBuffer();
    if (std::fflush(m_fp) != 0)
        Fail(CQoException::writeError);
    if (toDisk) {
#ifdef _WIN32
        if (_commit(_fileno(m_fp)) != 0)
            Fail(CQoException::writeError);
#else
        if (fsync(fileno(m_fp)) != 0)
            Fail(CQoException::writeError);
#endif
    }
}

// ---------------------------------------------------------------------------
// position

std::int64_t CQoFile::Tell() const
{
    if (m_state == reading)
        return m_filePos - static_cast<std::int64_t>(m_end - m_pos);
    if (m_state == writing)
        return m_filePos + static_cast<std::int64_t>(m_end);
    return m_filePos;
}

std::int64_t CQoFile::Length()
{
    if (!m_fp)
        Fail(CQoException::notOpen);
    if (m_state == writing)
        Flush();
#ifdef _WIN32
    std::int64_t length = _filelengthi64(_fileno(m_fp));
    if (length < 0)
        Fail(CQoException::readError);
    return length;
#else
    struct stat info;
    if (fstat(fileno(m_fp), &info) != 0)
        Fail(CQoException::readError);
    return static_cast<std::int64_t>(info.st_size);
#endif
}

std::int64_t CQoFile::Seek(std::int64_t offset, int from)
{
    if (!m_fp)
        Fail(CQoException::notOpen);
    std::int64_t base = 0;
    if (from == current)
        base = Tell();
    else if (from == end)
        base = Length();
    std::int64_t target = base + offset;
    if (target < 0)
        Fail(CQoException::seekError);

    // Inside the bytes already read (and still as in the file): just move in
    // the buffer.
    if (m_state == reading && !m_bufferConverted) {
        std::int64_t bufferStart = m_filePos - static_cast<std::int64_t>(m_end);
        if (target >= bufferStart && target <= m_filePos) {
            m_pos = static_cast<std::size_t>(target - bufferStart);
            return target;
        }
    }
    FlushBuffer();
    // On a disk file the jump costs nothing now: reads name their position,
    // and a write first moves the system's position (SyncSystemPosition).
    if (m_positioned)
        m_systemPosStale = true;
    else if (SeekRaw(m_fp, target, SEEK_SET) != 0)
        Fail(CQoException::seekError);
    m_filePos = target;
    m_pos = m_end = 0;
    m_state = idle;
    m_lastWasCR = false;
    m_fillSize = kFirstFill;
    return target;
}

// ---------------------------------------------------------------------------
// files on the disk

bool CQoFile::Exists(char const *path)
{
    if (!path || !*path)
        return false;
#ifdef _WIN32
    return GetFileAttributesW(WidePath(path).c_str()) != INVALID_FILE_ATTRIBUTES;
#else
    struct stat info;
    return stat(path, &info) == 0;
#endif
}

bool CQoFile::Remove(char const *path)
{
    if (!path || !*path)
        return false;
#ifdef _WIN32
    return DeleteFileW(WidePath(path).c_str()) != 0;
#else
    return std::remove(path) == 0;
#endif
}

bool CQoFile::MoveOver(char const *source, char const *target)
{
    if (!source || !*source || !target || !*target)
        return false;
    if (IsWriteProtected(target)) {
#ifdef _WIN32
        SetLastError(ERROR_ACCESS_DENIED);
#else
        errno = EACCES;
#endif
        return false;
    }
#ifdef _WIN32
    return MoveFileExW(WidePath(source).c_str(), WidePath(target).c_str(),
                       MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH) != 0;
#else
    return std::rename(source, target) == 0;
#endif
}

namespace {
// Upper case of a Windows-1252 letter (the accented ones too, as the file
// system folds them).
unsigned char UpperCase(unsigned char c)
{
    if ((c >= 'a' && c <= 'z') || (c >= 0xE0 && c <= 0xFE && c != 0xF7))
        return static_cast<unsigned char>(c - 0x20);
    return c;
}

// The full path of a name, "." and ".." resolved, as one string to compare.
std::string FullPath(char const *path)
{
#ifdef _WIN32
    char full[4096];
    DWORD n = GetFullPathNameA(path, sizeof full, full, nullptr);
    std::string text = n > 0 && n < sizeof full ? std::string(full, n) : std::string(path);
    for (char &c : text)
        if (c == '/')
            c = '\\';
    return text;
#else
    std::string text = path;
    if (text[0] != '/') {
        char cwd[4096];
        if (getcwd(cwd, sizeof cwd))
            text = std::string(cwd) + "/" + text;
    }
    std::string out;
    for (std::string const &part : QoPathParts(text))
        out += "/" + part;
    return out.empty() ? "/" : out;
#endif
}
} // namespace

std::string CQoFile::NewTempFileBeside(char const *target)
{
    if (!target || !*target)
        return std::string();
    std::string folder = target;
    std::size_t cut = folder.find_last_of("/\\");
    folder = cut == std::string::npos ? std::string(".") : folder.substr(0, cut + 1);
    if (folder.empty())
        folder = "/";
#ifdef _WIN32
    // GetTempFileName stops at 260 characters: the name is made here, and
    // CREATE_NEW makes sure it is a new file.
    if (folder.back() != '\\' && folder.back() != '/')
        folder += '\\';
    static LONG counter = 0;
    for (int attempt = 0; attempt < 100; ++attempt) {
        char unique[32];
        std::snprintf(unique, sizeof unique, "qo%lx%04lx.tmp", static_cast<unsigned long>(GetCurrentProcessId()),
                      static_cast<unsigned long>(InterlockedIncrement(&counter) + GetTickCount()) & 0xFFFFul);
        std::string name = folder + unique;
        HANDLE h = CreateFileW(WidePath(name.c_str()).c_str(), GENERIC_WRITE, 0, nullptr, CREATE_NEW,
                               FILE_ATTRIBUTE_NORMAL, nullptr);
        if (h != INVALID_HANDLE_VALUE) {
            CloseHandle(h);
            return name;
        }
        DWORD error = GetLastError();
        if (error != ERROR_FILE_EXISTS && error != ERROR_ALREADY_EXISTS)
            return std::string();
    }
    return std::string();
#else
    if (folder.back() != '/')
        folder += '/';
    std::string name = folder + "qoXXXXXX";
    int fd = mkstemp(&name[0]);
    if (fd < 0)
        return std::string();
    close(fd);
    return name;
#endif
}

bool CQoFile::SameFile(char const *a, char const *b)
{
    if (!a || !*a || !b || !*b)
        return false;
    std::string fa = FullPath(a);
    std::string fb = FullPath(b);
    if (fa.size() != fb.size())
        return false;
    for (std::size_t i = 0; i < fa.size(); ++i) {
        unsigned char ca = static_cast<unsigned char>(fa[i]);
        unsigned char cb = static_cast<unsigned char>(fb[i]);
        if (UpperCase(ca) != UpperCase(cb))
            return false;
    }
    return true;
}

// QoTextReader: the block reader under the text input filters (internal).
//
// It reads the filter's file through CQoFile (binary, with the file's
// character set) into a window of memory that the record parsers scan
// directly. A parser asks for bytes with Ensure(); when a record runs past the
// window, the reader keeps the unread part and appends the next block, so a
// record is always contiguous in memory. After a seek the first block is
// small, so that jumping to a row reads little; sequential reading doubles the
// block size up to a megabyte.
#pragma once

#include "CQoFile.h"

#include <cstddef>
#include <cstdint>
#include <memory>

class QoTextReader {
public:
    QoTextReader();
    ~QoTextReader();
    QoTextReader(QoTextReader const &) = delete;
    QoTextReader &operator=(QoTextReader const &) = delete;

    // Opens `path` for reading with the character set; raises CQoException
    // (fileNotFound / cannotOpen) when it cannot be opened. With
    // `dropEndMark`, a DOS end-of-file mark (0x1A) as the file's last byte is
    // not data: line-oriented filters would make a row of it.
    void Open(char const *path, int charSet, bool dropEndMark = false);
    void Close();
    bool IsOpen() const { return m_file.IsOpen(); }
    std::int64_t Length();
    // 3 when the file starts with a UTF-8 byte-order mark, else 0: the data
    // starts there.
    int BomLength() const { return m_bomLength; }

    // Positions on a byte offset of the file.
    void SeekTo(std::int64_t offset);
    // The file offset of the next unread byte.
    std::int64_t Tell() const { return m_windowStart + static_cast<std::int64_t>(m_pos); }

    // Makes at least `count` bytes after the position available, or all that
    // is left of the file; answers the number available. Memory grows only
    // as far as the file reaches, whatever `count` asks. Pointers got from
    // Data() before are invalid afterwards.
    std::size_t Ensure(std::size_t count)
    {
        if (m_end - m_pos >= count || m_eof)
            return m_end - m_pos;
        return Refill(count);
    }
    // The unread bytes in memory and how many there are.
    char const *Data() const { return m_window.get() + m_pos; }
    std::size_t Avail() const { return m_end - m_pos; }
    // True when the file holds nothing beyond the bytes in memory.
    bool AtEof() const { return m_eof; }
    void Advance(std::size_t count) { m_pos += count; }

private:
    std::size_t Refill(std::size_t count);

    CQoFile m_file;
    std::unique_ptr<char[]> m_window;
    std::size_t m_capacity = 0;
    std::size_t m_pos = 0;              // next unread byte in the window
    std::size_t m_end = 0;              // end of valid bytes in the window
    std::int64_t m_windowStart = 0;     // file offset of m_window[0]
    std::size_t m_block;                // size of the next read
    bool m_eof = false;
    bool m_dropEndMark = false;
    int m_bomLength = 0;
};

#include "QoTextReader.h"

#include "CQoException.h"

#include <cstring>

namespace {
constexpr std::size_t kFirstBlock = 4096;
constexpr std::size_t kMaxBlock = 256 * 1024; // refills stay in the cache that the parser reads from
}

// The file's own buffer is the smallest there is: the reader's window does the
// buffering, and large reads go straight into it.
QoTextReader::QoTextReader()
    : m_file(1), m_block(kFirstBlock)
{
}

QoTextReader::~QoTextReader() = default;

void QoTextReader::Open(char const *path, int charSet, bool dropEndMark)
{
    Close();
    m_file.OpenOrThrow(path, CQoFile::read | CQoFile::binary | charSet);
    // The mark is looked for in the bytes as stored, before any conversion.
    m_file.FileCharSet(CQoFile::ansi);
    unsigned char head[3] = {0, 0, 0};
    std::size_t got = m_file.Read(head, sizeof head);
    m_bomLength = got == 3 && head[0] == 0xEF && head[1] == 0xBB && head[2] == 0xBF ? 3 : 0;
    m_file.Seek(0, CQoFile::begin);
    m_file.FileCharSet(charSet);
    m_dropEndMark = dropEndMark;
    m_windowStart = 0;
    m_pos = m_end = 0;
    m_eof = false;
    m_block = kFirstBlock;
}

void QoTextReader::Close()
{
    if (m_file.IsOpen())
        m_file.Close();
    m_pos = m_end = 0;
    m_windowStart = 0;
    m_eof = false;
}

std::int64_t QoTextReader::Length()
{
    return m_file.Length();
}

void QoTextReader::SeekTo(std::int64_t offset)
{
    // Inside the window: just move.
    if (offset >= m_windowStart && offset <= m_windowStart + static_cast<std::int64_t>(m_end)) {
        m_pos = static_cast<std::size_t>(offset - m_windowStart);
        return;
    }
    if (!m_file.IsOpen())
        CQoException::Throw(CQoException::notOpen, nullptr);
    m_file.Seek(offset, CQoFile::begin);
    m_windowStart = offset;
    m_pos = m_end = 0;
    m_eof = false;
    m_block = kFirstBlock;
}

std::size_t QoTextReader::Refill(std::size_t count)
{
    while (m_end - m_pos < count && !m_eof) {
        std::size_t keep = m_end - m_pos;
        std::size_t want = m_block;
        bool capped = false;
        if (want < count - keep) {
            want = count - keep;
            // A large request (a long record length, a runaway record) gets
            // no more memory than the rest of the file needs.
            if (!m_file.IsOpen())
                CQoException::Throw(CQoException::notOpen, nullptr);
            std::int64_t left = m_file.Length() - (m_windowStart + static_cast<std::int64_t>(m_end));
            if (left < static_cast<std::int64_t>(want)) {
                want = left > 0 ? static_cast<std::size_t>(left) : 0;
                capped = true;
            }
        }
        if (keep + want > m_capacity) {
            std::size_t capacity = m_capacity ? m_capacity : kFirstBlock;
            while (capacity < keep + want)
                capacity *= 2;
            // The bytes after the window's data stay readable for the
            // values' read-ahead copy (CQoString::AssignReadAhead).
            std::unique_ptr<char[]> window(new char[capacity + CQoString::kReadAhead]());
            if (keep)
                std::memcpy(window.get(), m_window.get() + m_pos, keep);
            m_window = std::move(window);
            m_capacity = capacity;
        } else if (m_pos > 0 && keep) {
            std::memmove(m_window.get(), m_window.get() + m_pos, keep);
        }
        m_windowStart += static_cast<std::int64_t>(m_pos);
        m_pos = 0;
        m_end = keep;
        if (!m_file.IsOpen())
            CQoException::Throw(CQoException::notOpen, nullptr);
        std::size_t got = want ? m_file.Read(m_window.get() + m_end, want) : 0;
        m_end += got;
        if (got < want || capped) {
            m_eof = true;
            if (m_dropEndMark && m_end > m_pos && m_window[m_end - 1] == 0x1A)
                --m_end;
        }
        if (m_block < kMaxBlock)
            m_block *= 2;
    }
    return m_end - m_pos;
}

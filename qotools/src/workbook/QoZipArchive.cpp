#include "QoZipArchive.h"

#include "CQoException.h"

#include <zlib.h>

#include <algorithm>
#include <cerrno>
#include <cstring>

namespace {

std::uint16_t U16(unsigned char const *p) { return std::uint16_t(p[0] | p[1] << 8); }
std::uint32_t U32(unsigned char const *p)
{
    return std::uint32_t(p[0]) | std::uint32_t(p[1]) << 8 | std::uint32_t(p[2]) << 16 | std::uint32_t(p[3]) << 24;
}

std::string Lower(std::string text)
{
    for (char &c : text)
        if (c >= 'A' && c <= 'Z')
            c = char(c - 'A' + 'a');
    return text;
}

// The central directory itself; more than any archive of maxMembers members
// with ordinary names needs.
constexpr std::uint64_t maxDirectorySize = 256u << 20;

} // namespace

QoZipArchive::~QoZipArchive() { Close(); }

void QoZipArchive::Close()
{
    if (m_file)
        std::fclose(m_file);
    m_file = nullptr;
    m_members.clear();
    m_byName.clear();
    m_fileSize = 0;
}

void QoZipArchive::Fail(char const *text) const
{
    std::string message = "Die Excel-Arbeitsmappe ist besch\344digt: ";
    message += text;
    CQoException::Throw(message.c_str(), m_path.c_str());
}

void QoZipArchive::ReadAt(std::uint64_t offset, void *buffer, std::size_t count) const
{
    // Every caller has checked offset + count against the file size; a short
    // read here means the file changed or the disk failed.
#ifdef _WIN32
    int sought = _fseeki64(m_file, static_cast<long long>(offset), SEEK_SET);
#else
    int sought = fseeko(m_file, static_cast<off_t>(offset), SEEK_SET);
#endif
    if (sought != 0 || std::fread(buffer, 1, count, m_file) != count)
        CQoException::Throw(CQoException::readError, m_path.c_str());
}

void QoZipArchive::ThrowForOleFile() const
{
    // A password-protected workbook is an OLE compound file holding the
    // stream "EncryptedPackage"; its name appears in UTF-16 in a directory
    // sector, which may lie anywhere in the file.
    static char const name[] = "EncryptedPackage";
    std::string pattern;
    for (char c : std::string(name))
        pattern += std::string(1, c) + '\0';
    std::string chunk;
    std::uint64_t const step = 1u << 20;
    for (std::uint64_t at = 0; at < m_fileSize; at += step) {
        std::size_t count = std::size_t(std::min<std::uint64_t>(step + pattern.size(), m_fileSize - at));
        chunk.resize(count);
        ReadAt(at, &chunk[0], count);
        if (chunk.find(pattern) != std::string::npos)
            CQoException::Throw("Die Arbeitsmappe ist mit einem Kennwort gesch\374tzt und kann nicht gelesen werden. "
                                "Bitte den Kennwortschutz in Excel entfernen und die Datei erneut speichern",
                                m_path.c_str());
    }
    CQoException::Throw("Die Datei ist im alten Excel-Format (.xls) gespeichert; dieses Format wird nicht "
                        "unterst\374tzt. Bitte die Datei in Excel als Arbeitsmappe (.xlsx) speichern",
                        m_path.c_str());
}

void QoZipArchive::Open(char const *path)
{
    Close();
    m_path = path ? path : "";
    m_file = std::fopen(m_path.c_str(), "rb");
    if (!m_file)
        CQoException::Throw(errno == ENOENT ? CQoException::fileNotFound : CQoException::cannotOpen, m_path.c_str());
#ifdef _WIN32
    bool sized = _fseeki64(m_file, 0, SEEK_END) == 0;
    long long end = sized ? _ftelli64(m_file) : -1;
#else
    bool sized = fseeko(m_file, 0, SEEK_END) == 0;
    long long end = sized ? static_cast<long long>(ftello(m_file)) : -1;
#endif
    if (end < 0)
        CQoException::Throw(CQoException::readError, m_path.c_str());
    m_fileSize = std::uint64_t(end);

    unsigned char head[8] = {};
    if (m_fileSize >= 8) {
        ReadAt(0, head, 8);
        static unsigned char const ole[8] = {0xD0, 0xCF, 0x11, 0xE0, 0xA1, 0xB1, 0x1A, 0xE1};
        if (std::memcmp(head, ole, 8) == 0)
            ThrowForOleFile();
    }
    if (m_fileSize < 22 || U32(head) != 0x04034b50u)
        CQoException::Throw("Die Datei ist keine Excel-Arbeitsmappe (.xlsx)", m_path.c_str());

    // The end record sits in the last 22 bytes plus at most a 64 KiB comment.
    std::uint64_t tailSize = std::min<std::uint64_t>(m_fileSize, 22 + 65535);
    std::vector<unsigned char> tail(static_cast<std::size_t>(tailSize));
    ReadAt(m_fileSize - tailSize, tail.data(), tail.size());
    std::size_t eocd = tail.size();
    for (std::size_t i = tail.size() - 22 + 1; i-- > 0;)
        if (U32(&tail[i]) == 0x06054b50u) {
            eocd = i;
            break;
        }
    if (eocd == tail.size())
        Fail("das Inhaltsverzeichnis des ZIP-Archivs fehlt (Datei unvollst\344ndig?)");
    unsigned char const *e = &tail[eocd];
    std::uint64_t eocdOffset = m_fileSize - tailSize + eocd;
    std::uint32_t entries = U16(e + 10), dirSize = U32(e + 12), dirOffset = U32(e + 16);
    if (U16(e + 4) != 0 || U16(e + 6) != 0)
        Fail("mehrteilige ZIP-Archive werden nicht unterst\374tzt");
    if (entries == 0xFFFF || dirSize == 0xFFFFFFFFu || dirOffset == 0xFFFFFFFFu)
        Fail("ZIP64-Archive (gr\366\337er als 4 GB) werden nicht unterst\374tzt");
    if (entries > maxMembers)
        Fail("mehr als 100000 Eintr\344ge im ZIP-Archiv");
    if (std::uint64_t(dirOffset) + dirSize > eocdOffset || dirSize > maxDirectorySize)
        Fail("das Inhaltsverzeichnis des ZIP-Archivs liegt au\337erhalb der Datei");

    std::vector<unsigned char> dir(dirSize);
    if (dirSize)
        ReadAt(dirOffset, dir.data(), dir.size());
    std::size_t pos = 0;
    m_members.reserve(entries);
    for (std::uint32_t i = 0; i < entries; ++i) {
        if (dir.size() - pos < 46 || U32(&dir[pos]) != 0x02014b50u)
            Fail("ein Eintrag im Inhaltsverzeichnis des ZIP-Archivs ist ung\374ltig");
        unsigned char const *c = &dir[pos];
        std::size_t nameLength = U16(c + 28), extraLength = U16(c + 30), commentLength = U16(c + 32);
        std::size_t recordSize = 46 + nameLength + extraLength + commentLength;
        if (dir.size() - pos < recordSize)
            Fail("ein Eintrag im Inhaltsverzeichnis des ZIP-Archivs ist ung\374ltig");
        Member m;
        m.flags = U16(c + 8);
        m.method = U16(c + 10);
        m.crc = U32(c + 16);
        m.packed = U32(c + 20);
        m.size = U32(c + 24);
        m.localHeader = U32(c + 42);
        m.name.assign(reinterpret_cast<char const *>(c + 46), nameLength);
        if (m.packed == 0xFFFFFFFFu || m.size == 0xFFFFFFFFu || m.localHeader == 0xFFFFFFFFu)
            Fail("ZIP64-Archive (gr\366\337er als 4 GB) werden nicht unterst\374tzt");
        if (m.localHeader + 30 + m.packed > m_fileSize)
            Fail("ein Eintrag des ZIP-Archivs reicht \374ber das Dateiende hinaus (Datei unvollst\344ndig?)");
        std::string key = Lower(m.name);
        if (!m_byName.count(key)) {
            m_byName.emplace(std::move(key), m_members.size());
            m_members.push_back(std::move(m));
        }
        pos += recordSize;
    }
}

bool QoZipArchive::Has(std::string const &name) const { return m_byName.count(Lower(name)) != 0; }

std::string QoZipArchive::Read(std::string const &name) const
{
    auto found = m_byName.find(Lower(name));
    if (found == m_byName.end()) {
        std::string message = "der Teil \"" + name + "\" fehlt";
        Fail(message.c_str());
    }
    Member const &m = m_members[found->second];
    std::string what = " (" + m.name + ")";
    if (m.flags & 1)
        CQoException::Throw("Die Arbeitsmappe ist mit einem Kennwort gesch\374tzt und kann nicht gelesen werden. "
                            "Bitte den Kennwortschutz in Excel entfernen und die Datei erneut speichern",
                            m_path.c_str());
    if (m.method != 0 && m.method != 8)
        Fail(("unbekanntes Komprimierungsverfahren " + std::to_string(m.method) + what).c_str());
    if (m.size > maxMemberSize)
        Fail(("ein Teil ist entpackt gr\366\337er als 1 GB" + what).c_str());
    if (m.method == 0 && m.size != m.packed)
        Fail(("die angegebene Gr\366\337e eines Teils ist unm\366glich" + what).c_str());
    if (m.size > m.packed * maxRatio + (1u << 20))
        Fail(("ein Teil ist ungew\366hnlich stark komprimiert (mehr als 200:1), die Datei wird "
              "nicht entpackt" + what).c_str());

    unsigned char local[30];
    ReadAt(m.localHeader, local, sizeof local);
    if (U32(local) != 0x04034b50u)
        Fail(("der Kopf eines Teils fehlt" + what).c_str());
    std::uint64_t data = m.localHeader + 30 + U16(local + 26) + U16(local + 28);
    if (data + m.packed > m_fileSize)
        Fail(("ein Teil reicht \374ber das Dateiende hinaus" + what).c_str());

    std::string out(std::size_t(m.size), '\0');
    if (m.method == 0) {
        if (m.size)
            ReadAt(data, &out[0], out.size());
    } else {
        z_stream z{};
        if (inflateInit2(&z, -MAX_WBITS) != Z_OK)
            CQoException::Throw(CQoException::outOfMemory, m_path.c_str());
        // One spare byte lets a stream that inflates to more than the stated
        // size show itself instead of stopping exactly at the end.
        std::string spare(1, '\0');
        std::vector<unsigned char> in(std::size_t(std::min<std::uint64_t>(m.packed, 256u << 10)) + 1);
        std::uint64_t left = m.packed;
        z.next_out = reinterpret_cast<Bytef *>(out.empty() ? &spare[0] : &out[0]);
        z.avail_out = uInt(out.size());
        int rc = Z_OK;
        bool bad = false;
        while (rc != Z_STREAM_END && !bad) {
            if (z.avail_in == 0) {
                if (left == 0) {
                    bad = true;
                    break;
                }
                std::size_t count = std::size_t(std::min<std::uint64_t>(left, in.size()));
                ReadAt(data + (m.packed - left), in.data(), count);
                left -= count;
                z.next_in = in.data();
                z.avail_in = uInt(count);
            }
            if (z.avail_out == 0) {
                if (z.total_out != m.size) {
                    bad = true;
                    break;
                }
                z.next_out = reinterpret_cast<Bytef *>(&spare[0]);
                z.avail_out = 1;
            }
            rc = inflate(&z, Z_NO_FLUSH);
            if (rc != Z_OK && rc != Z_STREAM_END)
                bad = true;
        }
        bool exact = z.total_out == m.size;
        inflateEnd(&z);
        if (bad || !exact)
            Fail(("die komprimierten Daten eines Teils sind fehlerhaft" + what).c_str());
    }
    uLong crc = crc32(0L, Z_NULL, 0);
    // crc32 takes uInt lengths: feed large members in pieces.
    for (std::size_t at = 0; at < out.size();) {
        std::size_t count = std::min<std::size_t>(out.size() - at, 1u << 30);
        crc = crc32(crc, reinterpret_cast<Bytef const *>(out.data() + at), uInt(count));
        at += count;
    }
    if (crc != m.crc)
        Fail(("die Pr\374fsumme eines Teils stimmt nicht" + what).c_str());
    return out;
}

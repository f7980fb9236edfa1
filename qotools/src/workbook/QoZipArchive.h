// QoZipArchive: the members of a zip file, read through zlib.
//
// A workbook is a zip archive. Its central directory is the one truth about
// each member (some writers leave CRC and sizes 0 in the local header), so
// sizes and CRC come from there; the local header only says where the data
// starts. Stored and deflated members are read; a member is inflated whole
// into memory and its CRC is checked.
//
// Bounds, each checked before it sizes or places anything: at most
// maxMembers members (without ZIP64 an archive lists at most 65,534), at most maxMemberSize bytes per inflated member, an
// inflated size at most maxRatio times the compressed size plus 1 MiB
// (workbook XML compresses about 10 to 15 times, even a sheet of nothing but
// zeros; a member claiming far more is a zip bomb), every offset and size
// inside the file. A member never inflates past its stated size. ZIP64
// archives (members or archives past 4 GiB) are refused.
#pragma once

#include <cstdint>
#include <cstdio>
#include <string>
#include <unordered_map>
#include <vector>

class QoZipArchive {
public:
    static constexpr std::uint32_t maxMembers = 100000;
    static constexpr std::uint64_t maxMemberSize = 1u << 30;
    static constexpr std::uint64_t maxRatio = 200;

    QoZipArchive() = default;
    ~QoZipArchive();
    QoZipArchive(QoZipArchive const &) = delete;
    QoZipArchive &operator=(QoZipArchive const &) = delete;

    // Opens the archive and reads its directory. Raises CQoException naming
    // `path`; the leading bytes tell an old Excel file (OLE) apart.
    void Open(char const *path);
    void Close();

    // Member names compare without regard to case, as package part names do.
    bool Has(std::string const &name) const;
    // The member's bytes; raises CQoException when it is missing or damaged.
    std::string Read(std::string const &name) const;

private:
    struct Member {
        std::string name;
        std::uint32_t crc = 0;
        std::uint64_t packed = 0;
        std::uint64_t size = 0;
        std::uint64_t localHeader = 0;
        std::uint16_t method = 0;
        std::uint16_t flags = 0;
    };

    void ReadAt(std::uint64_t offset, void *buffer, std::size_t count) const;
    [[noreturn]] void Fail(char const *text) const;
    void ThrowForOleFile() const;

    std::FILE *m_file = nullptr;
    std::string m_path;
    std::uint64_t m_fileSize = 0;
    std::vector<Member> m_members;
    std::unordered_map<std::string, std::size_t> m_byName;   // lower-case name -> member
};

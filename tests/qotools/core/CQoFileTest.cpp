#include "CQoException.h"
#include "CQoFile.h"

#include "TempFolder.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <filesystem>
#include <string>
#include <vector>

namespace {

// The umlauts and ß in Windows-1252 and in DOS code page 850.
std::string const kAnsiUmlauts = "\344\366\374\304\326\334\337";
std::string const kDosUmlauts = "\x84\x94\x81\x8E\x99\x9A\xE1";

std::vector<std::string> ReadLines(std::string const &path, int mode, int blocks = 16)
{
    std::vector<std::string> lines;
    CQoFile file(blocks);
    EXPECT_TRUE(file.Open(path.c_str(), mode));
    CQoString line;
    while (file.ReadString(line))
        lines.emplace_back(line.Str());
    return lines;
}

int Code(void (*f)(CQoFile &), CQoFile &file)
{
    try {
        f(file);
    } catch (CQoException const &e) {
        return e.Code();
    }
    return -1;
}

} // namespace

// Windows-1252 from 0xA0 up survives code page 850 there and back.
TEST(CQoFileCharSet, DosAnsiAndMixedConvertBothWaysAlsoChosenAfterOpening)
{
    TempFolder tmp;
    std::string path = tmp.Path("dos.txt");
    std::string latin;
    for (int c = 0xA0; c <= 0xFF; ++c)
        latin += static_cast<char>(c);
    {
        CQoFile file(path.c_str(), CQoFile::create | CQoFile::binary | CQoFile::ascii);
        file.Write(CQoString(latin.c_str()));
    }
    std::string onDisk = ReadBytes(path);
    ASSERT_EQ(latin.size(), onDisk.size());
    for (std::size_t i = 0; i < kAnsiUmlauts.size(); ++i)
        EXPECT_EQ(kDosUmlauts[i], onDisk[std::size_t(static_cast<unsigned char>(kAnsiUmlauts[i]) - 0xA0)]) << i;
    CQoFile file(path.c_str(), CQoFile::read | CQoFile::binary | CQoFile::ascii);
    std::string back(latin.size(), '\0');
    EXPECT_EQ(latin.size(), file.Read(&back[0], back.size()));
    EXPECT_EQ(latin, back);
    file.Close();

    // Without an equivalent, the nearest form: DOS box drawing and shading.
    WriteBytes(path, "\xDA\xC4\xBF\r\n\xB3\xB0\xBA\r\n\xC0\xCD\xD9\r\n");
    EXPECT_EQ((std::vector<std::string>{"+-+", "|#|", "+-+"}), ReadLines(path, CQoFile::read | CQoFile::ascii));

    // Windows-1252 only: euro, s with caron, typographic quotes, dash, unassigned byte.
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::create | CQoFile::binary | CQoFile::ascii));
    file.Write(CQoString("\200 \232 \223x\224 \226 \201"));
    file.Close();
    EXPECT_EQ("E s \"x\" - ?", ReadBytes(path));

    // Ansimix reads 1252, DOS and mixed lines (0xE9 is plain 1252), writes 1252.
    WriteBytes(path, "M\374ller Gr\366\337e\r\nM\x81ller Gr\x94\xE1" "e\r\nS\x84tze \344 \xE9t\xE9\r\n");
    EXPECT_EQ((std::vector<std::string>{"M\374ller Gr\366\337e", "M\374ller Gr\366\337e", "S\344tze \344 \351t\351"}),
              ReadLines(path, CQoFile::read | CQoFile::ansimix));
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::create | CQoFile::binary | CQoFile::ansimix));
    file.Write(CQoString(kAnsiUmlauts.c_str()));
    file.Close();
    EXPECT_EQ(kAnsiUmlauts, ReadBytes(path));

    // The character set can be chosen after opening.
    path = tmp.Path("late.txt");
    WriteBytes(path, kDosUmlauts + "\n");
    CQoFile late(8);
    ASSERT_TRUE(late.Open(path.c_str(), CQoFile::read | CQoFile::binary));
    late.FileCharSet(CQoFile::ascii);
    CQoString line;
    ASSERT_TRUE(late.ReadString(line, false));
    EXPECT_EQ(kAnsiUmlauts, line.Str());

    // Seeking back re-reads the file's bytes, converted once, not twice.
    late.Seek(0, CQoFile::begin);
    char buffer[7];
    EXPECT_EQ(7u, late.Read(buffer, 7, false));
    EXPECT_EQ(kAnsiUmlauts, std::string(buffer, 7));
}

TEST(CQoFileLines, SplitsAtAnyLineEndAndTextModeTranslatesThem)
{
    TempFolder tmp;
    std::string path = tmp.Path("lines.txt");
    WriteBytes(path, "eins\r\nzwei\n\n\r\nf\xFCnf\rx\r\r\nlast");
    EXPECT_EQ((std::vector<std::string>{"eins", "zwei", "", "", "f\xFCnf", "x", "", "last"}),
              ReadLines(path, CQoFile::read));
    WriteBytes(path, "only\r");
    EXPECT_EQ(std::vector<std::string>{"only"}, ReadLines(path, CQoFile::read));

    // Lines longer than the buffer, and line ends across its edge.
    std::size_t const block = 64 * 1024;
    std::string longLine(3 * block + 17, 'x');
    for (std::size_t i = 0; i < longLine.size(); i += 1000)
        longLine[i] = static_cast<char>('a' + (i / 1000) % 26);
    std::string first(block - 1, 'y'); // its CR is the buffer's last byte, the LF the next one's first
    WriteBytes(path, first + "\r\n" + longLine + "\r\nend\n");
    EXPECT_EQ((std::vector<std::string>{first, longLine, "end"}), ReadLines(path, CQoFile::read, 1));
    // A lone CR there ends its line, and the next line is not lost.
    WriteBytes(path, first + "\r" + longLine + "\rend");
    EXPECT_EQ((std::vector<std::string>{first, longLine, "end"}), ReadLines(path, CQoFile::read, 1));

    // Text mode translates line ends, binary mode does not.
    path = tmp.Path("mode.txt");
    {
        CQoFile file(path.c_str(), CQoFile::create);
        file.Write(CQoString("a\nb\r\nc\r"));
        file.Write(CQoString("\nd\n"));
    }
    EXPECT_EQ("a\r\nb\r\nc\r\nd\r\n", ReadBytes(path));

    char buffer[32];
    CQoFile text(path.c_str(), CQoFile::read);
    std::size_t n = text.Read(buffer, sizeof buffer);
    EXPECT_EQ("a\nb\nc\nd\n", std::string(buffer, n));

    CQoFile binary(path.c_str(), CQoFile::read | CQoFile::binary);
    n = binary.Read(buffer, sizeof buffer);
    EXPECT_EQ("a\r\nb\r\nc\r\nd\r\n", std::string(buffer, n));
}

TEST(CQoFileOpen, WritesEveryBlockLengthThroughItsBuffer)
{
    // Blocks of 0 to 300 bytes in turn, across the buffer's edges: short
    // blocks are copied by other code than long ones.
    TempFolder tmp;
    std::string path = tmp.Path("blocks.bin");
    std::string expected;
    CQoFile file(1);
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::write | CQoFile::create | CQoFile::binary));
    for (std::size_t n = 0; n <= 300; ++n) {
        std::string block;
        for (std::size_t i = 0; i < n; ++i)
            block += static_cast<char>('A' + (n + i) % 53);
        file.Write(block.data(), block.size());
        expected += block;
    }
    file.Close();
    EXPECT_EQ(expected, ReadBytes(path));
}

TEST(CQoFileOpen, ModesSeekTellAndLength)
{
    TempFolder tmp;
    std::string path = tmp.Path("modes.txt");
    CQoFile file(1);
    EXPECT_FALSE(file.Open(tmp.Folder().string().c_str(), CQoFile::read)); // a folder
    try {
        file.OpenOrThrow(path.c_str(), CQoFile::read);
        FAIL();
    } catch (CQoException const &e) {
        EXPECT_EQ(CQoException::fileNotFound, e.Code());
        EXPECT_NE(std::string::npos, std::string(e.Message()).find("modes.txt"));
    }

    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::write | CQoFile::binary)); // creates a missing file
    file.Write("12345", 5);
    file.Close();
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::write | CQoFile::binary)); // appends
    file.Write("678", 3);
    file.Close();
    EXPECT_EQ("12345678", ReadBytes(path));
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::write | CQoFile::begin | CQoFile::binary)); // in place
    file.Write("ab", 2);
    file.Close();
    EXPECT_EQ("ab345678", ReadBytes(path));
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::write | CQoFile::create | CQoFile::binary)); // truncates
    file.Close();
    EXPECT_EQ("", ReadBytes(path));

    // Seek, Tell and Length are 64-bit.
    WriteBytes(path, "line0\nline1\nline2\nline3\n");
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::read | CQoFile::binary));
    CQoString line;
    ASSERT_TRUE(file.ReadString(line));
    ASSERT_TRUE(file.ReadString(line));
    EXPECT_EQ(12, file.Tell()); // where the line read ends, not where the buffer does
    EXPECT_EQ(19, file.Seek(-5, CQoFile::end));
    ASSERT_TRUE(file.ReadString(line));
    EXPECT_STREQ("ine3", line);
    EXPECT_EQ(CQoException::seekError, Code([](CQoFile &f) { f.Seek(-1, CQoFile::begin); }, file));
    file.Close();

    // Beyond 4 GiB: a sparse file with one byte at 5 GiB.
    std::int64_t const far = 5LL * 1024 * 1024 * 1024;
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::read | CQoFile::write | CQoFile::create | CQoFile::binary));
    EXPECT_EQ(far, file.Seek(far));
    file.Write("Z", 1);
    EXPECT_EQ(far + 1, file.Length());
    file.Seek(far);
    char c = 0;
    EXPECT_EQ(1u, file.Read(&c, 1));
    EXPECT_EQ('Z', c);
    file.Close();
    std::filesystem::remove(path);
}

TEST(CQoFileOpen, ReadingAndWritingOneFileInTurnAndErrors)
{
    TempFolder tmp;
    std::string path = tmp.Path("rw.txt");
    WriteBytes(path, "0123456789");
    CQoFile file(path.c_str(), CQoFile::read | CQoFile::write | CQoFile::begin | CQoFile::binary);
    ASSERT_TRUE(file.IsOpen());
    char buffer[4];
    EXPECT_EQ(4u, file.Read(buffer, 4));
    file.Write("AB", 2); // lands after the bytes read, not after the buffered ones
    EXPECT_EQ(6, file.Tell());
    EXPECT_EQ(4u, file.Read(buffer, 4));
    EXPECT_EQ("6789", std::string(buffer, 4));
    file.Close();
    EXPECT_EQ("0123AB6789", ReadBytes(path));

    // Errors raise with their code, or are quiet on request.
    CQoFile closed;
    EXPECT_EQ(0u, closed.Read(buffer, 4, false));
    EXPECT_EQ(CQoException::notOpen, Code([](CQoFile &f) { f.Write("x", 1); }, closed));
    WriteBytes(path, "data");
    CQoFile reader(path.c_str(), CQoFile::read);
    EXPECT_EQ(CQoException::writeError, Code([](CQoFile &f) { f.Write("x", 1); }, reader));
    EXPECT_EQ("data", ReadBytes(path));
}

#ifdef _WIN32
#include <windows.h> // last: its macros clash with the names above
#endif

TEST(CQoFileReplace, AReadOnlyTargetIsRefusedAndKeptAsItWas)
{
    TempFolder tmp;
    std::string target = tmp.Path("ziel.txt");
    std::string source = tmp.Path("neu.txt");
    WriteBytes(target, "alt");
    WriteBytes(source, "neu");
    namespace fs = std::filesystem;
    fs::permissions(target, fs::perms::owner_write | fs::perms::group_write | fs::perms::others_write,
                    fs::perm_options::remove);
    errno = 0;
    EXPECT_FALSE(CQoFile::MoveOver(source.c_str(), target.c_str()));
#ifdef _WIN32
    EXPECT_EQ(static_cast<DWORD>(ERROR_ACCESS_DENIED), GetLastError());
#else
    EXPECT_EQ(EACCES, errno);
#endif
    EXPECT_EQ("alt", ReadBytes(target));
    EXPECT_EQ("neu", ReadBytes(source));
    fs::permissions(target, fs::perms::owner_write, fs::perm_options::add);
    EXPECT_TRUE(CQoFile::MoveOver(source.c_str(), target.c_str()));
    EXPECT_EQ("neu", ReadBytes(target));
}

TEST(CQoFileReplace, PathsBeyond260Characters)
{
    TempFolder tmp;
    std::string folder = tmp.Folder().string();
    for (int i = 0; folder.size() < 300; ++i)
        folder += "/Ordner_mit_einem_recht_langen_Namen_" + std::to_string(i);
    std::filesystem::create_directories(folder);
    std::string target = folder + "/ausgabe.txt";
#ifdef _WIN32
    for (char &c : target)
        if (c == '/')
            c = '\\';
#endif
    std::string temp = CQoFile::NewTempFileBeside(target.c_str());
    ASSERT_FALSE(temp.empty());
    CQoFile out;
    ASSERT_TRUE(out.Open(temp.c_str(), CQoFile::write | CQoFile::create | CQoFile::binary));
    out.Write("Zeile\r\n", 7);
    out.Close();
    ASSERT_TRUE(CQoFile::MoveOver(temp.c_str(), target.c_str()));
    EXPECT_FALSE(CQoFile::Exists(temp.c_str()));
    ASSERT_TRUE(CQoFile::Exists(target.c_str()));
    EXPECT_EQ(std::vector<std::string>{"Zeile"}, ReadLines(target, CQoFile::read));
    EXPECT_TRUE(CQoFile::Remove(target.c_str()));
}

// CFile and CStdioFile on real files in a temporary folder, and CTime.
#include <afx.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>

namespace {

class FileTest : public ::testing::Test {
protected:
  void SetUp() override {
    m_dir = std::filesystem::temp_directory_path() /
            ("qomfc_core_" + std::to_string(GetCurrentProcessId()) + "_" + std::to_string(GetTickCount()));
    ASSERT_TRUE(std::filesystem::create_directory(m_dir));
  }
  void TearDown() override {
    std::error_code ignored;
    std::filesystem::remove_all(m_dir, ignored);
  }
  CString Path(LPCSTR lpszName) const { return (m_dir / lpszName).string().c_str(); }
  std::string ReadAll(LPCSTR lpszName) const {
    std::ifstream in(m_dir / lpszName, std::ios::binary);
    if (!in) return "<missing>";
    std::ostringstream all;
    all << in.rdbuf();
    return all.str();
  }
  void WriteAll(LPCSTR lpszName, const std::string& data) const {
    std::ofstream(m_dir / lpszName, std::ios::binary) << data;
  }

  std::filesystem::path m_dir;
};

// The cause of the CFileException that a call raised, or -1.
template <typename F>
int CauseOf(F&& f) {
  try {
    f();
  } catch (CFileException* e) {
    int nCause = e->m_cause;
    e->Delete();
    return nCause;
  }
  return -1;
}

TEST_F(FileTest, WriteReadSeekLength) {
  std::string data;
  for (int i = 0; i < 100000; ++i) data += (char)(i * 7);
  {
    CFile f;
    ASSERT_TRUE(f.Open(Path("daten.bin"), CFile::modeCreate | CFile::modeReadWrite));
    f.Write(data.data(), (UINT)data.size());
    EXPECT_EQ(100000u, f.GetLength());
    char buf[5];
    EXPECT_EQ(99990u, f.Seek(-10, CFile::end));
    EXPECT_EQ(10u, f.Read(buf, 5) + f.Read(buf, 5));
    EXPECT_EQ(data.substr(99995, 5), std::string(buf, 5));
    EXPECT_EQ(0u, f.Read(buf, 5)); // at the end
    f.SetLength(50);
    EXPECT_EQ(50u, f.SeekToEnd());
  }
  EXPECT_EQ(data.substr(0, 50), ReadAll("daten.bin"));
}

TEST_F(FileTest, MissingFilesSharingAndAccessGiveCauseCodes) {
  CFile f;
  CFileException e;
  CString strMissing = Path("fehlt.txt");
  EXPECT_FALSE(f.Open(strMissing, CFile::modeRead, &e));
  EXPECT_EQ(CFileException::fileNotFound, e.m_cause);
  EXPECT_TRUE(e.m_strFileName == strMissing);
  EXPECT_FALSE(f.Open(Path("gibtsnicht\\x.txt"), CFile::modeCreate | CFile::modeWrite, &e));
  EXPECT_EQ(CFileException::badPath, e.m_cause);

  WriteAll("s.txt", "x");
  CFile first;
  ASSERT_TRUE(first.Open(Path("s.txt"), CFile::modeRead | CFile::shareDenyWrite));
  CFile second;
  EXPECT_FALSE(second.Open(Path("s.txt"), CFile::modeWrite | CFile::shareDenyNone, &e));
  EXPECT_EQ(CFileException::sharingViolation, e.m_cause);
  EXPECT_TRUE(second.Open(Path("s.txt"), CFile::modeRead | CFile::shareDenyNone));
  second.Close();
  first.Close();

  CFile writeOnly(Path("s.txt"), CFile::modeWrite);
  char c;
  EXPECT_EQ(CFileException::accessDenied, CauseOf([&] { writeOnly.Read(&c, 1); }));
}

TEST_F(FileTest, NamesStatusRenameRemove) {
  WriteAll("Bericht.2024.txt", "12345");
  {
    CFile f(Path("Bericht.2024.txt"), CFile::modeRead);
    EXPECT_TRUE(f.GetFileName() == "Bericht.2024.txt");
    EXPECT_TRUE(f.GetFileTitle() == "Bericht.2024");
  }
  CFileStatus status;
  ASSERT_TRUE(CFile::GetStatus(Path("Bericht.2024.txt"), status));
  EXPECT_EQ(5u, status.m_size);
  EXPECT_FALSE(CFile::GetStatus(Path("*.txt"), status));

  CFile::Rename(Path("Bericht.2024.txt"), Path("neu.txt"));
  EXPECT_EQ("12345", ReadAll("neu.txt"));
  CFile::Remove(Path("neu.txt"));
  EXPECT_EQ("<missing>", ReadAll("neu.txt"));
  EXPECT_EQ(CFileException::fileNotFound, CauseOf([&] { CFile::Remove(Path("neu.txt")); }));
}

TEST_F(FileTest, StdioFileTextModeLongLinesAndAppending) {
  {
    CStdioFile f(Path("t.txt"), CFile::modeCreate | CFile::modeWrite | CFile::typeText);
    f.WriteString("erste Zeile\n\nGr\xf6\xdf" "e\nohne Ende");
  }
  EXPECT_EQ("erste Zeile\r\n\r\nGr\xf6\xdf" "e\r\nohne Ende", ReadAll("t.txt"));
  CStdioFile f(Path("t.txt"), CFile::modeRead | CFile::typeText);
  CString line;
  std::string lines;
  while (f.ReadString(line)) lines += std::string(line) + "|"; // an empty line is still a line
  EXPECT_EQ("erste Zeile||Gr\xf6\xdf" "e|ohne Ende|", lines);

  WriteAll("lang.txt", std::string(3000, 'L') + "\r\nx\r\n");
  CStdioFile g(Path("lang.txt"), CFile::modeRead);
  ASSERT_TRUE(g.ReadString(line));
  EXPECT_EQ(3000, line.GetLength());
  g.Close();
  {
    CStdioFile a(Path("lang.txt"), CFile::modeCreate | CFile::modeNoTruncate | CFile::modeWrite | CFile::typeBinary);
    a.WriteString("c\n"); // writes go to the end of an existing file
  }
  EXPECT_EQ(std::string(3000, 'L') + "\r\nx\r\nc\n", ReadAll("lang.txt"));
}

TEST(CTimeTest, LocalFormatSpansAndGmt) {
  CTime t(2024, 2, 29, 13, 5, 9);
  EXPECT_EQ(5, t.GetDayOfWeek()); // Thursday
  CTime later = t + CTimeSpan(1, 2, 3, 4);
  EXPECT_TRUE(later.Format("%d.%m.%Y %H:%M:%S") == "01.03.2024 15:08:13");
  EXPECT_EQ(93784, (later - t).GetTotalSeconds());
  EXPECT_TRUE(CTime(86400).FormatGmt("%Y-%m-%d %H:%M") == "1970-01-02 00:00");
}

} // namespace

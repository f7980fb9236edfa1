#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoFile.h"
#include "CQoOutputFilterTextFix.h"

#include "TempFolder.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

void Row(CQoOutputFilter &out, std::vector<std::string> const &values, CQoString *text = nullptr)
{
    out.InitRow();
    for (std::size_t c = 0; c < values.size(); ++c)
        out.Value(int(c), values[c].c_str());
    ASSERT_TRUE(out.WriteRow(text));
}

} // namespace

TEST(TextOutputFix, RecordsArePaddedCutAndEndedAsSet)
{
    TempFolder tmp;
    std::string path = tmp.Path("fix.txt");
    CQoOutputFilterTextFix out;
    out.NumCols(3);
    out.SetLength(0, 4);
    out.SetLength(1, 6);
    out.SetLength(2, 2);

    CQoFile file;
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::write | CQoFile::create | CQoFile::binary | CQoFile::ascii));
    out.FileCharSet(CQoFile::ascii);
    out.UseFile(&file, true);
    ASSERT_TRUE(out.Init());
    Row(out, {"ab", "M\xFCller", "x"});
    Row(out, {"abcdef", "a\r\nb", "123"});
    Row(out, {});
    out.ReleaseFile();
    EXPECT_EQ(2, out.TruncatedValues());
    EXPECT_EQ("ab  M\x81llerx \r\n"
              "abcda  b  12\r\n"
              "            \r\n",
              ReadBytes(path));
}

TEST(TextOutputFix, OddLengthsAndSettingsRoundTrip)
{
    CQoOutputFilterTextFix out;
    out.NumCols(2);
    EXPECT_THROW(out.SetLength(2, 5), CQoException);
    out.SetLength(0, -5); // written as 0
    out.SetLength(1, 3);
    EXPECT_EQ(3, out.RecordLength());
    CQoString text;
    Row(out, {"weg", "da"}, &text);
    EXPECT_EQ("da \r\n", text.Str());

    // The settings round-trip through the configuration file.
    out.NumCols(3);
    out.SetLength(0, 12);
    out.SetLength(1, 0);
    out.SetLength(2, 255);
    out.CrLf(false);
    out.FileCharSet(CQoFile::ascii);
    CQoConfigFile cfg;
    out.WriteConfig(cfg, "Fix");
    CQoOutputFilterTextFix copy;
    copy.ReadConfig(cfg, "Fix");
    ASSERT_EQ(3, copy.NumCols());
    EXPECT_EQ(0, copy.GetLength(1));
    EXPECT_EQ(255, copy.GetLength(2));
    EXPECT_FALSE(copy.GetCrLf());
    EXPECT_EQ(CQoFile::ascii, copy.FileCharSet());
}

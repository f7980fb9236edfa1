#include "CQoConfigFile.h"
#include "CQoFile.h"

#include "TempFolder.h"

#include <gtest/gtest.h>

#include <climits>
#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

namespace {

std::vector<std::string> Names(std::vector<CQoString> const &list)
{
    std::vector<std::string> names;
    for (CQoString const &s : list)
        names.emplace_back(s.Str());
    return names;
}

CQoConfigFile Reread(CQoConfigFile const &cfg, TempFolder const &tmp)
{
    std::string path = tmp.Path("reread.cfg");
    EXPECT_TRUE(cfg.Write(path.c_str()));
    CQoConfigFile back;
    EXPECT_TRUE(back.Open(path.c_str()));
    return back;
}

} // namespace

TEST(CQoConfigFileRoundTrip, AnyValueAndIntegerComesBackExactly)
{
    TempFolder tmp;
    std::vector<std::string> values = {
        "a=b=c", "[not a section]", "; not a comment", "line1\r\nline2\nline3\r",
        "C:\\daten\\", "\\n is not a newline", "  leading", "trailing  ", "", "\\x41",
    };
    std::string allBytes;
    for (int c = 1; c < 256; ++c)
        allBytes += static_cast<char>(c);
    values.push_back(allBytes);
    values.push_back(std::string("nul\0inside", 10));

    CQoConfigFile cfg;
    for (std::size_t i = 0; i < values.size(); ++i) {
        CQoString value;
        value.Assign(values[i].data(), values[i].size());
        ASSERT_TRUE(cfg.SetValue("Werte", ("k" + std::to_string(i)).c_str(), value));
    }
    // Names with the characters that structure the file.
    cfg.SetValue("Sektion ]mit[ = Zeichen", " key=with;all#[]\\ ", "v");
    // Integers, negative and large within their type.
    long const numbers[] = {0, -17, INT_MIN, INT_MAX, LONG_MIN, LONG_MAX};
    for (long v : numbers)
        cfg.SetValue("Zahlen", std::to_string(v).c_str(), v);

    CQoConfigFile back = Reread(cfg, tmp);
    for (std::size_t i = 0; i < values.size(); ++i) {
        CQoString value("preset");
        EXPECT_TRUE(back.GetValue("Werte", ("k" + std::to_string(i)).c_str(), value)) << i;
        EXPECT_EQ(values[i], value.Str()) << "value " << i;
    }
    CQoString value;
    EXPECT_TRUE(back.GetValue("Sektion ]mit[ = Zeichen", " key=with;all#[]\\ ", value));
    EXPECT_STREQ("v", value);
    for (long v : numbers) {
        SCOPED_TRACE(v);
        std::string key = std::to_string(v);
        long l = 99;
        int i = 99;
        EXPECT_TRUE(back.GetValue("Zahlen", key.c_str(), l));
        EXPECT_EQ(v, l);
        // An int takes the value only where it fits (LONG_MIN/MAX on 64-bit longs do not).
        bool fits = v >= INT_MIN && v <= INT_MAX;
        EXPECT_EQ(fits, back.GetValue("Zahlen", key.c_str(), i));
        EXPECT_EQ(fits ? v : 99, i);
    }
}

TEST(CQoConfigFileValues, MissingOrUnfitValuesKeepThePresetNamesIgnoreCase)
{
    CQoConfigFile cfg;
    cfg.SetValue("S", "text", "abc");
    cfg.SetValue("S", "big", "99999999999999999999999");
    cfg.SetValue("S", "half", "12abc");
    cfg.SetValue("S", "blank", "");

    CQoString s("preset");
    int i = 7;
    long l = 8;
    EXPECT_FALSE(cfg.GetValue("other", "text", s));
    EXPECT_STREQ("preset", s);
    for (char const *key : {"missing", "text", "half", "blank", "big"})
        EXPECT_FALSE(cfg.GetValue("S", key, i)) << key;
    EXPECT_FALSE(cfg.GetValue("S", "big", l));
    EXPECT_EQ(7, i);
    EXPECT_EQ(8, l);

    EXPECT_FALSE(cfg.SetValue("", "k", "v"));
    EXPECT_FALSE(cfg.SetValue(nullptr, "k", 1));
    EXPECT_EQ((std::vector<std::string>{"S"}), Names(cfg.GetSections()));

    // Names are case-insensitive and keep their order.
    cfg = CQoConfigFile();
    cfg.SetValue("Zweite", "b", "1");
    cfg.SetValue("Erste", "Gr\366\337e", "1");
    cfg.SetValue("erste", "a", "2");
    cfg.SetValue("ZWEITE", "a", "3");
    cfg.SetValue("ERSTE", "GR\326\337E", "4"); // same key, other case, umlaut included
    EXPECT_EQ((std::vector<std::string>{"Zweite", "Erste"}), Names(cfg.GetSections()));
    EXPECT_EQ((std::vector<std::string>{"Gr\366\337e", "a"}), Names(cfg.GetKeys("erste")));
    CQoString v;
    EXPECT_TRUE(cfg.GetValue("eRSTE", "gr\366\337E", v));
    EXPECT_STREQ("4", v);

    // Deleting and copying keys and sections.
    cfg = CQoConfigFile();
    cfg.SetValue("A", "x", "1");
    cfg.SetValue("A", "y", "2");
    cfg.SetValue("B", "z", "3");
    cfg.SetValue("C", "w", "4");

    EXPECT_TRUE(cfg.DeleteKey("a", "X"));
    EXPECT_EQ((std::vector<std::string>{"y"}), Names(cfg.GetKeys("A")));
    EXPECT_TRUE(cfg.DeleteSection("b"));
    EXPECT_EQ((std::vector<std::string>{"A", "C"}), Names(cfg.GetSections()));

    CQoConfigFile other;
    other.SetValue("a", "new", "n");
    other.SetValue("D", "d", "dd");

    cfg.CopySection(other, "A"); // replaced in place: old keys gone
    EXPECT_EQ((std::vector<std::string>{"new"}), Names(cfg.GetKeys("A")));
    cfg.CopySection(other, "D"); // new at the end
    EXPECT_EQ((std::vector<std::string>{"A", "C", "D"}), Names(cfg.GetSections()));
    cfg.CopySection(other, "C"); // the other has none: gone here too
    EXPECT_EQ((std::vector<std::string>{"A", "D"}), Names(cfg.GetSections()));
    cfg.CopySection(cfg, "A"); // itself: unchanged
    EXPECT_EQ((std::vector<std::string>{"new"}), Names(cfg.GetKeys("A")));
}

TEST(CQoConfigFileFormat, WrittenFileIsReadableText)
{
    TempFolder tmp;
    std::string path = tmp.Path("projekt.cfg");
    CQoConfigFile cfg;
    cfg.SetValue("Eingabe", "Datei", "C:\\daten\\kunden.txt");
    cfg.SetValue("Eingabe", "Zeichensatz", 1);
    cfg.SetValue("Ausgabe", "Trenner", " ; ");
    cfg.SetValue("Ausgabe", "Name", "M\374ller\r\nGmbH");
    cfg.SetValue("Ausgabe", "Begrenzer", "\"");
    ASSERT_TRUE(cfg.Write(path.c_str()));
    // Paths as a user would type them; quotes only where a value needs them.
    EXPECT_EQ("; qotools 2\r\n"
              "[Eingabe]\r\n"
              "Datei=C:\\daten\\kunden.txt\r\n"
              "Zeichensatz=1\r\n"
              "\r\n"
              "[Ausgabe]\r\n"
              "Trenner=\" ; \"\r\n"
              "Name=\"M\374ller\\r\\nGmbH\"\r\n"
              "Begrenzer=\"\\\"\"\r\n",
              ReadBytes(path));
    EXPECT_FALSE(CQoFile::Exists((path + ".~tmp").c_str()));
}

// Hand-written files and the earlier writer's (no mark), and the current writer's (marked).
TEST(CQoConfigFileFormat, ValuesReadAsWrittenByHandOrByEitherWriter)
{
    struct Case {
        bool marked;
        char const *line;
        std::string value;
    };
    Case const cases[] = {
        {false, "daten\\sicherung.txt", "daten\\sicherung.txt"},
        {false, "C:\\temp\\neu.txt", "C:\\temp\\neu.txt"},
        {false, "daten\\kunden.txt", "daten\\kunden.txt"},
        {false, "\\\\server\\freigabe\\", "\\\\server\\freigabe\\"},
        {false, "\"C:\\Programme\\x.txt\"", "\"C:\\Programme\\x.txt\""},
        {false, "\" x \"", "\" x \""},
        {false, "a\\x41b", "a\\x41b"}, // the earlier writer never escaped an A
        // the earlier writer's escapes
        {false, "C:\\\\daten\\\\x.txt", "C:\\daten\\x.txt"},
        {false, "\\s,\\s", " , "},
        {false, "\\x01\\\\", std::string("\x01\\")},
        {false, "\\sa\\r\\nb\\tc", " a\r\nb\tc"},
        {true, "C:\\\\daten\\x.txt", "C:\\\\daten\\x.txt"},
        {true, "\\s,\\s", "\\s,\\s"},
        {true, "\" a \"", " a "},
        {true, "\"\\x00\\t\\\"\\\\\"", std::string("\0\t\"\\", 4)},
        {true, "\"a\\\"b\"", "\"a\\\"b\""}, // the writer would not quote a"b
        {true, "\"\\q \"", "\"\\q \""},
    };
    TempFolder tmp;
    std::string path = tmp.Path("hand.cfg");
    for (Case const &c : cases) {
        SCOPED_TRACE(c.line);
        WriteBytes(path, std::string(c.marked ? "; qotools 2\r\n" : "") + "[S]\r\nk=" + c.line + "\r\n");
        CQoConfigFile cfg;
        ASSERT_TRUE(cfg.Open(path.c_str()));
        CQoString value("fehlt");
        EXPECT_TRUE(cfg.GetValue("S", "k", value));
        EXPECT_EQ(c.value, value.Str());
        // And what was read is written so that it reads the same again.
        CQoString again("fehlt");
        EXPECT_TRUE(Reread(cfg, tmp).GetValue("S", "k", again));
        EXPECT_EQ(c.value, again.Str());
    }
}

TEST(CQoConfigFileFormat, LinesEndWithCrLfOrEitherMalformedOnesAreSkipped)
{
    TempFolder tmp;
    std::string path = tmp.Path("zeilen.cfg");
    for (char const *end : {"\r", "\n", "\r\n"}) {
        SCOPED_TRACE(static_cast<int>(std::strlen(end)));
        std::string text = std::string("[Projekt]") + end + "Datei=a.txt" + end + "[Zwei]\r\nk=1\nl=2\r";
        WriteBytes(path, text);
        CQoConfigFile cfg;
        ASSERT_TRUE(cfg.Open(path.c_str()));
        EXPECT_EQ((std::vector<std::string>{"Projekt", "Zwei"}), Names(cfg.GetSections()));
        EXPECT_EQ((std::vector<std::string>{"k", "l"}), Names(cfg.GetKeys("Zwei")));
        CQoString v;
        EXPECT_TRUE(cfg.GetValue("Projekt", "Datei", v));
        EXPECT_STREQ("a.txt", v);
    }

    // Malformed lines are skipped.
    path = tmp.Path("kaputt.cfg");
    std::string junk = "vorher=keine Sektion\n"
                       "[Gut]\n"
                       "  a = 1  \n"
                       "ohne Gleichheitszeichen\n"
                       "=leerer Schluessel\n"
                       "b=bad \\q escape\n"
                       "c=cut \\x4\n"
                       "d=\\\n"
                       "; Kommentar=1\n"
                       "e=\x01\x02 binary\n"
                       "\xFF\xFE@@ junk=@\n"
                       "f=2\r\n"
                       "[Offen\n"
                       "g=lost after bad header\n"
                       "[]\n"
                       "h=lost after empty header\n"
                       "[Gut]\n"
                       "a=3\n"
                       "[Zweite] trailing\n"
                       "i=lost\n";
    for (char &c : junk)
        if (c == '@')
            c = '\0';
    WriteBytes(path, junk);
    CQoConfigFile cfg;
    ASSERT_TRUE(cfg.Open(path.c_str()));
    EXPECT_EQ((std::vector<std::string>{"Gut"}), Names(cfg.GetSections()));
    // A backslash that starts no escape is text, never a reason to drop a line.
    EXPECT_EQ((std::vector<std::string>{"a", "b", "c", "d", "f"}), Names(cfg.GetKeys("Gut")));
    CQoString v;
    EXPECT_TRUE(cfg.GetValue("Gut", "c", v));
    EXPECT_STREQ("cut \\x4", v);
    EXPECT_TRUE(cfg.GetValue("Gut", "a", v));
    EXPECT_STREQ("3", v); // the later value wins, the first place stays
    EXPECT_TRUE(cfg.GetValue("Gut", "f", v));
    EXPECT_STREQ("2", v);

    // Names that unescape to a NUL cannot be kept: the line is skipped, and the
    // keys below such a header do not end up in a nameless section.
    std::string nul = "[\\x00]\nk=weg\n[Gut]\nx\\x00y=weg\nz=1\n";
    WriteBytes(path, nul);
    ASSERT_TRUE(cfg.Open(path.c_str()));
    EXPECT_EQ((std::vector<std::string>{"Gut"}), Names(cfg.GetSections()));
    EXPECT_EQ((std::vector<std::string>{"z"}), Names(cfg.GetKeys("Gut")));

    // Pure binary data is not a configuration, but it is no crash either.
    std::string binary;
    for (int i = 0; i < 5000; ++i)
        binary += static_cast<char>((i * 7919) & 0xFF);
    WriteBytes(path, binary);
    EXPECT_TRUE(cfg.Open(path.c_str()));
    for (CQoString const &section : cfg.GetSections())
        EXPECT_FALSE(section.IsEmpty());
}

TEST(CQoConfigFileFiles, FailedOpenOrWriteKeepsContentsAndTheOldFile)
{
    TempFolder tmp;
    std::string path = tmp.Path("projekt.cfg");
    WriteBytes(path, "[Neu]\nk=v\n");
    CQoConfigFile cfg;
    cfg.SetValue("Alt", "k", "v");
    EXPECT_TRUE(cfg.Open(path.c_str())); // replaces what was there
    // A folder cannot be read: false, and the contents stay.
    EXPECT_FALSE(cfg.Open(tmp.Folder().string().c_str()));
    EXPECT_EQ((std::vector<std::string>{"Neu"}), Names(cfg.GetSections()));
    WriteBytes(path, "[Alt]\nk=v\n");
    // A user's file that happens to have a name the writer might pick.
    WriteBytes(path + ".~tmp", "fremd");

    // The target cannot be replaced: it is a folder. Nothing is left behind.
    std::string folder = tmp.Path("ordner.cfg");
    std::filesystem::create_directory(folder);
    std::filesystem::create_directory(folder + "/inhalt");
    EXPECT_FALSE(cfg.Write(folder.c_str()));
    EXPECT_TRUE(std::filesystem::is_directory(folder + "/inhalt"));
    EXPECT_EQ(3, std::distance(std::filesystem::directory_iterator(tmp.Folder()), {}));

    // And a good write replaces the old file completely.
    EXPECT_TRUE(cfg.Write(path.c_str()));
    EXPECT_EQ("; qotools 2\r\n[Neu]\r\nk=v\r\n", ReadBytes(path));
    EXPECT_EQ("fremd", ReadBytes(path + ".~tmp"));
}

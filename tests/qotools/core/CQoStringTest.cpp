#include "CQoException.h"
#include "CQoString.h"

#include <gtest/gtest.h>

#include <string>

TEST(CQoString, ComparesBytesUnsignedAndKeepsBytesAfterANul)
{
    // An umlaut (0xE4) sorts after every ASCII letter.
    EXPECT_TRUE(CQoString("z") < CQoString("\344"));
    EXPECT_TRUE(CQoString(static_cast<char const *>(nullptr)).IsEmpty());

    CQoString bytes;
    bytes.Assign("a\0b", 3);
    bytes.Append("\0c", 2);
    EXPECT_EQ(std::string("a\0b\0c", 5), bytes.Str());

    // One value reused for field after field: every length up and down
    // (short values are written in place, long ones through the library).
    std::string const source = "0123456789abcdefghijklmnopqrstuvwxyz";
    for (std::size_t from = 0; from <= 20; ++from)
        for (std::size_t to = 0; to <= 20; ++to) {
            CQoString value;
            value.Assign(source.data() + 1, from);
            value.Assign(source.data() + to % 7, to);
            ASSERT_EQ(source.substr(to % 7, to), value.Str()) << from << " -> " << to;
            ASSERT_EQ('\0', value.GetString()[to]);
        }
}

TEST(CQoString, OwnTextAsSourceMovesAndFormatOfShortAndLongText)
{
    // Short text lives in the object, long text on the heap: both survive
    // being their own source, copies and moves.
    for (std::string const &text : {std::string("kurz"), std::string(40, 'L') + "ang"}) {
        CQoString s(text.c_str());
        s.Assign(s.GetString() + 1, text.size() - 1);
        EXPECT_EQ(text.substr(1), s.Str());
        s.Append(s.GetString(), static_cast<std::size_t>(s.GetLength())); // doubles, may move
        EXPECT_EQ(text.substr(1) + text.substr(1), s.Str());
        s += s;
        EXPECT_EQ(4 * (text.size() - 1), s.Str().size());

        CQoString original(text.c_str());
        CQoString copy(original);
        CQoString moved(std::move(original));
        EXPECT_EQ(text, moved.Str());
        EXPECT_EQ(text, copy.Str());
        copy = std::move(moved);
        EXPECT_EQ(text, copy.Str());
        CQoString &same = copy;
        copy = same;
        EXPECT_EQ(text, copy.Str());
        EXPECT_EQ('\0', copy.GetString()[text.size()]);
    }
    // A length beyond an int is refused before anything is sized by it.
    CQoString s("kurz");
    EXPECT_THROW(s.Append("x", std::size_t(-1)), CQoException);
    EXPECT_THROW(s.Assign("x", std::size_t(1) << 31), CQoException);
    EXPECT_EQ("kurz", s.Str());

    // Format takes text of any length, its own included.
    std::string const longText(100000, 'L');
    s = "";
    s.Format("[%s]", longText.c_str());
    EXPECT_EQ("[" + longText + "]", s.Str());

    CQoString self(std::string(300, 's'));
    self.Format("%s+%s", self.GetString(), self.GetString());
    EXPECT_EQ(std::string(300, 's') + "+" + std::string(300, 's'), self.Str());
}

TEST(CQoString, CutsReplacesAndIndexesWithCheckedArguments)
{
    CQoString s("Hallo Welt");
    EXPECT_STREQ("", s.Left(-1));
    EXPECT_STREQ("Welt", s.Mid(6, 99));
    EXPECT_STREQ("", s.Mid(99, 2));
    EXPECT_STREQ("Hal", s.Mid(-3, 3));
    EXPECT_EQ(-1, s.Find('H', 50));

    // Index errors raise and change nothing.
    for (int bad : {-1, 10}) {
        try {
            s.GetAt(bad);
            FAIL() << "GetAt(" << bad << ") returned";
        } catch (CQoException const &e) {
            EXPECT_EQ(CQoException::indexError, e.Code());
        }
        EXPECT_THROW(s.SetAt(bad, 'y'), CQoException);
    }
    EXPECT_STREQ("Hallo Welt", s);

    // Replacing does not run away on its own output.
    CQoString grow("aaa");
    EXPECT_EQ(3, grow.Replace("a", "aa"));
    EXPECT_STREQ("aaaaaa", grow);
    CQoString overlap("aaaa");
    EXPECT_EQ(2, overlap.Replace("aa", "b"));
    EXPECT_STREQ("bb", overlap);
    EXPECT_EQ(0, overlap.Replace("", "x"));
    CQoString self("xyx");
    EXPECT_EQ(1, self.Replace(self.GetString(), "z"));
    EXPECT_STREQ("z", self);
}

TEST(CQoString, ChangesCaseAndUmlautsOfWindows1252Letters)
{
    CQoString s("abc \344\366\374\337 \351\340\377\232 1+");
    s.MakeUpper();
    EXPECT_STREQ("ABC \304\326\334\337 \311\300\237\212 1+", s);
    // The division and multiplication signs are not letters.
    EXPECT_EQ('\367', CQoString::ToUpper('\367'));
    EXPECT_EQ(0, CQoString("\304rger").CompareNoCase("\344RGER"));

    // Umlauts are replaced without changing case.
    s = "M\374ller, Gr\366\337e, \304rger \326l \334bel \344\351";
    s.NoUmlaute();
    EXPECT_STREQ("Mueller, Groesse, Aerger Oel Uebel ae\351", s);
}

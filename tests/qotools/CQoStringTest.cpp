#include "CQoException.h"
#include "CQoString.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>

// Windows-1252 letters used below, as octal escapes.
#define AE_L "\344"  // ä
#define OE_L "\366"  // ö
#define UE_L "\374"  // ü
#define AE_U "\304"  // Ä
#define OE_U "\326"  // Ö
#define UE_U "\334"  // Ü
#define SZ "\337"    // ß

TEST(CQoString, BuildsAndComparesAsAValue)
{
    CQoString a("abc");
    CQoString b = a;
    b += "def";
    b += 'g';
    EXPECT_STREQ("abc", a);
    EXPECT_STREQ("abcdefg", b);
    EXPECT_STREQ("<abc>", "<" + a + '>');

    // A null text is an empty string.
    EXPECT_TRUE(CQoString(static_cast<char const *>(nullptr)).IsEmpty());
    a = nullptr;
    EXPECT_TRUE(a.IsEmpty());

    // Bytes compare unsigned: an umlaut sorts after every ASCII letter.
    EXPECT_TRUE(CQoString("abc") < CQoString("abd"));
    EXPECT_TRUE(CQoString("z") < CQoString(AE_L));
    EXPECT_TRUE(CQoString("z") < AE_L);

    // Bytes after a NUL are kept.
    CQoString bytes;
    bytes.Assign("a\0b", 3);
    bytes.Append("\0c", 2);
    EXPECT_EQ(std::string("a\0b\0c", 5), bytes.Str());
}

TEST(CQoString, FormatsTextOfAnyLength)
{
    CQoString s;
    s.Format("%d-%s-%05.1f", -42, "x", 3.14159);
    EXPECT_STREQ("-42-x-003.1", s);

    std::string longText(100000, 'L');
    s.Format("[%s]", longText.c_str());
    EXPECT_EQ("[" + longText + "]", s.Str());

    // The string's own text as an argument, also when the result is long.
    CQoString self(std::string(300, 's'));
    self.Format("%s+%s", self.GetString(), self.GetString());
    EXPECT_EQ(std::string(300, 's') + "+" + std::string(300, 's'), self.Str());
}

TEST(CQoString, CutsPiecesWithClampedArguments)
{
    CQoString s("Hallo Welt");
    EXPECT_STREQ("Hallo", s.Left(5));
    EXPECT_STREQ("", s.Left(-1));
    EXPECT_STREQ("Hallo Welt", s.Left(99));
    EXPECT_STREQ("lo W", s.Mid(3, 4));
    EXPECT_STREQ("Welt", s.Mid(6, 99));
    EXPECT_STREQ("", s.Mid(99, 2));
    EXPECT_STREQ("Hal", s.Mid(-3, 3));
    EXPECT_STREQ("elt", s.Right(3));
    EXPECT_STREQ("Hallo Welt", s.Right(50));

    EXPECT_EQ(3, s.Find('l', 3));
    EXPECT_EQ(8, s.Find('l', 4));
    EXPECT_EQ(-1, s.Find('H', 50));
    EXPECT_EQ(-1, s.Find("Welt", 7));
    EXPECT_EQ(8, s.ReverseFind('l'));
    EXPECT_EQ(-1, s.ReverseFind('x'));
}

TEST(CQoString, ReplacesAndCounts)
{
    CQoString s("a;b;;c");
    EXPECT_EQ(3, s.Replace(";", ", "));
    EXPECT_STREQ("a, b, , c", s);

    CQoString grow("aaa");
    EXPECT_EQ(3, grow.Replace("a", "aa")); // must not run away on its own output
    EXPECT_STREQ("aaaaaa", grow);

    CQoString overlap("aaaa");
    EXPECT_EQ(2, overlap.Replace("aa", "b"));
    EXPECT_STREQ("bb", overlap);

    CQoString none("abc");
    EXPECT_EQ(0, none.Replace("", "x"));
    EXPECT_EQ(0, none.Replace("z", "x"));
    EXPECT_EQ(1, none.Replace("b", ""));
    EXPECT_STREQ("ac", none);
    EXPECT_EQ(1, none.Replace('c', 'C'));
    EXPECT_STREQ("aC", none);

    CQoString self("xyx");
    EXPECT_EQ(1, self.Replace(self.GetString(), "z"));
    EXPECT_STREQ("z", self);
}

TEST(CQoString, ChangesCaseOfWindows1252Letters)
{
    CQoString s("abc " AE_L OE_L UE_L SZ " \351\340\377\232 1+");
    s.MakeUpper();
    EXPECT_STREQ("ABC " AE_U OE_U UE_U SZ " \311\300\237\212 1+", s);
    s.MakeLower();
    EXPECT_STREQ("abc " AE_L OE_L UE_L SZ " \351\340\377\232 1+", s);
    // The division and multiplication signs are not letters.
    EXPECT_EQ('\367', CQoString::ToUpper('\367'));
    EXPECT_EQ('\327', CQoString::ToLower('\327'));

    EXPECT_EQ(0, CQoString(AE_U "rger").CompareNoCase(AE_L "RGER"));
    EXPECT_LT(CQoString("abc").CompareNoCase("ABD"), 0);
    EXPECT_GT(CQoString("abcd").CompareNoCase("ABC"), 0);
}

TEST(CQoString, ReplacesUmlautsWithoutChangingCase)
{
    CQoString s("M" UE_L "ller, Gr" OE_L SZ "e, " AE_U "rger " OE_U "l " UE_U "bel " AE_L "\351");
    s.NoUmlaute();
    EXPECT_STREQ("Mueller, Groesse, Aerger Oel Uebel ae\351", s);

    // Umlauts first, then upper case: the order output sources use.
    CQoString upper("Stra" SZ "e");
    upper.NoUmlaute().MakeUpper();
    EXPECT_STREQ("STRASSE", upper);
}

TEST(CQoString, IndexErrorsRaise)
{
    CQoString s("abc");
    s.SetAt(1, 'X');
    EXPECT_EQ('c', s.GetAt(2));
    for (int bad : {-1, 3, 1000}) {
        try {
            s.GetAt(bad);
            FAIL() << "GetAt(" << bad << ") returned";
        } catch (CQoException const &e) {
            EXPECT_EQ(CQoException::indexError, e.Code());
        }
        EXPECT_THROW(s.SetAt(bad, 'y'), CQoException);
    }
    EXPECT_STREQ("aXc", s);
}

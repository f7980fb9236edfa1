#include "CQoStringTokenizer.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

std::vector<std::string> Tokens(char const *text, char const *separators, bool keepEmpty = false)
{
    std::vector<std::string> out;
    for (CQoString const &token : CQoStringTokenizer::Split(text, separators, keepEmpty))
        out.push_back(token.Str());
    return out;
}

typedef std::vector<std::string> V;

} // namespace

TEST(Tokenizer, SplitsPathsAtBackslashes)
{
    EXPECT_EQ((V{"C:", "Daten", "Kunden"}), Tokens("C:\\Daten\\Kunden\\", "\\"));
    EXPECT_EQ((V{"Daten"}), Tokens("\\\\Daten", "\\"));
    EXPECT_EQ((V{"C:"}), Tokens("C:", "\\"));
    EXPECT_EQ(V{}, Tokens("\\\\\\", "\\"));
    EXPECT_EQ(V{}, Tokens("", "\\"));
    EXPECT_EQ(V{}, Tokens(nullptr, "\\"));
}

TEST(Tokenizer, AnyCharacterOfTheSetSeparates)
{
    EXPECT_EQ((V{"a", "b", "c", "d"}), Tokens("a;b, c;;d", "; ,"));
    // Windows-1252 bytes above 0x7F work as separators and inside tokens.
    EXPECT_EQ((V{"M\xFCller", "\xC4rger"}), Tokens("M\xFCller\xA7\xC4rger", "\xA7"));
    // No separators: the whole text is one token.
    EXPECT_EQ((V{"a b"}), Tokens("a b", ""));
    EXPECT_EQ((V{"a b"}), Tokens("a b", nullptr));
}

TEST(Tokenizer, KeepsEmptyTokensWhenAsked)
{
    EXPECT_EQ((V{"a", "", "b", ""}), Tokens("a,,b,", ",", true));
    EXPECT_EQ((V{"", "a"}), Tokens(",a", ",", true));
    EXPECT_EQ((V{""}), Tokens("", ",", true));
    EXPECT_EQ((V{"", ""}), Tokens(",", ",", true));
}

TEST(Tokenizer, StepsCountsAndRestarts)
{
    CQoStringTokenizer t("eins zwei  drei", " ");
    EXPECT_EQ(3, t.CountTokens());
    EXPECT_TRUE(t.HasMoreTokens());
    EXPECT_STREQ("eins", t.NextToken());
    EXPECT_STREQ("zwei  drei", t.Rest());
    EXPECT_EQ(2, t.CountTokens());
    CQoString token("x");
    EXPECT_TRUE(t.NextToken(token));
    EXPECT_STREQ("zwei", token);
    EXPECT_STREQ("drei", t.Rest());
    EXPECT_TRUE(t.NextToken(token));
    EXPECT_FALSE(t.HasMoreTokens());
    EXPECT_FALSE(t.NextToken(token));
    EXPECT_STREQ("drei", token); // untouched at the end
    EXPECT_STREQ("", t.NextToken());
    EXPECT_STREQ("", t.Rest());
    t.Reset();
    EXPECT_STREQ("eins", t.NextToken());

    CQoStringTokenizer keep("a,", ",", true);
    EXPECT_EQ(2, keep.CountTokens());
    keep.NextToken();
    EXPECT_TRUE(keep.HasMoreTokens());
    EXPECT_STREQ("", keep.NextToken());
    EXPECT_FALSE(keep.HasMoreTokens());
}

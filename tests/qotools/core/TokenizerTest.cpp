#include "CQoStringTokenizer.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

typedef std::vector<std::string> V;

TEST(Tokenizer, SplitsAtAnyCharacterOfTheSet)
{
    struct Case {
        char const *text, *separators;
        bool keepEmpty;
        V tokens;
    } const cases[] = {
        {"C:\\Daten\\Kunden\\", "\\", false, {"C:", "Daten", "Kunden"}},
        {"\\\\\\", "\\", false, {}},
        {nullptr, "\\", false, {}},
        {"a;b, c;;d", "; ,", false, {"a", "b", "c", "d"}},
        // Windows-1252 bytes above 0x7F work as separators and inside tokens.
        {"M\xFCller\xA7\xC4rger", "\xA7", false, {"M\xFCller", "\xC4rger"}},
        {"a b", nullptr, false, {"a b"}},
        {"a,,b,", ",", true, {"a", "", "b", ""}},
        {"", ",", true, {""}},
    };
    for (auto const &c : cases) {
        SCOPED_TRACE(c.text ? c.text : "(null)");
        V tokens;
        for (CQoString const &token : CQoStringTokenizer::Split(c.text, c.separators, c.keepEmpty))
            tokens.emplace_back(token.Str());
        EXPECT_EQ(c.tokens, tokens);
    }
}

TEST(Tokenizer, StepsCountsAndRestarts)
{
    CQoStringTokenizer t("eins zwei  drei", " ");
    EXPECT_STREQ("eins", t.NextToken());
    EXPECT_STREQ("zwei  drei", t.Rest());
    EXPECT_EQ(2, t.CountTokens());
    CQoString token("x");
    EXPECT_TRUE(t.NextToken(token));
    EXPECT_TRUE(t.NextToken(token));
    EXPECT_FALSE(t.NextToken(token));
    EXPECT_STREQ("drei", token); // untouched at the end
    t.Reset();
    EXPECT_STREQ("eins", t.NextToken());

    CQoStringTokenizer keep("a,", ",", true);
    keep.NextToken();
    EXPECT_TRUE(keep.HasMoreTokens());
    EXPECT_STREQ("", keep.NextToken());
    EXPECT_FALSE(keep.HasMoreTokens());
}

#include "CPatternMatcher.h"

#include <gtest/gtest.h>

#include <string>

TEST(PatternMatcher, MatchesWildcardsIgnoringCaseOnRequest)
{
    struct Case {
        char const *pattern, *text;
        bool ignoreCase, match;
    } const cases[] = {
        // ? takes exactly one character.
        {"?:", "C:", true, true},
        {"?:", "C:\\", true, false},
        {"?:", ":", true, false},
        {"?:", nullptr, true, false},
        // * takes any run of characters, the empty one too.
        {"*.txt", ".txt", true, true},
        {"*.txt", "kunden.txt.bak", true, false},
        {"*a*b", "aaab", true, true},
        {"*a*b", "aaba", true, false},
        {"", "a", true, false},
        {nullptr, nullptr, true, true},
        {"a*?", "a", true, false},
        // Case, umlauts included (capital and small a-umlaut).
        {"\xC4nderung*", "\xE4NDERUNG.doc", true, true},
        {"KUNDEN.*", "kunden.txt", false, false},
    };
    for (auto const &c : cases) {
        SCOPED_TRACE(std::string(c.pattern ? c.pattern : "(null)") + " / " + (c.text ? c.text : "(null)"));
        EXPECT_EQ(c.match, CPatternMatcher::Match(c.pattern, c.text, c.ignoreCase));
    }
}

TEST(PatternMatcher, ManyStarsDoNotBlowUp)
{
    // A backtracking matcher would need about 2^40 steps for this one.
    std::string pattern;
    for (int i = 0; i < 40; ++i)
        pattern += "*a";
    pattern += "*b";
    std::string const text(2000, 'a');
    EXPECT_FALSE(CPatternMatcher::Match(pattern.c_str(), text.c_str()));
    EXPECT_TRUE(CPatternMatcher::Match(pattern.c_str(), (text + "b").c_str()));
}

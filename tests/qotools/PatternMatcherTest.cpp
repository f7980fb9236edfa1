#include "CPatternMatcher.h"

#include <gtest/gtest.h>

#include <string>

TEST(PatternMatcher, QuestionMarkTakesExactlyOneCharacter)
{
    CPatternMatcher drive("?:");
    EXPECT_TRUE(drive.Match("C:"));
    EXPECT_TRUE(drive.Match("z:"));
    EXPECT_FALSE(drive.Match("C:\\"));
    EXPECT_FALSE(drive.Match(":"));
    EXPECT_FALSE(drive.Match("Daten"));
    EXPECT_FALSE(drive.Match(""));
    EXPECT_FALSE(drive.Match(nullptr));
    EXPECT_STREQ("?:", drive.GetPattern());
}

TEST(PatternMatcher, StarTakesAnyRunOfCharacters)
{
    EXPECT_TRUE(CPatternMatcher::Match("*.txt", "kunden.txt"));
    EXPECT_TRUE(CPatternMatcher::Match("*.txt", ".txt"));
    EXPECT_FALSE(CPatternMatcher::Match("*.txt", "kunden.txt.bak"));
    EXPECT_TRUE(CPatternMatcher::Match("k*n*.t?t", "kunden.txt"));
    EXPECT_TRUE(CPatternMatcher::Match("*a*b", "aaab"));
    EXPECT_FALSE(CPatternMatcher::Match("*a*b", "aaba"));
    EXPECT_TRUE(CPatternMatcher::Match("***", ""));
    EXPECT_TRUE(CPatternMatcher::Match("", ""));
    EXPECT_FALSE(CPatternMatcher::Match("", "a"));
    EXPECT_TRUE(CPatternMatcher::Match(nullptr, nullptr));
    EXPECT_TRUE(CPatternMatcher::Match("a*", "a"));
    EXPECT_FALSE(CPatternMatcher::Match("a*?", "a"));
}

TEST(PatternMatcher, CaseIsIgnoredByDefaultUmlautsIncluded)
{
    EXPECT_TRUE(CPatternMatcher::Match("KUNDEN.*", "kunden.txt"));
    EXPECT_TRUE(CPatternMatcher::Match("\xC4nderung*", "\xE4NDERUNG.doc")); // capital and small a-umlaut
    EXPECT_FALSE(CPatternMatcher::Match("KUNDEN.*", "kunden.txt", false));
    CPatternMatcher exact("Abc", false);
    EXPECT_FALSE(exact.Match("abc"));
    exact.SetIgnoreCase(true);
    EXPECT_TRUE(exact.Match("abc"));
    exact.SetPattern("x?");
    EXPECT_TRUE(exact.Match("XY"));
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

TEST(PatternMatcher, TellsPatternsWithWildcards)
{
    EXPECT_TRUE(CPatternMatcher::HasWildcards("?:"));
    EXPECT_TRUE(CPatternMatcher::HasWildcards("a*"));
    EXPECT_FALSE(CPatternMatcher::HasWildcards("C:\\Daten"));
    EXPECT_FALSE(CPatternMatcher::HasWildcards(nullptr));
}

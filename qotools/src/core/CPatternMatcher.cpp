#include "CPatternMatcher.h"

#include <cstring>

CPatternMatcher::CPatternMatcher(char const *pattern, bool ignoreCase)
    : m_pattern(pattern), m_ignoreCase(ignoreCase)
{
}

void CPatternMatcher::SetPattern(char const *pattern) { m_pattern = pattern; }

bool CPatternMatcher::Match(char const *text) const { return Match(m_pattern, text, m_ignoreCase); }

bool CPatternMatcher::HasWildcards(char const *pattern)
{
    return pattern && std::strpbrk(pattern, "*?") != nullptr;
}

bool CPatternMatcher::Match(char const *pattern, char const *text, bool ignoreCase)
{
    if (!pattern)
        pattern = "";
    if (!text)
        text = "";
    auto same = [ignoreCase](char a, char b) {
        return a == b || (ignoreCase && CQoString::ToLower(a) == CQoString::ToLower(b));
    };

    // Greedy matching that remembers only the last star: when a later part
    // fails, the last star takes one more character and matching resumes after
    // it. Earlier stars never need to be revisited, which keeps this linear in
    // the number of attempts per text position.
    char const *p = pattern;
    char const *t = text;
    char const *starPattern = nullptr; // just behind the last star seen
    char const *starText = nullptr;    // text position that star is tried from
    while (*t) {
        if (*p == '*') {
            while (*p == '*')
                ++p;
            if (!*p)
                return true; // a trailing star takes the rest
            starPattern = p;
            starText = t;
        } else if (*p && (*p == '?' || same(*p, *t))) {
            ++p;
            ++t;
        } else if (starPattern) {
            p = starPattern;
            t = ++starText;
        } else {
            return false;
        }
    }
    while (*p == '*')
        ++p;
    return *p == '\0';
}

// CPatternMatcher: matches texts against a wildcard pattern, as file names are
// matched on Windows.
//
// In a pattern `?` stands for exactly one character and `*` for any run of
// characters (also none); every other character stands for itself. The whole
// text must match, so "?:" accepts a drive such as "C:" but not "C:\Daten".
// Letters are compared without regard to case by default (Windows-1252 letters
// included), as the file system does; pass `ignoreCase = false` for exact case.
//
//     CPatternMatcher drive("?:");
//     if (drive.Match(firstPart)) ...
//
// Matching takes time proportional to text length times pattern length at
// worst, whatever the number of stars, so hostile patterns cannot stall it.
#pragma once

#include "QoToolsApi.h"

#include "CQoString.h"

class QOTOOLS_API CPatternMatcher {
public:
    explicit CPatternMatcher(char const *pattern = nullptr, bool ignoreCase = true);

    void SetPattern(char const *pattern);
    char const *GetPattern() const { return m_pattern; }
    void SetIgnoreCase(bool ignoreCase) { m_ignoreCase = ignoreCase; }
    bool GetIgnoreCase() const { return m_ignoreCase; }

    // Whether the whole text (null counts as empty) matches the pattern.
    bool Match(char const *text) const;

    // One-off form of the above.
    static bool Match(char const *pattern, char const *text, bool ignoreCase = true);

    // Whether a pattern holds wildcards at all (otherwise it matches only one text).
    static bool HasWildcards(char const *pattern);

private:
    CQoString m_pattern;
    bool m_ignoreCase;
};

// CQoStringTokenizer: splits a text into tokens at separator characters.
//
// Paths, lists and keys are taken apart with it: give the text and the set of
// separator characters, then fetch the tokens one by one.
//
//     CQoStringTokenizer parts("C:\\Daten\\Kunden\\", "\\");
//     for (CQoString part; parts.NextToken(part);) ...   // "C:", "Daten", "Kunden"
//
// By default a run of separators counts as one and separators at the start and
// end give no token, so "a,,b," gives "a" and "b". With `keepEmpty` every
// separator ends a token: "a,,b," then gives "a", "", "b" and "" (and an empty
// text gives one empty token). The tokenizer works on its own copy of the text.
#pragma once

#include "QoToolsApi.h"

#include "CQoString.h"

#include <vector>

class QOTOOLS_API CQoStringTokenizer {
public:
    // `separators` is a set of characters (null or empty: no separator, the
    // whole text is one token).
    CQoStringTokenizer(char const *text, char const *separators, bool keepEmpty = false);

    // Whether NextToken will deliver another token.
    bool HasMoreTokens() const;
    // The next token into `token`; false (token untouched) when none is left.
    bool NextToken(CQoString &token);
    // The next token, or empty text when none is left.
    CQoString NextToken();
    // The number of tokens not yet fetched.
    int CountTokens() const;
    // The text after the current position, from the start of the next token
    // on (separators before it skipped unless empty tokens are kept).
    CQoString Rest() const;
    // Starts again at the beginning of the text.
    void Reset();

    // All tokens of a text at once.
    static std::vector<CQoString> Split(char const *text, char const *separators, bool keepEmpty = false);

private:
    bool IsSeparator(char ch) const;
    // Position where the next token starts, or -1 when there is none.
    int NextStart() const;

    CQoString m_text;
    bool m_separator[256];
    bool m_keepEmpty;
    int m_pos = 0;
    // Keeping empty tokens: a separator just consumed promises one more token
    // even at the end of the text ("a," gives "a" and "").
    bool m_pendingEmpty = false;
};

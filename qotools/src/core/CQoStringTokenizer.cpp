#include "CQoStringTokenizer.h"

#include <cstring>

CQoStringTokenizer::CQoStringTokenizer(char const *text, char const *separators, bool keepEmpty)
    : m_text(text), m_keepEmpty(keepEmpty)
{
    std::memset(m_separator, 0, sizeof m_separator);
    if (separators)
        for (char const *p = separators; *p; ++p)
            m_separator[static_cast<unsigned char>(*p)] = true;
    Reset();
}

void CQoStringTokenizer::Reset()
{
    m_pos = 0;
    // With empty tokens kept, even an empty text holds one (empty) token.
    m_pendingEmpty = m_keepEmpty;
}

bool CQoStringTokenizer::IsSeparator(char ch) const
{
    return m_separator[static_cast<unsigned char>(ch)];
}

int CQoStringTokenizer::NextStart() const
{
    int const length = m_text.GetLength();
    if (m_keepEmpty)
        return (m_pos < length || m_pendingEmpty) ? m_pos : -1;
    int pos = m_pos;
    char const *data = m_text.GetString();
    while (pos < length && IsSeparator(data[pos]))
        ++pos;
    return pos < length ? pos : -1;
}

bool CQoStringTokenizer::HasMoreTokens() const { return NextStart() >= 0; }

bool CQoStringTokenizer::NextToken(CQoString &token)
{
    int const start = NextStart();
    if (start < 0)
        return false;
    int const length = m_text.GetLength();
    char const *data = m_text.GetString();
    int end = start;
    while (end < length && !IsSeparator(data[end]))
        ++end;
    token.Assign(data + start, static_cast<std::size_t>(end - start));
    if (end < length) {
        m_pos = end + 1; // consume the one separator that ends the token
        m_pendingEmpty = m_keepEmpty;
    } else {
        m_pos = length;
        m_pendingEmpty = false;
    }
    return true;
}

CQoString CQoStringTokenizer::NextToken()
{
    CQoString token;
    NextToken(token);
    return token;
}

int CQoStringTokenizer::CountTokens() const
{
    CQoStringTokenizer copy(*this);
    int count = 0;
    CQoString ignored;
    while (copy.NextToken(ignored))
        ++count;
    return count;
}

CQoString CQoStringTokenizer::Rest() const
{
    int const start = NextStart();
    return start < 0 ? CQoString() : m_text.Mid(start);
}

std::vector<CQoString> CQoStringTokenizer::Split(char const *text, char const *separators, bool keepEmpty)
{
    std::vector<CQoString> tokens;
    CQoStringTokenizer tokenizer(text, separators, keepEmpty);
    for (CQoString token; tokenizer.NextToken(token);)
        tokens.push_back(token);
    return tokens;
}

#include "QoXmlScanner.h"

#include "CQoException.h"

#include <cstring>

namespace {

// Deeper nesting than any workbook part has; bounds the stack of open tags.
constexpr std::size_t maxDepth = 1000;

bool IsSpace(char c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n'; }

std::string_view LocalName(std::string_view qualified)
{
    std::size_t colon = qualified.rfind(':');
    return colon == std::string_view::npos ? qualified : qualified.substr(colon + 1);
}

void AppendUtf8(unsigned long cp, std::string &out)
{
    if (cp == 0 || cp > 0x10FFFF || (cp >= 0xD800 && cp <= 0xDFFF)) {
        out += '?';
    } else if (cp < 0x80) {
        out += char(cp);
    } else if (cp < 0x800) {
        out += char(0xC0 | (cp >> 6));
        out += char(0x80 | (cp & 0x3F));
    } else if (cp < 0x10000) {
        out += char(0xE0 | (cp >> 12));
        out += char(0x80 | ((cp >> 6) & 0x3F));
        out += char(0x80 | (cp & 0x3F));
    } else {
        out += char(0xF0 | (cp >> 18));
        out += char(0x80 | ((cp >> 12) & 0x3F));
        out += char(0x80 | ((cp >> 6) & 0x3F));
        out += char(0x80 | (cp & 0x3F));
    }
}

// Windows-1252 bytes 0x80..0x9F and the characters they stand for (0: unused).
unsigned short const ansiHigh[32] = {
    0x20AC, 0,      0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021, 0x02C6, 0x2030, 0x0160,
    0x2039, 0x0152, 0,      0x017D, 0,      0,      0x2018, 0x2019, 0x201C, 0x201D, 0x2022,
    0x2013, 0x2014, 0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0,      0x017E, 0x0178};

char AnsiOf(unsigned long cp)
{
    if (cp < 0x80 || (cp >= 0xA0 && cp <= 0xFF))
        return char(cp);
    for (int i = 0; i < 32; ++i)
        if (ansiHigh[i] && ansiHigh[i] == cp)
            return char(0x80 + i);
    return '?';
}

} // namespace

void QoAppendUtf8AsAnsi(std::string_view utf8, std::string &out)
{
    std::size_t i = 0, n = utf8.size();
    while (i < n) {
        unsigned char c = static_cast<unsigned char>(utf8[i]);
        if (c < 0x80) {
            out += char(c);
            ++i;
            continue;
        }
        int more = c >= 0xF0 && c <= 0xF4 ? 3 : c >= 0xE0 ? (c < 0xF0 ? 2 : -1) : c >= 0xC2 ? 1 : -1;
        if (more < 0 || n - i <= std::size_t(more)) {
            out += '?';
            ++i;
            continue;
        }
        unsigned long cp = c & (0x3F >> more);
        bool good = true;
        for (int k = 1; k <= more; ++k) {
            unsigned char t = static_cast<unsigned char>(utf8[i + k]);
            if ((t & 0xC0) != 0x80) {
                good = false;
                break;
            }
            cp = cp << 6 | (t & 0x3F);
        }
        // Overlong forms and surrogates are not characters.
        if (!good || (more == 2 && cp < 0x800) || (more == 3 && (cp < 0x10000 || cp > 0x10FFFF)) ||
            (cp >= 0xD800 && cp <= 0xDFFF)) {
            out += '?';
            ++i;
            continue;
        }
        out += AnsiOf(cp);
        i += std::size_t(more) + 1;
    }
}

QoXmlScanner::QoXmlScanner(char const *data, std::size_t size, std::string where)
    : m_p(data), m_end(data + size), m_where(std::move(where))
{
}

void QoXmlScanner::Fail(char const *text) const
{
    std::string message = "Die Excel-Arbeitsmappe ist besch\344digt: ";
    message += text;
    CQoException::Throw(message.c_str(), m_where.c_str());
}

bool QoXmlScanner::Attribute(std::string_view name, std::string_view &value) const
{
    for (Attr const &a : m_attrs)
        if (LocalName(a.name) == name) {
            value = a.value;
            return true;
        }
    return false;
}

void QoXmlScanner::AppendText(std::string &out) const
{
    if (m_cdata)
        out.append(m_text.data(), m_text.size());
    else
        Decode(m_text, out);
}

void QoXmlScanner::SkipElement()
{
    if (m_empty)
        return;
    std::size_t depth = m_open.size();
    for (;;) {
        Kind k = Next();
        if (k == finished || (k == endTag && m_open.size() < depth))
            return;
    }
}

QoXmlScanner::Kind QoXmlScanner::Next()
{
    for (;;) {
        if (m_p >= m_end) {
            if (!m_open.empty())
                Fail("ein XML-Teil endet mitten im Inhalt");
            return finished;
        }
        if (*m_p != '<') {
            char const *lt = static_cast<char const *>(std::memchr(m_p, '<', std::size_t(m_end - m_p)));
            char const *stop = lt ? lt : m_end;
            m_text = std::string_view(m_p, std::size_t(stop - m_p));
            m_cdata = false;
            m_p = stop;
            m_depth = int(m_open.size());
            return text;
        }
        std::size_t left = std::size_t(m_end - m_p);
        if (left >= 2 && m_p[1] == '?') {
            char const *close = nullptr;
            for (char const *q = m_p + 2; q + 1 < m_end; ++q)
                if (q[0] == '?' && q[1] == '>') {
                    close = q;
                    break;
                }
            if (!close)
                Fail("eine XML-Anweisung ist nicht abgeschlossen");
            m_p = close + 2;
            continue;
        }
        if (left >= 4 && std::memcmp(m_p, "<!--", 4) == 0) {
            char const *close = nullptr;
            for (char const *q = m_p + 4; q + 2 < m_end; ++q)
                if (q[0] == '-' && q[1] == '-' && q[2] == '>') {
                    close = q;
                    break;
                }
            if (!close)
                Fail("ein XML-Kommentar ist nicht abgeschlossen");
            m_p = close + 3;
            continue;
        }
        if (left >= 9 && std::memcmp(m_p, "<![CDATA[", 9) == 0) {
            char const *close = nullptr;
            for (char const *q = m_p + 9; q + 2 < m_end; ++q)
                if (q[0] == ']' && q[1] == ']' && q[2] == '>') {
                    close = q;
                    break;
                }
            if (!close)
                Fail("ein CDATA-Abschnitt ist nicht abgeschlossen");
            m_text = std::string_view(m_p + 9, std::size_t(close - m_p - 9));
            m_cdata = true;
            m_p = close + 3;
            m_depth = int(m_open.size());
            return text;
        }
        if (left >= 2 && m_p[1] == '!')
            Fail("XML-Dokumenttypen (DOCTYPE) sind in einer Arbeitsmappe nicht zul\344ssig");
        break;
    }

    char const *p = m_p + 1;
    bool closing = p < m_end && *p == '/';
    if (closing)
        ++p;
    char const *nameStart = p;
    while (p < m_end && !IsSpace(*p) && *p != '>' && *p != '/')
        ++p;
    std::string_view qualified(nameStart, std::size_t(p - nameStart));
    if (qualified.empty())
        Fail("ein XML-Tag hat keinen Namen");
    m_name = LocalName(qualified);
    if (closing) {
        while (p < m_end && IsSpace(*p))
            ++p;
        if (p >= m_end || *p != '>')
            Fail("ein XML-Endtag ist nicht abgeschlossen");
        if (m_open.empty() || m_open.back() != qualified)
            Fail("ein XML-Endtag passt nicht zum offenen Element");
        m_depth = int(m_open.size());
        m_open.pop_back();
        m_p = p + 1;
        return endTag;
    }

    m_attrs.clear();
    m_empty = false;
    for (;;) {
        while (p < m_end && IsSpace(*p))
            ++p;
        if (p >= m_end)
            Fail("ein XML-Tag ist nicht abgeschlossen");
        if (*p == '>') {
            ++p;
            break;
        }
        if (*p == '/') {
            if (p + 1 >= m_end || p[1] != '>')
                Fail("ein XML-Tag ist nicht abgeschlossen");
            m_empty = true;
            p += 2;
            break;
        }
        char const *an = p;
        while (p < m_end && !IsSpace(*p) && *p != '=' && *p != '>' && *p != '/')
            ++p;
        std::string_view attrName(an, std::size_t(p - an));
        while (p < m_end && IsSpace(*p))
            ++p;
        if (attrName.empty() || p >= m_end || *p != '=')
            Fail("ein XML-Attribut ist ung\374ltig");
        ++p;
        while (p < m_end && IsSpace(*p))
            ++p;
        if (p >= m_end || (*p != '"' && *p != '\''))
            Fail("ein XML-Attribut ist ung\374ltig");
        char quote = *p++;
        char const *vs = p;
        char const *ve = static_cast<char const *>(std::memchr(p, quote, std::size_t(m_end - p)));
        if (!ve)
            Fail("ein XML-Attribut ist nicht abgeschlossen");
        m_attrs.push_back(Attr{attrName, std::string_view(vs, std::size_t(ve - vs))});
        p = ve + 1;
    }
    m_p = p;
    m_depth = int(m_open.size()) + 1;
    if (!m_empty) {
        if (m_open.size() >= maxDepth)
            Fail("XML-Elemente sind zu tief verschachtelt (mehr als 1000 Ebenen)");
        m_open.push_back(qualified);
    }
    return startTag;
}

void QoXmlScanner::Decode(std::string_view raw, std::string &out)
{
    std::size_t i = 0, n = raw.size();
    while (i < n) {
        std::size_t amp = raw.find('&', i);
        if (amp == std::string_view::npos) {
            out.append(raw.data() + i, n - i);
            return;
        }
        out.append(raw.data() + i, amp - i);
        std::size_t semi = raw.find(';', amp);
        // Entity names are short; a far semicolon belongs to other text.
        if (semi == std::string_view::npos || semi - amp > 12) {
            out += '&';
            i = amp + 1;
            continue;
        }
        std::string_view name = raw.substr(amp + 1, semi - amp - 1);
        bool known = true;
        if (name == "amp")
            out += '&';
        else if (name == "lt")
            out += '<';
        else if (name == "gt")
            out += '>';
        else if (name == "quot")
            out += '"';
        else if (name == "apos")
            out += '\'';
        else if (name.size() >= 2 && name[0] == '#') {
            bool hex = name[1] == 'x' || name[1] == 'X';
            std::size_t k = hex ? 2 : 1;
            unsigned long cp = 0;
            known = k < name.size();
            for (; k < name.size() && known; ++k) {
                char c = name[k];
                int digit = c >= '0' && c <= '9' ? c - '0'
                            : hex && c >= 'a' && c <= 'f' ? c - 'a' + 10
                            : hex && c >= 'A' && c <= 'F' ? c - 'A' + 10
                                                          : -1;
                if (digit < 0)
                    known = false;
                else if (cp <= 0x10FFFF)
                    cp = cp * (hex ? 16 : 10) + unsigned(digit);
            }
            if (known)
                AppendUtf8(cp, out);
        } else {
            known = false;
        }
        if (!known) {
            out.append(raw.data() + amp, semi + 1 - amp);
        }
        i = semi + 1;
    }
}

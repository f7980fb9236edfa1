// QoXmlScanner: a small pull tokenizer for the XML parts of a workbook.
//
// Workbook parts are machine-written XML of modest vocabulary, and a sheet
// of 100,000 rows must read quickly, so this scanner walks the bytes in place
// without building a tree or copying: Next() stops at each start tag, end tag
// and piece of text, and names, attribute values and text are views into the
// buffer (valid until the buffer goes). Namespace prefixes are dropped from
// names; the parts we read never mix two meanings of one local name.
// Comments, processing instructions and the declaration are skipped; CDATA
// comes back as text that needs no decoding. A DOCTYPE is refused (entity
// definitions would let a small part expand without bound).
// Malformed markup (an unterminated tag, an end tag that does not close the
// open one, missing end tags) raises CQoException naming the part.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

class QoXmlScanner {
public:
    enum Kind { finished, startTag, endTag, text };

    // `where` names the file and part for messages.
    QoXmlScanner(char const *data, std::size_t size, std::string where);

    Kind Next();
    // Local name of the current tag.
    std::string_view Name() const { return m_name; }
    // A start tag written as <x/>: no end tag follows it (Next reports none).
    bool Empty() const { return m_empty; }
    // Depth of the current start tag (root = 1), or of the element holding
    // the current text or being closed.
    int Depth() const { return m_depth; }
    // Raw value of the current start tag's attribute with this local name.
    bool Attribute(std::string_view name, std::string_view &value) const;
    // Raw text (entities not yet decoded; CDATA when RawIsCdata()).
    std::string_view Text() const { return m_text; }
    bool TextIsCdata() const { return m_cdata; }
    // Appends the current text, decoded, to `out` in UTF-8.
    void AppendText(std::string &out) const;
    // Skips the content of the current start tag up to its end tag.
    void SkipElement();

    // Decodes the entities of a raw value into UTF-8 (unknown entities stay
    // as written, so nothing is lost).
    static void Decode(std::string_view raw, std::string &out);

    [[noreturn]] void Fail(char const *text) const;

private:
    char const *m_p;
    char const *m_end;
    std::string m_where;
    std::string_view m_name;
    std::string_view m_text;
    bool m_cdata = false;
    bool m_empty = false;
    int m_depth = 0;
    std::vector<std::string_view> m_open;
    struct Attr {
        std::string_view name, value;
    };
    std::vector<Attr> m_attrs;
};

// UTF-8 to Windows-1252: characters the code page lacks, and bytes that are
// not UTF-8, become '?'.
void QoAppendUtf8AsAnsi(std::string_view utf8, std::string &out);

// CQoConfigFile: keys in sections, kept in memory and stored as readable text.
//
// Projects and filters keep their settings here: `Open` reads a file (a missing
// file is simply an empty configuration), `GetValue`/`SetValue` work on the
// keys of a section, `Write` stores everything. Writing is atomic: the text goes
// to a temporary file next to the target, which then replaces the target in one
// step, so a crash or a full disk never leaves a half-written configuration.
//
// File format (Windows-1252 text; the writer ends lines with CR LF, the reader
// takes CR LF, LF and CR alike):
//
//     ; qotools 2
//     [section]
//     key=value
//
// * Section and key names are case-insensitive (as Windows INI files are);
//   the spelling of the first use is kept. Both are unique in a file, and the
//   order of sections and keys is kept as read or first set.
// * Values are written as they are, so that a path reads as a user would type
//   it (`Datei=C:\daten\kunden.txt`). A value that would not survive as plain
//   text (a control character such as a line break, a blank or tab at either
//   end, a leading `"`) is written quoted: `"`, the text with the escapes
//   \\ \" \r \n \t and \xHH, `"`.
// * The first line marks a file of this writer. Below it a value is read
//   quoted only when it is exactly what the writer makes of its text;
//   everything else is taken as it stands.
// * Files without the mark are written by hand or by the earlier writer, which
//   escaped every value (\\ \r \n \t, \s for a blank at either end, \xHH).
//   A value there is read in that escaped form only when it is exactly what
//   the earlier writer made of its text and holds one of \\, \s or \xHH
//   (`C:\\daten\\x.txt`, `\s;\s`); otherwise it is taken as it stands,
//   so `daten\sicherung.txt` and `C:\temp\neu.txt` mean what they say.
//   The earlier writer's values whose only escapes are \r \n \t cannot be
//   told from typed paths and are read as they stand.
// * Section and key names keep the escaped form in every file (the escapes
//   above, and \xHH for `= [ ] ; #`, so a key may even contain '='); a
//   backslash that starts no escape is taken as it stands.
// * Reading is forgiving: blank lines and lines starting with ';' or '#' are
//   comments; a line without '=', an unterminated section header, raw control
//   bytes, an empty key or a key before the first section is skipped (keys
//   after a bad header are skipped until the next good one). A key that
//   appears twice keeps its first place and its last value. Comments are not
//   kept.
#pragma once

#include "QoToolsApi.h"

#include "CQoString.h"

#include <vector>

class QOTOOLS_API CQoConfigFile {
public:
    CQoConfigFile();
    ~CQoConfigFile();
    CQoConfigFile(CQoConfigFile const &other);
    CQoConfigFile &operator=(CQoConfigFile const &other);

    // Replaces the contents by the file's. A missing file gives an empty
    // configuration and true; a file that exists but cannot be read answers
    // false and leaves the contents as they were.
    bool Open(char const *path);
    // Stores the whole configuration atomically (see above). False when the
    // file could not be written; an existing file is then unchanged.
    bool Write(char const *path) const;

    // Text and integer values. A missing key (or, for the integer forms, a
    // value that is not a number in range) leaves `value` as it was and
    // answers false.
    bool GetValue(char const *section, char const *key, CQoString &value) const;
    bool GetValue(char const *section, char const *key, int &value) const;
    bool GetValue(char const *section, char const *key, long &value) const;
    // An integer that sizes or places something: a missing key answers false
    // and leaves `value`; a value that is not a number, or lies outside
    // low .. high, raises CQoException naming the key.
    bool GetValue(char const *section, char const *key, int &value, int low, int high) const;

    // Sets a key, creating the section and the key at their ends when new.
    // False (and nothing set) for an empty section or key name.
    bool SetValue(char const *section, char const *key, char const *value);
    bool SetValue(char const *section, char const *key, CQoString const &value);
    bool SetValue(char const *section, char const *key, int value);
    bool SetValue(char const *section, char const *key, long value);

    // True when something was deleted.
    bool DeleteKey(char const *section, char const *key);
    bool DeleteSection(char const *section);

    // Makes this file's section a copy of the other's: its keys are replaced
    // by the other's (at the section's place; a new section goes to the end).
    // When the other has no such section, this one's is removed too.
    void CopySection(CQoConfigFile const &other, char const *section);

    void Clear();

    bool HasSection(char const *section) const;
    bool HasKey(char const *section, char const *key) const;
    // Names in file order.
    std::vector<CQoString> GetSections() const;
    std::vector<CQoString> GetKeys(char const *section) const;

    // The file text as Write stores it.
    CQoString ToText() const;
    // Replaces the contents by those parsed from `text` (the rules above).
    void FromText(char const *text, std::size_t length);

private:
    struct Entry {
        CQoString key;
        CQoString value;
    };
    struct Section {
        CQoString name;
        std::vector<Entry> entries;
    };

    Section *FindSection(char const *name);
    Section const *FindSection(char const *name) const;
    static Entry const *FindEntry(Section const &section, char const *key);
    Section &MakeSection(char const *name);

    std::vector<Section> m_sections;
};

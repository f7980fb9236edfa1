// CQoInputFilterText: what the line-oriented text filters share.
//
// The delimited filter (CQoInputFilterTextVar) and the fixed-column lines
// filter (CQoInputFilterTextVF) read a text file record by record. This base
// does the reading: it skips the configured number of lines at the start,
// takes the column names from the first record when asked to, keeps the row
// index (the file offset of every row read so far, 8 bytes per row) so that
// AbsoluteRow is a seek once a row has been passed, and routes records that do
// not fit the format through ReportWrongInput and the record-repair hook.
// A derived filter only says how one record is cut into fields.
//
// Memory: only the current record and the row index are held, whatever the
// size of the file.
//
// Defective records. When a record does not fit, the repair hook gets the
// record followed by the data after it (at most 64 KiB) and the offset of the
// next line as the presumed start of the next record. Its answers:
//   take over  the corrected text is read as the record (it must fit; else
//              the one-line correction, CQoInterActive::CorrectRepair, is
//              asked until it does or gives up, which stops reading);
//   skip       the record is left out and reading goes on where the hook said;
//   stop       reading ends with CQoException ("Einlesen abgebrochen").
// Without a hook a defective record raises CQoException (formatError) naming
// the row. Each decision is remembered, so going back over a repaired record
// does not ask again.
#pragma once

#include "CQoInputFilter.h"

#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

class QoTextReader;

class QOTOOLS_API CQoInputFilterText : public CQoInputFilter {
public:
    CQoInputFilterText();
    CQoInputFilterText(CQoInputFilterText const &other);
    CQoInputFilterText &operator=(CQoInputFilterText const &other);
    ~CQoInputFilterText() override;

    void ColName(int col, CQoString &name) override;
    bool FirstRow() override;
    bool NextRow() override;
    bool AbsoluteRow(long row) override;
    void Value(int col, CQoString &value) override;
    bool EmptyRow() override;
    // Opens the file, skips the lines to skip, reads the names (when the
    // first record holds them) and the column layout. Raises CQoException
    // when the file cannot be opened.
    void Init(CQoString const &name) override;
    void CopyFrom(CQoInputFilter const &other) override;
    void WriteConfig(CQoConfigFile &cfg, CQoString const &section) override;
    void ReadConfig(CQoConfigFile &cfg, CQoString const &section) override;
    void LoadColumnNames() override;
    bool CreateIndexFile() override;
    void NoCache(bool noCache) override;
    long long getActPosInFile() override;

    // Lines skipped at the start of the file, before the names or the data.
    int Skip() const { return m_nSkip; }
    void Skip(int lines);

    // Bytes of the row index (for the curious and the benchmarks).
    std::size_t IndexBytes() const { return m_index.size() * sizeof(long long); }

protected:
    long CalculateRecordCount() override;
    bool CloseFile() override;
    bool ReopenFile() override;

    // --- what a derived filter supplies --------------------------------------
    enum parseResult {
        parseRecord,       // a record was cut into m_fields
        parseEnd,          // no record: the end of the data
        parseMore,         // the record runs past `end`: call again with more
        parseUnterminated, // the data ends inside the record (open encloser)
    };
    // Cuts the record that starts at `begin` into fields (AddField,
    // AddScratchField). `eof` says that the file ends at `end`. On
    // parseRecord, `used` is the record's length including its line end.
    virtual int ParseRecord(char const *begin, char const *end, bool eof, std::size_t &used) = 0;
    // Why a record that parsed does not fit the layout, or empty text when it
    // fits. The base finds no fault.
    virtual CQoString CheckRecord();
    // After the names (if any) were read: fixes the column count. The base
    // takes the greatest number of fields among the first rows.
    virtual void DetermineColumns();

    // --- for ParseRecord -----------------------------------------------------
    // (Inline: the parsers call these for every field of every record.)
    void ClearFields()
    {
        m_nFields = 0;
        m_scratch.clear();
    }
    // A field that is a piece of the parsed data.
    void AddField(char const *data, std::size_t length)
    {
        if (m_nFields == m_fields.size())
            GrowFields();
        m_fields[m_nFields++] = {static_cast<std::uint32_t>(data - m_recordBase), static_cast<std::uint32_t>(length),
                                 false};
    }
    // A field built in the scratch text: begin it, append, end it.
    void BeginScratchField() { m_scratchStart = m_scratch.size(); }
    void AppendScratch(char const *data, std::size_t length) { m_scratch.append(data, length); }
    void AppendScratch(char ch) { m_scratch.push_back(ch); }
    void EndScratchField();
    int NumFields() const { return static_cast<int>(m_nFields); }
    // Field i of the current record as pointer and length.
    void FieldAt(int i, char const *&data, std::size_t &length) const
    {
        Field const &f = m_fields[static_cast<std::size_t>(i)];
        data = (f.scratch ? m_scratch.data() : m_recordBase) + f.offset;
        length = f.length;
    }

    // Reads the record at `offset` (defects repaired or raised); answers
    // false at the end of the data. Sets m_curOffset and m_nextOffset.
    bool ReadRecordAt(long long offset, bool checkLayout);
    // Offset after `lines` line ends from `offset`.
    long long SkipLines(long long offset, int lines);

    std::unique_ptr<QoTextReader> m_reader;
    int m_nSkip = 0;
    long long m_dataStart = 0;     // offset of row 0
    long long m_curOffset = -1;    // offset of the current record
    long long m_nextOffset = 0;    // offset after the current record

private:
    struct Field {
        std::uint32_t offset;
        std::uint32_t length;
        bool scratch;
    };
    struct Repair {
        bool takeOver;
        CQoString record;
        long long next;
    };

    // The file offsets of the rows read so far, in blocks of rows, so that a
    // long file grows the index without copying it and without a small
    // allocation every few rows.
    class RowIndex {
    public:
        std::size_t size() const { return m_size; }
        bool empty() const { return m_size == 0; }
        long long operator[](std::size_t row) const { return m_blocks[row >> kShift][row & kMask]; }
        long long back() const { return (*this)[m_size - 1]; }
        void push_back(long long offset)
        {
            if ((m_size & kMask) == 0 && (m_size >> kShift) == m_blocks.size())
                m_blocks.emplace_back(new long long[kMask + 1]);
            m_blocks[m_size >> kShift][m_size & kMask] = offset;
            ++m_size;
        }
        void clear()
        {
            m_blocks.clear();
            m_size = 0;
        }
        void shrink_to_fit() { m_blocks.shrink_to_fit(); }

    private:
        static constexpr unsigned kShift = 13; // 8192 rows, 64 KiB a block
        static constexpr std::size_t kMask = (std::size_t(1) << kShift) - 1;
        std::vector<std::unique_ptr<long long[]>> m_blocks;
        std::size_t m_size = 0;
    };

    bool ReadRow(long row, long long offset);
    void GrowFields();
    int ParseHere(std::size_t &used);
    int ParseText(CQoString const &text, std::size_t &used);
    bool HandleDefect(long long offset, CQoString const &why, int parseState);
    // What went wrong with a record that did not end: an open encloser, or
    // a record beyond the size limit.
    CQoString DefectOfUnterminated();
    void ResetRows();

    std::vector<Field> m_fields;          // room for the fields; the first m_nFields are in use
    std::size_t m_nFields = 0;
    char const *m_recordBase = nullptr;   // parsed data (inside the reader)
    bool m_recordInReader = false;        // m_recordBase is the reader's window
    std::string m_scratch;
    std::size_t m_scratchStart = 0;
    CQoString m_correction;               // text of a taken-over record
    RowIndex m_index;                     // offsets of the rows read
    bool m_indexComplete = false;
    std::map<long long, Repair> m_repairs;
    long m_lReadingRow = -1;              // the row being read, for messages; -1: the header
};

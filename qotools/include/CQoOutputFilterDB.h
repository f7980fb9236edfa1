// CQoOutputFilterDB: an output filter that writes a table of a database.
//
// The database outputs (DAO, ODBC) derive from it. Besides the column names it
// keeps, per column, a database type (`dbtype`), a length (for text columns)
// and whether the column gets an index, plus the target table's name and the
// show-error switch: with it set, database errors are shown to the user
// instead of being raised.
#pragma once

#include "CQoOutputFilter.h"

class CQoDatabase;

class QOTOOLS_API CQoOutputFilterDB : public CQoOutputFilter {
public:
    // Column types; stored in configuration files.
    enum dbtype {
        dbtypeInteger = 1,
        dbtypeText = 2
    };
    // What new columns get.
    enum { defaultLength = 30 };

    CQoOutputFilterDB();

    // --- virtual operations appended to those of CQoOutputFilter ------------
    // Per-column settings; an index outside 0 .. NumCols()-1 raises code 19.
    // Any type value is kept; the derived filter decides what it can write.
    virtual void SetType(int col, int type);
    virtual void SetLength(int col, int length);
    virtual void SetIndexed(int col, bool indexed);
    virtual bool GetIndexed(int col);
    virtual int GetType(int col);
    virtual int GetLength(int col);
    virtual void SetShowError(bool show);
    // Writes into the given database from now on (not owned); the base keeps
    // the pointer.
    virtual void UseDB(CQoDatabase *db);
    // Writes into the database named by `name` (a path or connect string),
    // which the derived filter opens. The base keeps the name.
    virtual void UseDB(char const *name);
    // Stops using the database; the base forgets it.
    virtual void ReleaseDB();
    // Resizes the per-column arrays too (new columns: text, defaultLength, no
    // index).
    void NumCols(int cols) override;
    using CQoOutputFilter::NumCols;

    // --- plain operations ----------------------------------------------------
    void SetTableName(CQoString const &name) { m_strTableName = name; }
    CQoString const &GetTableName() const { return m_strTableName; }
    bool GetShowError() const { return m_bShowError; }
    CQoDatabase *GetDB() const { return m_pDatabase; }
    CQoString const &GetDBName() const { return m_strDBName; }

protected:
    CQoString m_strTableName;
    std::vector<int> m_types;
    std::vector<int> m_lengths;
    std::vector<char> m_indexed;
    bool m_bShowError = false;
    CQoDatabase *m_pDatabase = nullptr;  // not owned
    CQoString m_strDBName;
};

// CQoInputFilterDB: an input filter that reads a table of a database.
//
// The database filters (DAO, ODBC) derive from it. Besides the input filter's
// state it keeps the database's name (a file path or a connect string), the
// table name and what that name means (`tabletype`). A host calls Init with the
// database name, which opens it and, when a table is configured, InitTable;
// InitTable switches to another table of the open database.
#pragma once

#include "CQoInputFilter.h"

class QOTOOLS_API CQoInputFilterDB : public CQoInputFilter {
public:
    // What the table name stands for; stored in configuration files.
    enum tabletype {
        tableNone = 0,   // nothing selected
        tableTable = 1,  // a table given by name
        tableQuery = 2,  // a stored query given by name
        tableSql = 3     // an SQL statement given whole
    };

    CQoInputFilterDB();

    // --- virtual operations appended to those of CQoInputFilter -------------
    // Releases the recordsets and closes the database. The base forgets the
    // current row.
    virtual void CloseResources();
    // Selects the table, query or statement `name` of the open database;
    // with `countRows` the row count is determined when first needed. The base
    // stores name and type and marks the filter modified.
    virtual void InitTable(char const *name, tabletype type, bool countRows);

    // --- plain operations ----------------------------------------------------
    CQoString const &GetDatabaseName() const { return m_strDatabaseName; }
    void SetDatabaseName(CQoString const &name) { m_strDatabaseName = name; }
    CQoString const &GetTableName() const { return m_strTableName; }
    void SetTableName(CQoString const &name) { m_strTableName = name; }
    tabletype GetTableType() const { return m_tableType; }
    void SetTableType(tabletype type) { m_tableType = type; }

protected:
    CQoString m_strDatabaseName;     // database file or connect string
    CQoString m_strTableName;        // table, query or statement
    tabletype m_tableType = tableNone;
};

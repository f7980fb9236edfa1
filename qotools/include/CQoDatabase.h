// CQoDatabase: one database connection, as the output filters use it.
//
// The DAO and ODBC databases derive from it. The name given at construction
// is what the connection is made from (a file path, a connect string); a host
// opens the database, hands it to an output filter (CQoOutputFilterDB::UseDB)
// or runs statements itself, and closes it.
#pragma once

#include "QoToolsApi.h"

#include "CQoString.h"

class QOTOOLS_API CQoDatabase {
public:
    explicit CQoDatabase(CQoString const &name);
    CQoDatabase(CQoDatabase const &) = delete;
    CQoDatabase &operator=(CQoDatabase const &) = delete;

    // --- virtual operations (the order is part of the contract) -------------
    virtual ~CQoDatabase();
    // Opens (with `create`: creates) the database; answers IsOpen().
    virtual bool Open(bool create) = 0;
    virtual bool IsOpen() = 0;
    virtual void Close() = 0;
    // Runs one statement on the open database; nothing when it is closed.
    virtual void ExecuteSql(char const *sql) = 0;
    // The string the connection is made from; the base answers the name.
    virtual CQoString GetConnectString();

    // --- plain operations ----------------------------------------------------
    CQoString const &GetName() const { return m_strName; }

private:
    CQoString m_strName;
};

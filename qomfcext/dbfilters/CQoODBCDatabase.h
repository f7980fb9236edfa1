// CQoODBCDatabase - one ODBC connection as a CQoDatabase.
//
// The name given at construction is the connect string, handed to the driver
// manager unchanged ("DSN=Kunden;UID=..." or "Driver=...;Database=...").
// A host opens it (ODBC data sources exist already: Open(true) is refused),
// runs statements or hands it to an output filter, and closes it. Errors of
// the data source are raised as CQoException with the driver's message.
#pragma once

#include <afxdb.h>

#include <CQoDatabase.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoODBCDatabase : public CQoDatabase
{
public:
    explicit CQoODBCDatabase(const CQoString& name);

    virtual ~CQoODBCDatabase();
    // `create` must be false: the library does not create ODBC data sources.
    virtual bool Open(bool create) override;
    virtual bool IsOpen() override;
    virtual void Close() override;
    // Runs one statement; nothing when the connection is closed.
    virtual void ExecuteSql(const char* sql) override;
    // The connect string as the driver manager completed it after Open.
    virtual CQoString GetConnectString() override;

private:
    CDatabase m_database;
};

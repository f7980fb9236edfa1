// CQoDaoDatabase - one file database (an Access-type database, an .mdb file
// read only) as a CQoDatabase.
//
// The name given at construction is the path of the database file. A host
// opens it (or creates it: Open(true)), runs action statements, hands it on
// and closes it. Errors of the engine are raised as CQoException with its
// description.
#pragma once

#include <afxdao.h>

#include <CQoDatabase.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoDaoDatabase : public CQoDatabase
{
public:
    explicit CQoDaoDatabase(const CQoString& name);

    virtual ~CQoDaoDatabase();
    // Creates (true) or opens (false) the file; answers IsOpen().
    virtual bool Open(bool create) override;
    virtual bool IsOpen() override;
    virtual void Close() override;
    // Runs one action statement; nothing when the database is closed.
    virtual void ExecuteSql(const char* sql) override;

private:
    CDaoDatabase m_database;
};

// CScopeLogger - a scope marker that applications of the family may place in
// their code. This library gives it no effect: it records nothing; the
// constructor's arguments and m_lLevel belong to the exported interface only.
#pragma once

#include "QoMfcExtApi.h"

class QOMFCEXT_API CScopeLogger
{
public:
    CScopeLogger(int level, const char* scope, const char* text);
    CScopeLogger(const CScopeLogger&);
    CScopeLogger& operator=(const CScopeLogger&);
    virtual ~CScopeLogger();

    static long m_lLevel;
};

#include "CScopeLogger.h"

long CScopeLogger::m_lLevel = 0;

CScopeLogger::CScopeLogger(int, const char*, const char*) {}

CScopeLogger::CScopeLogger(const CScopeLogger&) {}

CScopeLogger& CScopeLogger::operator=(const CScopeLogger&)
{
    return *this;
}

CScopeLogger::~CScopeLogger() {}

#include "CQoInterActive.h"

#include "CQoString.h"

namespace {

bool g_quiet = false;
CQoInterActive::CorrectRepairFunc g_correctRepair = nullptr;
CQoInterActive::RepairRecordFunc g_repairRecord = nullptr;

} // namespace

bool CQoInterActive::IsQuiet() { return g_quiet; }

void CQoInterActive::SetQuiet(bool quiet) { g_quiet = quiet; }

void CQoInterActive::SetCorrectRepair(CorrectRepairFunc func) { g_correctRepair = func; }

CQoInterActive::CorrectRepairFunc CQoInterActive::GetCorrectRepair() { return g_correctRepair; }

int CQoInterActive::CorrectRepair(CQoString &record)
{
    return g_correctRepair ? g_correctRepair(record) : 0;
}

void CQoInterActive::SetRepairRecord(RepairRecordFunc func) { g_repairRecord = func; }

CQoInterActive::RepairRecordFunc CQoInterActive::GetRepairRecord() { return g_repairRecord; }

int CQoInterActive::RepairRecord(CQoString const &file, CQoString &data, int &pos)
{
    return g_repairRecord ? g_repairRecord(file, data, pos) : repairNoHandler;
}

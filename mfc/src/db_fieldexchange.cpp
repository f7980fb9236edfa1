// Field exchange: RFX_Text and what each exchange does with the member it
// names (bind it to a result column, fill it from the row, empty it for a
// new row, read it into the row being appended).
#include "afxdb.h"

#include "db_private.h"

using qodb::StateOf;

CFieldExchange::CFieldExchange(UINT nOperation, CRecordset* prs, void* pvField)
    : m_nOperation(nOperation), m_nFieldType(outputColumn), m_prs(prs), m_nFieldFound(0) {
  UNUSED(pvField);
}

void AFXAPI RFX_Text(CFieldExchange* pFX, LPCTSTR szName, CString& value, int nMaxLength, int nColumnType,
                     short nScale) {
  UNUSED(nScale);
  ASSERT(pFX != NULL && pFX->m_prs != NULL);
  // Parameters are not part of this subset: only result columns are exchanged.
  if (pFX->m_nFieldType != CFieldExchange::outputColumn) return;
  ++pFX->m_nFieldFound;
  pFX->m_prs->ExchangeText(pFX, szName, value, nMaxLength, nColumnType);
}

namespace qodb {

CString BareName(LPCSTR lpszName) {
  CString strName = lpszName != NULL ? lpszName : "";
  strName.Trim();
  int n = strName.GetLength();
  if (n >= 2 && ((strName[0] == '[' && strName[n - 1] == ']') || (strName[0] == '"' && strName[n - 1] == '"') ||
                 (strName[0] == '`' && strName[n - 1] == '`')))
    strName = strName.Mid(1, n - 2);
  return strName;
}

} // namespace qodb

void CRecordset::ExchangeText(CFieldExchange* pFX, LPCTSTR szName, CString& value, int nMaxLength,
                              int nColumnType) {
  qodb::RecordsetState& st = StateOf(m_pState);
  size_t nField = (size_t)pFX->m_nFieldFound - 1;
  switch (pFX->m_nOperation) {
  case CFieldExchange::BindFieldToColumn: {
    ASSERT(nField == st.bindings.size());
    // By position when the names agree (a join may repeat a name), otherwise
    // by name.
    CString strName = qodb::BareName(szName);
    int nColumn = -1;
    if (nField < st.columns.size() && st.columns[nField].strName.CompareNoCase(strName) == 0) {
      nColumn = (int)nField;
    } else {
      for (size_t i = 0; i < st.columns.size() && nColumn < 0; ++i)
        if (st.columns[i].strName.CompareNoCase(strName) == 0) nColumn = (int)i;
    }
    if (nColumn < 0) {
      CString strError;
      strError.Format("Die Spalte \"%s\" gibt es in \"%s\" nicht.", (LPCSTR)strName, (LPCSTR)m_strSQL);
      qodb::Throw(SQL_ERROR, strError);
    }
    CRecordset::Binding binding;
    binding.strName = strName;
    binding.pValue = &value;
    binding.nMaxLength = nMaxLength;
    binding.nColumnType = nColumnType;
    binding.nColumn = nColumn;
    st.bindings.push_back(binding);
    break;
  }
  case CFieldExchange::Fixup:
    ASSERT(nField < st.bindings.size());
    value = st.row[(size_t)st.bindings[nField].nColumn];
    break;
  case CFieldExchange::MarkForAddNew:
  case CFieldExchange::SetFieldNull:
    value.Empty();
    break;
  case CFieldExchange::StoreField: {
    ASSERT(nField < st.bindings.size() && nField < st.pending.size());
    std::string& out = st.pending[nField];
    if (m_pDatabase->GetTextForm() == CDatabase::textUtf8) {
      // The store keeps UTF-8 and takes narrow text as it comes: converted
      // here, the driver has nothing left to convert.
      out.clear();
      qodb::AppendUtf8(out, value, (size_t)value.GetLength());
    } else {
      out.assign((LPCSTR)value, (size_t)value.GetLength());
    }
    break;
  }
  default:
    break;
  }
}

void CRecordset::FillBoundFields() {
  CFieldExchange fx(CFieldExchange::Fixup, this);
  DoFieldExchange(&fx);
}


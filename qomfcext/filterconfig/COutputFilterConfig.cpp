#include "COutputFilterConfig.h"

IMPLEMENT_DYNAMIC(COutputFilterConfig, CModelessDialog)

BEGIN_MESSAGE_MAP(COutputFilterConfig, CModelessDialog)
END_MESSAGE_MAP()

COutputFilterConfig::COutputFilterConfig(int nNotifierId, UINT nIDTemplate, CWnd* pParent)
    : CModelessDialog(nIDTemplate, pParent), CModifiedNotifier(nNotifierId), m_pOutputFilter(NULL),
      m_pOutputSource(NULL)
{
}

COutputFilterConfig::~COutputFilterConfig() {}

void COutputFilterConfig::DefaultAction() {}

void COutputFilterConfig::RefreshDisplay() {}

void COutputFilterConfig::SetSourceAndFilter(CQoOutputSource* pSource, CQoOutputFilter* pFilter)
{
    m_pOutputSource = pSource;
    m_pOutputFilter = pFilter;
}

void COutputFilterConfig::OnOK()
{
    DefaultAction();
}

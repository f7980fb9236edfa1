#include "CInputFilterConfig.h"

#include "CInputFilterConfigDao.h"
#include "CInputFilterConfigDbase.h"
#include "CInputFilterConfigTextFix.h"
#include "CInputFilterConfigTextVar.h"
#include "CQoInputFilterDao.h"
#include "CQoInputFilterDbase34.h"
#include "CQoInputFilterTextFix.h"
#include "CQoInputFilterTextVF.h"
#include "CQoInputFilterTextVar.h"

IMPLEMENT_DYNAMIC(CInputFilterConfig, CModelessDialog)

CInputFilterConfig::CInputFilterConfig(CQoInputFilter* pFilter, int nNotifierId, UINT nIDTemplate,
                                       CWnd* pParent)
    : CModelessDialog(nIDTemplate, pParent),
      CModifiedNotifier(nNotifierId),
      m_lMaxPreviewRows(1000),
      m_pInputFilter(pFilter)
{
}

CInputFilterConfig::~CInputFilterConfig()
{
}

void CInputFilterConfig::DefaultAction()
{
}

// The page is chosen by the type the filter reports; the cast is checked as well,
// so that a filter that claims a type it is not of gets no page rather than one
// that would misread it.
CInputFilterConfig* CInputFilterConfig::GetAppropriateConfig(CQoInputFilter* pFilter, int nNotifierId)
{
    if (pFilter == NULL) return NULL;
    switch (pFilter->InputFilterType()) {
    case CQoInputFilter::filterTextVar:
        if (CQoInputFilterTextVar* pTextVar = dynamic_cast<CQoInputFilterTextVar*>(pFilter))
            return new CInputFilterConfigTextVar(pTextVar, nNotifierId);
        return NULL;
    case CQoInputFilter::filterDbase3:
    case CQoInputFilter::filterDbase4:
        if (CQoInputFilterDbase34* pDbase = dynamic_cast<CQoInputFilterDbase34*>(pFilter))
            return new CInputFilterConfigDbase(pDbase, nNotifierId);
        return NULL;
    case CQoInputFilter::filterExcel:
    case CQoInputFilter::filterAccess:
        if (CQoInputFilterDao* pDao = dynamic_cast<CQoInputFilterDao*>(pFilter))
            return new CInputFilterConfigDao(pDao, nNotifierId);
        return NULL;
    case CQoInputFilter::filterTextFix:
        if (dynamic_cast<CQoInputFilterTextFix*>(pFilter) != NULL)
            return new CInputFilterConfigTextFix(pFilter, nNotifierId, false);
        return NULL;
    case CQoInputFilter::filterTextVF:
        if (dynamic_cast<CQoInputFilterTextVF*>(pFilter) != NULL)
            return new CInputFilterConfigTextFix(pFilter, nNotifierId, true);
        return NULL;
    default:
        // Unknown types never have a page.
        return NULL;
    }
}

#include "CModifiedNotifier.h"

#include <algorithm>
#include <vector>

CModifiedNotifier::CModifiedNotifier(int nNotifierId)
    : m_nNotifierId(nNotifierId)
{
}

// The listeners belong to others: they are neither called nor told here.
CModifiedNotifier::~CModifiedNotifier() {}

int CModifiedNotifier::Find(CModifiedListener* pListener) const
{
    for (INT_PTR i = 0; i < m_arrListeners.GetSize(); ++i)
        if (m_arrListeners[i] == pListener)
            return static_cast<int>(i);
    return -1;
}

void CModifiedNotifier::AddModifiedListener(CModifiedListener* pListener)
{
    if (pListener == NULL || Find(pListener) >= 0)
        return;
    m_arrListeners.Add(pListener);
}

void CModifiedNotifier::RemoveModifiedListener(CModifiedListener* pListener)
{
    int nIndex = Find(pListener);
    if (nIndex >= 0)
        m_arrListeners.RemoveAt(nIndex);
}

int CModifiedNotifier::NotifyListeners()
{
    // The list may change under a call. Each step takes the first listener of
    // the list as it stands now that has not been told in this pass: one added
    // meanwhile is told too, and when one is removed (a listener taking itself
    // out, say) its successor does not slide past the index and miss the news.
    std::vector<CModifiedListener*> told;
    INT_PTR i = 0;
    while (i < m_arrListeners.GetSize()) {
        CModifiedListener* pListener = m_arrListeners[i];
        if (std::find(told.begin(), told.end(), pListener) != told.end()) {
            ++i;
            continue;
        }
        told.push_back(pListener);
        if (!pListener->ModifiedListenerSetModified(1, m_nNotifierId))
            return 0;
        i = 0;
    }
    return 1;
}

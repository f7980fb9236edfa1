#include "CQoTreeNode.h"

#include "CQoTreeCtrl.h"

CQoTreeNode::CQoTreeNode(const char* lpszText, int nImageId, bool bCanCollapse)
    : m_pTreeCtrl(NULL),
      m_pParent(NULL),
      m_hTreeItem(NULL),
      m_strText(lpszText != NULL ? lpszText : ""),
      m_nImageId(nImageId),
      m_bCanCollapse(bCanCollapse)
{
}

CQoTreeNode::~CQoTreeNode() {}

void CQoTreeNode::SelectionChanged(CQoTreeNode* pNode)
{
    if (m_pParent != NULL) m_pParent->SelectionChanged(pNode);
}

bool CQoTreeNode::SelectionChanging(CQoTreeNode* pNode)
{
    return m_pParent != NULL ? m_pParent->SelectionChanging(pNode) : false;
}

void CQoTreeNode::OnSelectionChanged() { SelectionChanged(this); }
bool CQoTreeNode::OnSelectionChanging() { return SelectionChanging(this); }
void CQoTreeNode::ItemExpanding() {}
bool CQoTreeNode::OnTreeNotification(int) { return false; }

void CQoTreeNode::SetTreeNodeText(const CString& strText)
{
    if (m_strText == strText) return;
    m_strText = strText;
    TellCtrlModified();
}

void CQoTreeNode::SetTreeNodeImageId(int nImageId)
{
    if (m_nImageId == nImageId) return;
    m_nImageId = nImageId;
    TellCtrlModified();
}

bool CQoTreeNode::GetCanCollapse() const
{
    if (!m_bCanCollapse) return false;
    for (INT_PTR i = 0; i < m_children.GetSize(); ++i)
        if (!m_children[i]->GetCanCollapse()) return false;
    return true;
}

void CQoTreeNode::SetCanCollapse(bool bCanCollapse)
{
    if (m_bCanCollapse == bCanCollapse) return;
    m_bCanCollapse = bCanCollapse;
    TellCtrlModified();
}

CQoTreeNode* CQoTreeNode::GetRootNode()
{
    CQoTreeNode* pNode = this;
    while (pNode->m_pParent != NULL) pNode = pNode->m_pParent;
    return pNode;
}

CQoTreeCtrl* CQoTreeNode::GetTreeCtrl() { return GetRootNode()->m_pTreeCtrl; }
void CQoTreeNode::SetTreeCtrl(CQoTreeCtrl* pCtrl) { GetRootNode()->m_pTreeCtrl = pCtrl; }

CQoTreeNode* CQoTreeNode::GetChild(int nIndex) const
{
    return nIndex >= 0 && nIndex < NumChildren() ? m_children[nIndex] : NULL;
}

int CQoTreeNode::FindChild(CQoTreeNode* pNode) const
{
    if (pNode == NULL) return -1;
    for (int i = 0; i < NumChildren(); ++i)
        if (m_children[i] == pNode) return i;
    return -1;
}

bool CQoTreeNode::IsFirstChild(CQoTreeNode* pNode) const
{
    return NumChildren() > 0 && m_children[0] == pNode;
}

bool CQoTreeNode::IsLastChild(CQoTreeNode* pNode) const
{
    return NumChildren() > 0 && m_children[NumChildren() - 1] == pNode;
}

void CQoTreeNode::AddChild(CQoTreeNode* pNode)
{
    if (pNode == NULL || FindChild(pNode) >= 0) return;
    // A node listed twice would be freed twice; an ancestor below itself never ends.
    for (CQoTreeNode* p = this; p != NULL; p = p->m_pParent)
        if (p == pNode) return;
    pNode->ClearTreeItems();
    pNode->m_pParent = this;
    m_children.Add(pNode);
    TellCtrlModified();
}

void CQoTreeNode::InsertChild(int nIndex, CQoTreeNode* pNode)
{
    // A node listed twice would be freed twice.
    if (pNode == NULL || nIndex < 0 || nIndex > NumChildren() || FindChild(pNode) >= 0) return;
    m_children.InsertAt(nIndex, pNode);
    TellCtrlModified();
}

void CQoTreeNode::RemoveChild(CQoTreeNode* pNode, bool bDelete)
{
    const int nIndex = FindChild(pNode);
    if (nIndex < 0) return;
    m_children.RemoveAt(nIndex);
    pNode->ClearTreeItems();
    if (bDelete) pNode->Delete();
    TellCtrlModified();
}

void CQoTreeNode::ShiftUp(CQoTreeNode* pNode, bool bSelect)
{
    const int nIndex = FindChild(pNode);
    if (nIndex <= 0) return;
    RemoveChild(pNode, false);
    InsertChild(nIndex - 1, pNode);
    CQoTreeCtrl* pCtrl = GetTreeCtrl();
    if (bSelect && pCtrl != NULL) pCtrl->SelectNode(pNode);
}

void CQoTreeNode::ShiftDown(CQoTreeNode* pNode, bool bSelect)
{
    const int nIndex = FindChild(pNode);
    if (nIndex < 0 || nIndex >= NumChildren() - 1) return;
    RemoveChild(pNode, false);
    InsertChild(nIndex + 1, pNode);
    CQoTreeCtrl* pCtrl = GetTreeCtrl();
    if (bSelect && pCtrl != NULL) pCtrl->SelectNode(pNode);
}

void CQoTreeNode::ReorderChildren(CQoArray<CQoTreeNode*, CQoTreeNode*>& nodes)
{
    while (NumChildren() > 0) RemoveChild(m_children[NumChildren() - 1], false);
    for (int i = 0; i < nodes.GetSize(); ++i) AddChild(nodes[i]);
}

void CQoTreeNode::Delete()
{
    for (int i = 0; i < NumChildren(); ++i) m_children[i]->Delete();
    m_children.RemoveAll();
    delete this;
}

void CQoTreeNode::TellCtrlModified()
{
    CQoTreeCtrl* pCtrl = GetTreeCtrl();
    if (pCtrl != NULL) pCtrl->NodeModified(this);
}

void CQoTreeNode::ClearTreeItems()
{
    m_hTreeItem = NULL;
    for (int i = 0; i < NumChildren(); ++i) m_children[i]->ClearTreeItems();
}

bool CQoTreeNode::NotifyDescendants(int nCode)
{
    if (OnTreeNotification(nCode)) return true;
    for (int i = 0; i < NumChildren(); ++i)
        if (m_children[i]->NotifyDescendants(nCode)) return true;
    return false;
}

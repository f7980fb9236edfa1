#include "CQoTreeCtrl.h"

#include <vector>

IMPLEMENT_DYNAMIC(CQoTreeCtrl, CTreeCtrl)

BEGIN_MESSAGE_MAP(CQoTreeCtrl, CTreeCtrl)
    ON_NOTIFY_REFLECT(TVN_ITEMEXPANDING, OnItemexpanding)
    ON_NOTIFY_REFLECT(TVN_ITEMEXPANDED, OnItemexpanded)
    ON_NOTIFY_REFLECT(NM_RCLICK, OnRclick)
    ON_NOTIFY_REFLECT(TVN_SELCHANGED, OnSelchanged)
    ON_NOTIFY_REFLECT(TVN_SELCHANGING, OnSelchanging)
    ON_WM_RBUTTONDOWN()
END_MESSAGE_MAP()

namespace {
// Item texts go through a buffer of this size.
const int kTextBuffer = 512;
}  // namespace

CQoTreeCtrl::CQoTreeCtrl() : m_ptRButton(0, 0) {}
CQoTreeCtrl::~CQoTreeCtrl() {}

CString CQoTreeCtrl::ItemText(const CQoTreeNode* pNode)
{
    const CString& text = pNode->GetTreeNodeText();
    return text.GetLength() < kTextBuffer ? text : text.Left(kTextBuffer - 1);
}

CQoTreeNode* CQoTreeCtrl::NodeOf(HTREEITEM hItem) const
{
    if (hItem == NULL || GetSafeHwnd() == NULL) return NULL;
    CQoTreeNode* pNode = reinterpret_cast<CQoTreeNode*>(GetItemData(hItem));
    return pNode != NULL && pNode->GetTreeItem() == hItem ? pNode : NULL;
}

void CQoTreeCtrl::DetachItems(HTREEITEM hItem)
{
    for (HTREEITEM h = GetChildItem(hItem); h != NULL; h = GetNextSiblingItem(h)) DetachItems(h);
    SetItemData(hItem, 0);
}

void CQoTreeCtrl::SetTree(CQoTreeNode* pRoot)
{
    if (pRoot == NULL || GetSafeHwnd() == NULL) return;
    for (HTREEITEM h = GetRootItem(); h != NULL; h = GetNextSiblingItem(h)) DetachItems(h);
    DeleteAllItems();
    InsertTree(TVI_ROOT, TVI_LAST, pRoot);
    pRoot->SetTreeCtrl(this);
    Refresh(pRoot->GetTreeItem());
    SelectRoot();
}

HTREEITEM CQoTreeCtrl::InsertTree(HTREEITEM hParent, HTREEITEM hInsertAfter, CQoTreeNode* pNode)
{
    const CString text = ItemText(pNode);
    TVINSERTSTRUCT tvis;
    memset(&tvis, 0, sizeof(tvis));
    tvis.hParent = hParent;
    tvis.hInsertAfter = hInsertAfter;
    tvis.item.mask = TVIF_TEXT | TVIF_IMAGE | TVIF_PARAM | TVIF_SELECTEDIMAGE | TVIF_CHILDREN;
    tvis.item.pszText = const_cast<char*>(static_cast<const char*>(text));
    tvis.item.iImage = pNode->GetTreeNodeImageId();
    tvis.item.iSelectedImage = pNode->GetTreeNodeImageId();
    tvis.item.lParam = reinterpret_cast<LPARAM>(pNode);
    tvis.item.cChildren = pNode->NumChildren();
    HTREEITEM hItem = InsertItem(&tvis);
    pNode->SetTreeItem(hItem);
    if (hItem == NULL) return NULL;
    for (int i = 0; i < pNode->NumChildren(); ++i) InsertTree(hItem, TVI_LAST, pNode->GetChild(i));
    return hItem;
}

void CQoTreeCtrl::Refresh(HTREEITEM hItem)
{
    if (GetSafeHwnd() == NULL) return;
    if (hItem == NULL) hItem = GetRootItem();
    CQoTreeNode* pNode = NodeOf(hItem);
    if (pNode == NULL) return;
    if (!pNode->GetCanCollapse()) Expand(hItem, TVE_EXPAND);
    for (HTREEITEM h = GetChildItem(hItem); h != NULL; h = GetNextSiblingItem(h)) Refresh(h);
}

void CQoTreeCtrl::NodeModified(CQoTreeNode* pNode)
{
    if (pNode == NULL || GetSafeHwnd() == NULL) return;
    HTREEITEM hItem = pNode->GetTreeItem();
    if (hItem == NULL || NodeOf(hItem) != pNode) return;

    std::vector<HTREEITEM> shown;
    for (HTREEITEM h = GetChildItem(hItem); h != NULL; h = GetNextSiblingItem(h)) shown.push_back(h);
    const size_t nChildren = static_cast<size_t>(pNode->NumChildren());

    if (shown.size() > nChildren) {
        // One child has gone: the first shown item that is not its child's item.
        HTREEITEM hGone = shown.back();
        for (size_t i = 0; i < nChildren; ++i) {
            if (shown[i] != pNode->GetChild(static_cast<int>(i))->GetTreeItem()) {
                hGone = shown[i];
                break;
            }
        }
        // Its nodes may be freed already: no notification of the deletion may reach them.
        DetachItems(hGone);
        DeleteItem(hGone);
    } else if (shown.size() < nChildren) {
        HTREEITEM hAfter = TVI_FIRST;
        for (size_t i = 0; i < nChildren; ++i) {
            CQoTreeNode* pChild = pNode->GetChild(static_cast<int>(i));
            if (pChild->GetTreeItem() == NULL) InsertTree(hItem, hAfter, pChild);
            hAfter = pChild->GetTreeItem() != NULL ? pChild->GetTreeItem() : hAfter;
        }
    }

    const CString text = ItemText(pNode);
    TVITEM item;
    memset(&item, 0, sizeof(item));
    item.hItem = hItem;
    item.mask = TVIF_TEXT | TVIF_IMAGE | TVIF_SELECTEDIMAGE | TVIF_CHILDREN;
    item.pszText = const_cast<char*>(static_cast<const char*>(text));
    item.iImage = pNode->GetTreeNodeImageId();
    item.iSelectedImage = pNode->GetTreeNodeImageId();
    item.cChildren = pNode->NumChildren();
    SetItem(&item);
    Refresh(hItem);
}

void CQoTreeCtrl::SelectRoot()
{
    if (GetSafeHwnd() != NULL) SelectItem(GetRootItem());
}

void CQoTreeCtrl::SelectNode(CQoTreeNode* pNode)
{
    if (pNode != NULL && NodeOf(pNode->GetTreeItem()) == pNode) SelectItem(pNode->GetTreeItem());
}

void CQoTreeCtrl::ExpandAll(HTREEITEM hItem)
{
    if (GetSafeHwnd() == NULL) return;
    if (hItem == NULL) hItem = GetRootItem();
    if (hItem == NULL) return;
    for (HTREEITEM h = GetChildItem(hItem); h != NULL; h = GetNextSiblingItem(h)) ExpandAll(h);
    Expand(hItem, TVE_EXPAND);
}

void CQoTreeCtrl::CollapseAll(HTREEITEM hItem)
{
    if (GetSafeHwnd() == NULL) return;
    if (hItem == NULL) hItem = GetRootItem();
    CQoTreeNode* pNode = NodeOf(hItem);
    if (pNode == NULL) return;
    for (int i = 0; i < pNode->NumChildren(); ++i) {
        HTREEITEM hChild = pNode->GetChild(i)->GetTreeItem();
        if (hChild != NULL) CollapseAll(hChild);
    }
    if (pNode->GetCanCollapse())
        Expand(hItem, TVE_COLLAPSE);
    else
        EnsureVisible(hItem);
}

void CQoTreeCtrl::OnItemexpanding(NMHDR* pNMHDR, LRESULT* pResult)
{
    HTREEITEM hItem = reinterpret_cast<NMTREEVIEW*>(pNMHDR)->itemNew.hItem;
    CQoTreeNode* pNode = NodeOf(hItem);
    if (pNode == NULL) {
        *pResult = -1;
        return;
    }
    if (GetItemState(hItem, TVIS_EXPANDED) & TVIS_EXPANDED) {
        *pResult = pNode->GetCanCollapse() ? FALSE : TRUE;
        return;
    }
    pNode->ItemExpanding();
    *pResult = 0;
}

void CQoTreeCtrl::OnItemexpanded(NMHDR* pNMHDR, LRESULT* pResult)
{
    // Some tree views (Wine's) collapse by the user's hand although TVN_ITEMEXPANDING
    // refused it: a node that cannot collapse is opened again at once.
    NMTREEVIEW* pTV = reinterpret_cast<NMTREEVIEW*>(pNMHDR);
    CQoTreeNode* pNode = NodeOf(pTV->itemNew.hItem);
    if (pNode != NULL && (pTV->action & TVE_COLLAPSE) != 0 && !pNode->GetCanCollapse() &&
        (GetItemState(pTV->itemNew.hItem, TVIS_EXPANDED) & TVIS_EXPANDED) == 0)
        Expand(pTV->itemNew.hItem, TVE_EXPAND);
    *pResult = 0;
}

void CQoTreeCtrl::OnRButtonDown(UINT nFlags, CPoint point)
{
    m_ptRButton = point;
    CTreeCtrl::OnRButtonDown(nFlags, point);
}

void CQoTreeCtrl::OnRclick(NMHDR*, LRESULT* pResult)
{
    HTREEITEM hItem = HitTest(m_ptRButton);
    if (hItem != NULL) SelectItem(hItem);
    *pResult = 0;
}

void CQoTreeCtrl::OnSelchanging(NMHDR*, LRESULT* pResult)
{
    CQoTreeNode* pNode = NodeOf(GetSelectedItem());
    *pResult = pNode != NULL && pNode->OnSelectionChanging() ? 1 : 0;
}

void CQoTreeCtrl::OnSelchanged(NMHDR* pNMHDR, LRESULT* pResult)
{
    HTREEITEM hItem = reinterpret_cast<NMTREEVIEW*>(pNMHDR)->itemNew.hItem;
    try {
        CQoTreeNode* pNode = NodeOf(hItem);
        if (pNode != NULL) pNode->OnSelectionChanged();
        if (hItem != NULL) EnsureVisible(hItem);
    } catch (...) {
        // A node that fails here no longer answers for its item.
        if (hItem != NULL && GetSafeHwnd() != NULL) SetItemData(hItem, 0);
    }
    *pResult = 0;
}

// CQoTreeCtrl - a tree view that shows a tree of CQoTreeNode objects and keeps
// itself in step with it.
//
// Each item's data is the node it shows; an item is trusted only while its node
// names that very item as its own. A change of a node (see CQoTreeNode) reaches
// NodeModified, which inserts or deletes the one item concerned and updates the
// node's own item: the other items keep their handles, their selection and
// their expansion. Selection and expansion go back to the nodes, which may
// refuse them: a node whose OnSelectionChanging answers true keeps the
// selection where it is, a node that cannot collapse stays open. A right click
// selects the item under the mouse before any context menu of the application.
//
//     DDX_Control(pDX, IDC_TREE, m_tree);   // or Create(...)
//     m_tree.SetTree(pRoot);                // the application keeps owning pRoot
#pragma once

#include <afxcmn.h>

#include "CQoTreeNode.h"
#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoTreeCtrl : public CTreeCtrl
{
    DECLARE_DYNAMIC(CQoTreeCtrl)

public:
    CQoTreeCtrl();
    virtual ~CQoTreeCtrl();

    // Shows the tree of pRoot instead of whatever the control showed, opens what
    // may not be collapsed, and selects the root.
    void SetTree(CQoTreeNode* pRoot);
    // Opens, from hItem (NULL: the root item) down, every item whose node cannot collapse.
    void Refresh(HTREEITEM hItem);
    // Brings the control in line with one change of pNode.
    void NodeModified(CQoTreeNode* pNode);
    void SelectRoot();
    void SelectNode(CQoTreeNode* pNode);
    // Opens or closes the subtree of hItem (NULL: the root item); nodes that
    // cannot collapse stay open.
    void ExpandAll(HTREEITEM hItem);
    void CollapseAll(HTREEITEM hItem);

    // The node an item shows, NULL if the item's data does not name a node that owns it.
    CQoTreeNode* NodeOf(HTREEITEM hItem) const;

protected:
    // Inserts pNode's item with its whole subtree; the node's item.
    HTREEITEM InsertTree(HTREEITEM hParent, HTREEITEM hInsertAfter, CQoTreeNode* pNode);

    afx_msg void OnItemexpanding(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnItemexpanded(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnRclick(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnSelchanged(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnSelchanging(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnRButtonDown(UINT nFlags, CPoint point);
    DECLARE_MESSAGE_MAP()

private:
    // Item data of hItem and of everything below it set to 0, so that no
    // notification raised while the items go away reaches a node.
    void DetachItems(HTREEITEM hItem);
    // The control's text of a node: at most 511 characters.
    static CString ItemText(const CQoTreeNode* pNode);

    CPoint m_ptRButton;
};

// CQoTreeNode - a node of a tree of the application's own objects, shown by a
// CQoTreeCtrl that keeps itself in step with it.
//
// A parent owns its children; Delete frees a whole subtree. Every change made
// through a node's operations (text, image, collapsibility, adding, inserting,
// removing or moving children) tells the root's control, which updates only the
// items concerned. Selection and expansion in the control come back as virtual
// calls that an application's node classes override; SelectionChanged and
// SelectionChanging bubble up to the root, so one override there sees them all.
//
//     CQoTreeNode* root = new CQoTreeNode("Projekt", 0, false);  // never collapses
//     root->AddChild(new CMyNode("Eingabe", 1, true));
//     m_tree.SetTree(root);                                      // shows it, selects the root
//     root->GetChild(0)->SetTreeNodeText("Eingabe (3)");         // one item updated
//     ...
//     root->Delete();                                            // frees the whole tree
#pragma once

#include <afxcmn.h>
#include <afxtempl.h>

#include "CQoArray.h"
#include "QoMfcExtApi.h"

class CQoTreeCtrl;

class QOMFCEXT_API CQoTreeNode
{
    friend class CQoTreeCtrl;

public:
    CQoTreeNode(const char* lpszText = "", int nImageId = -1, bool bCanCollapse = true);
    CQoTreeNode(const CQoTreeNode&) = delete;
    CQoTreeNode& operator=(const CQoTreeNode&) = delete;

    // --- Virtual functions an application's nodes override -----------------
    virtual ~CQoTreeNode();
    // A node of the subtree became selected; passed on to the parent.
    virtual void SelectionChanged(CQoTreeNode* pNode);
    // A node of the subtree is about to lose the selection: true keeps it there.
    virtual bool SelectionChanging(CQoTreeNode* pNode);
    virtual void OnSelectionChanged();
    virtual bool OnSelectionChanging();
    // The node's item is about to open.
    virtual void ItemExpanding();
    // Asked by NotifyDescendants; true stops the walk.
    virtual bool OnTreeNotification(int nCode);

    // --- What the item shows ------------------------------------------------
    const CString& GetTreeNodeText() const { return m_strText; }
    void SetTreeNodeText(const CString& strText);
    int GetTreeNodeImageId() const { return m_nImageId; }
    void SetTreeNodeImageId(int nImageId);
    // False if this node or any node below it may not be collapsed.
    bool GetCanCollapse() const;
    void SetCanCollapse(bool bCanCollapse);

    // --- Place in the tree and in the control ---------------------------------
    CQoTreeNode* GetParentNode() const { return m_pParent; }
    CQoTreeNode* GetRootNode();
    CQoTreeCtrl* GetTreeCtrl();
    void SetTreeCtrl(CQoTreeCtrl* pCtrl);
    HTREEITEM GetTreeItem() const { return m_hTreeItem; }
    void SetTreeItem(HTREEITEM hItem) { m_hTreeItem = hItem; }

    // --- Children, in display order -----------------------------------------
    int NumChildren() const { return static_cast<int>(m_children.GetSize()); }
    CQoTreeNode* GetChild(int nIndex) const;
    int FindChild(CQoTreeNode* pNode) const;
    bool IsFirstChild(CQoTreeNode* pNode) const;
    bool IsLastChild(CQoTreeNode* pNode) const;
    // Appends a node (with its subtree) and makes this node its parent. A node
    // that is already a child here, or this node's own ancestor, is ignored.
    void AddChild(CQoTreeNode* pNode);
    // Puts a child of this node back at an index (0 .. NumChildren()); it keeps
    // its parent and items as they are; one that is still a child is ignored.
    // New children come with AddChild.
    void InsertChild(int nIndex, CQoTreeNode* pNode);
    // Takes a child out (its parent field stays) and frees it if bDelete.
    void RemoveChild(CQoTreeNode* pNode, bool bDelete);
    // Moves a child one place up or down, and selects it in the control if bSelect.
    void ShiftUp(CQoTreeNode* pNode, bool bSelect);
    void ShiftDown(CQoTreeNode* pNode, bool bSelect);
    // The given nodes become the children in that order.
    void ReorderChildren(CQoArray<CQoTreeNode*, CQoTreeNode*>& nodes);
    // Frees the children and then the node itself.
    void Delete();
    // Tells the control that this node has changed.
    void TellCtrlModified();

protected:
    void ClearTreeItems();
    // OnTreeNotification of this node and then of each child's subtree, depth
    // first, until one answers true.
    bool NotifyDescendants(int nCode);

private:
    CQoTreeCtrl* m_pTreeCtrl;
    CQoTreeNode* m_pParent;
    HTREEITEM m_hTreeItem;
    CArray<CQoTreeNode*, CQoTreeNode*> m_children;
    CString m_strText;
    int m_nImageId;
    bool m_bCanCollapse;
};

// CDirectoryTreeCtrl - the machine's drives and folders as a tree.
//
// The tree lists the drives when it is initialised and reads a folder's
// subfolders only when the folder is first opened, so a large disk costs
// nothing until the user goes into it. Given a start path it opens itself
// along that path and selects the folder it names; a path that cannot be
// followed leaves the folders found so far read in and nothing selected. Names
// written in capitals only are shown in title case. A derived class hides
// drives and folders by overriding CanDisplay.
//
//     DDX_Control(pDX, IDC_DIRECTORY_TREE, m_tree);
//     m_tree.InitDirectoryTreeCtrl("C:\\Daten\\Export");
//     ...
//     CString path = m_tree.GetSelectedPath();      // "C:\Daten\Export\", always with a backslash
#pragma once

#include <afxcmn.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CDirectoryTreeCtrl : public CTreeCtrl
{
    DECLARE_DYNAMIC(CDirectoryTreeCtrl)

public:
    // Image indexes of the tree's image list.
    enum { imgRemovable = 0, imgFixed = 1, imgCdRom = 2, imgRemote = 3, imgFolder = 4 };

    CDirectoryTreeCtrl();
    virtual ~CDirectoryTreeCtrl();

    // Lists the drives anew and opens the tree along lpszStartPath (may be empty).
    void InitDirectoryTreeCtrl(const char* lpszStartPath);
    // The selected item's path with a trailing backslash; a lone backslash without selection.
    CString GetSelectedPath();
    // Whether a drive ("C:") or folder ("C:\Daten") may be shown and entered.
    virtual BOOL CanDisplay(const char* lpszPath);

protected:
    CString GetPath(HTREEITEM hItem);
    // Reads the subfolders of the item's folder into the tree.
    void ItemExpanding(HTREEITEM hItem);
    // A name in capitals only made title case, in place; other names unchanged.
    static char* CapitalizeFirst(char* lpszText);

    afx_msg void OnItemexpanding(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnBeginlabeledit(NMHDR* pNMHDR, LRESULT* pResult);
    DECLARE_MESSAGE_MAP()

private:
    // Reads the item's folders and marks it as read, without opening it on the screen.
    void OpenOnce(HTREEITEM hItem);
    // An item that shows an expand button before its folders are read.
    HTREEITEM InsertWithButton(HTREEITEM hParent, const char* lpszText, int nImage);

    CImageList* m_pImageList;
};

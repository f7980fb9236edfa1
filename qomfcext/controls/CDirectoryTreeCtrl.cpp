#include "CDirectoryTreeCtrl.h"

#include <ctype.h>
#include <io.h>
#include <string.h>

#include <string>
#include <vector>

#include "CPatternMatcher.h"
#include "CQoString.h"
#include "CQoStringTokenizer.h"
#include "resource.h"

IMPLEMENT_DYNAMIC(CDirectoryTreeCtrl, CTreeCtrl)

BEGIN_MESSAGE_MAP(CDirectoryTreeCtrl, CTreeCtrl)
    ON_NOTIFY_REFLECT(TVN_ITEMEXPANDING, OnItemexpanding)
    ON_NOTIFY_REFLECT(TVN_BEGINLABELEDIT, OnBeginlabeledit)
END_MESSAGE_MAP()

namespace {

// Room for the drive strings ("C:\", "D:\", ... each with its terminating zero).
const DWORD kDriveBuffer = 500;
// Room for a volume name.
const DWORD kVolumeBuffer = 100;

HICON LoadSmallIcon(UINT nId)
{
    HINSTANCE hInst = AfxFindResourceHandle(MAKEINTRESOURCE(nId), RT_GROUP_ICON);
    return static_cast<HICON>(::LoadImageA(hInst, MAKEINTRESOURCE(nId), IMAGE_ICON, 16, 16, 0));
}

}  // namespace

HTREEITEM CDirectoryTreeCtrl::InsertWithButton(HTREEITEM hParent, const char* lpszText, int nImage)
{
    TVINSERTSTRUCT tvis;
    memset(&tvis, 0, sizeof(tvis));
    tvis.hParent = hParent;
    tvis.hInsertAfter = TVI_SORT;
    tvis.item.mask = TVIF_TEXT | TVIF_IMAGE | TVIF_SELECTEDIMAGE | TVIF_CHILDREN;
    tvis.item.pszText = const_cast<char*>(lpszText);
    tvis.item.iImage = nImage;
    tvis.item.iSelectedImage = nImage;
    tvis.item.cChildren = 1;  // a button until the folder has been read
    return InsertItem(&tvis);
}

CDirectoryTreeCtrl::CDirectoryTreeCtrl() : m_pImageList(new CImageList)
{
    m_pImageList->Create(16, 16, 0, 6, 2);
    const UINT icons[] = {IDI_DRIVE_REMOVABLE, IDI_DRIVE_FIXED, IDI_DRIVE_CDROM, IDI_DRIVE_REMOTE, IDI_FOLDER};
    for (UINT nId : icons) {
        HICON hIcon = LoadSmallIcon(nId);
        m_pImageList->Add(hIcon);  // the list copies the picture
        if (hIcon != NULL) ::DestroyIcon(hIcon);
    }
}

CDirectoryTreeCtrl::~CDirectoryTreeCtrl() { delete m_pImageList; }

BOOL CDirectoryTreeCtrl::CanDisplay(const char*) { return TRUE; }

char* CDirectoryTreeCtrl::CapitalizeFirst(char* lpszText)
{
    if (lpszText == NULL || strpbrk(lpszText, "abcdefghijklmnopqrstuvwxyz\xE4\xF6\xFC\xDF") != NULL) return lpszText;
    bool bStart = true;
    for (char* p = lpszText; *p != '\0'; ++p) {
        const int ch = static_cast<unsigned char>(*p);
        if (isalpha(ch)) *p = static_cast<char>(bStart ? toupper(ch) : tolower(ch));
        bStart = isspace(ch) != 0;
    }
    return lpszText;
}

CString CDirectoryTreeCtrl::GetPath(HTREEITEM hItem)
{
    if (hItem == NULL) return "\\";
    HTREEITEM hParent = GetParentItem(hItem);
    if (hParent != NULL) return GetPath(hParent) + GetItemText(hItem) + "\\";
    return GetItemText(hItem).Left(2) + "\\";
}

CString CDirectoryTreeCtrl::GetSelectedPath() { return GetPath(GetSafeHwnd() != NULL ? GetSelectedItem() : NULL); }

void CDirectoryTreeCtrl::ItemExpanding(HTREEITEM hItem)
{
    const CString strPath = GetPath(hItem);
    bool bAny = false;
    _finddata_t entry;
    const intptr_t hFind = _findfirst(strPath + "*.*", &entry);
    if (hFind != -1) {
        do {
            if ((entry.attrib & _A_SYSTEM) != 0 || (entry.attrib & _A_SUBDIR) == 0) continue;
            if (strcmp(entry.name, ".") == 0 || strcmp(entry.name, "..") == 0) continue;
            if (!CanDisplay(strPath + entry.name)) continue;
            InsertWithButton(hItem, CapitalizeFirst(entry.name), imgFolder);
            bAny = true;
        } while (_findnext(hFind, &entry) == 0);
        _findclose(hFind);
    }
    if (!bAny) {
        TVITEM item;
        memset(&item, 0, sizeof(item));
        item.hItem = hItem;
        item.mask = TVIF_CHILDREN;
        item.cChildren = 0;
        SetItem(&item);
    }
}

void CDirectoryTreeCtrl::OpenOnce(HTREEITEM hItem)
{
    ItemExpanding(hItem);
    SetItemState(hItem, TVIS_EXPANDEDONCE, 0xFF);
}

void CDirectoryTreeCtrl::InitDirectoryTreeCtrl(const char* lpszStartPath)
{
    std::vector<CQoString> parts;
    if (lpszStartPath != NULL && *lpszStartPath != '\0') parts = CQoStringTokenizer::Split(lpszStartPath, "\\");
    const bool bFollow = !parts.empty() && CPatternMatcher::Match("?:", parts[0].GetString());

    SetImageList(m_pImageList, TVSIL_NORMAL);
    DeleteAllItems();

    char drives[kDriveBuffer + 1];
    memset(drives, 0, sizeof(drives));
    const DWORD nNeeded = ::GetLogicalDriveStringsA(kDriveBuffer, drives);
    if (nNeeded == 0 || nNeeded > kDriveBuffer) return;

    HTREEITEM hDefault = NULL;
    HTREEITEM hStart = NULL;
    bool bStartHidden = false;   // the start path's drive is one the derived class refuses
    for (const char* pRoot = drives; *pRoot != '\0'; pRoot += strlen(pRoot) + 1) {
        const UINT nType = ::GetDriveTypeA(pRoot);
        if (nType == DRIVE_UNKNOWN) continue;
        char letter[3] = {static_cast<char>(toupper(static_cast<unsigned char>(pRoot[0]))), ':', '\0'};
        // A derived class hides a drive as it hides a folder; a start path on
        // such a drive cannot be followed, and then nothing is selected.
        if (!CanDisplay(letter)) {
            if (bFollow && _strnicmp(letter, parts[0].GetString(), 2) == 0) bStartHidden = true;
            continue;
        }

        char volume[kVolumeBuffer + 1] = "";
        if (nType != DRIVE_REMOVABLE && nType != DRIVE_REMOTE) {
            // A drive that is not ready must not raise the system's error box; the
            // application's own error mode is put back afterwards.
            const UINT nOldMode = ::SetErrorMode(SEM_FAILCRITICALERRORS);
            if (!::GetVolumeInformationA(pRoot, volume, kVolumeBuffer, NULL, NULL, NULL, NULL, 0)) volume[0] = '\0';
            ::SetErrorMode(nOldMode);
            volume[kVolumeBuffer] = '\0';
        }
        int nImage = imgRemovable;
        if (nType == DRIVE_FIXED)
            nImage = imgFixed;
        else if (nType == DRIVE_REMOTE)
            nImage = imgRemote;
        else if (nType == DRIVE_CDROM)
            nImage = imgCdRom;

        CString text = letter;
        if (volume[0] != '\0') text += CString(" ") + CapitalizeFirst(volume);
        HTREEITEM hItem = InsertWithButton(TVI_ROOT, text, nImage);
        if (hItem == NULL) continue;
        if (hDefault == NULL && nImage == imgFixed) hDefault = hItem;
        // Drive letters name the same drive in either case.
        if (bFollow && hStart == NULL && _strnicmp(text, parts[0].GetString(), 2) == 0) hStart = hItem;
    }

    if (hStart == NULL) {
        if (hDefault != NULL && !bStartHidden) SelectItem(hDefault);
        return;
    }

    OpenOnce(hStart);
    CString strPath = parts[0].GetString();
    HTREEITEM hCurrent = CanDisplay(strPath) ? hStart : NULL;
    for (size_t i = 1; i < parts.size() && hCurrent != NULL; ++i) {
        strPath += CString("\\") + parts[i].GetString();
        if (!CanDisplay(strPath) || !ItemHasChildren(hCurrent)) {
            hCurrent = NULL;
            break;
        }
        HTREEITEM hFound = NULL;
        for (HTREEITEM h = GetChildItem(hCurrent); h != NULL && hFound == NULL; h = GetNextSiblingItem(h))
            if (GetItemText(h).CollateNoCase(parts[i].GetString()) == 0) hFound = h;
        hCurrent = hFound;
        if (hCurrent != NULL) OpenOnce(hCurrent);
    }
    if (hCurrent != NULL) {
        SelectItem(hCurrent);
        EnsureVisible(hCurrent);
    }
}

void CDirectoryTreeCtrl::OnItemexpanding(NMHDR* pNMHDR, LRESULT* pResult)
{
    HTREEITEM hItem = reinterpret_cast<NMTREEVIEW*>(pNMHDR)->itemNew.hItem;
    const UINT nState = GetItemState(hItem, TVIS_EXPANDEDONCE | TVIS_EXPANDED);
    if (nState & TVIS_EXPANDEDONCE) {
        *pResult = 0;
    } else if ((nState & TVIS_EXPANDED) == 0) {
        // Folders already read in (the control did not keep the mark) are not listed twice.
        if (GetChildItem(hItem) == NULL) ItemExpanding(hItem);
        *pResult = 0;
    } else {
        *pResult = 1;
    }
}

void CDirectoryTreeCtrl::OnBeginlabeledit(NMHDR*, LRESULT* pResult)
{
    *pResult = 1;  // folders are not renamed here
}

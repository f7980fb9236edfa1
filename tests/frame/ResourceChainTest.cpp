// The library joins the host's resource chain when it is loaded: the host
// program finds the library's strings and dialogs although it holds none.
#include <afxwin.h>

#include <resource.h>

#include <gtest/gtest.h>

namespace {

HMODULE Library()
{
    return GetModuleHandleA("qomfcext.dll");
}

bool HostHoldsString(UINT id)
{
    return FindResourceA(GetModuleHandleA(NULL), MAKEINTRESOURCEA(id / 16 + 1), (LPCSTR)RT_STRING) != NULL;
}

CString Load(UINT id)
{
    CString text;
    text.LoadString(id);
    return text;
}

}  // namespace

TEST(ResourceChain, HostFindsEveryLibraryStringWithItsExactText)
{
    ASSERT_NE(nullptr, Library());
    EXPECT_FALSE(HostHoldsString(IDS_ERROR_OCCURRED));
    // Escapes and Windows-1252 letters come through as written.
    EXPECT_STREQ("Es ist der Fehler %d aufgetreten.\n%s", Load(IDS_ERROR_OCCURRED));
    EXPECT_STREQ("Die eingegebene L\xE4nge (%d) liegt unter dem m\xF6glichen Maximalwert f\xFCr das gew\xE4hlte "
                 "Feld.(%d).\nSoll die Feldl\xE4nge auf diesen Wert korrigiert werden?",
                 Load(IDS_LENGTH_BELOW_MAX));
    for (UINT id = 1; id <= 43; ++id)
        EXPECT_FALSE(Load(id).IsEmpty()) << "string " << id;
    EXPECT_FALSE(Load(362).IsEmpty());
    // An id that nobody holds loads as an empty text.
    CString missing;
    EXPECT_FALSE(missing.LoadString(44));
    EXPECT_TRUE(missing.IsEmpty());
}

TEST(ResourceChain, DialogTemplateAndIconComeFromTheLibrary)
{
    EXPECT_EQ(NULL, FindResourceA(GetModuleHandleA(NULL), MAKEINTRESOURCEA(IDD_ERROR_DLG), (LPCSTR)RT_DIALOG));
    EXPECT_EQ((HINSTANCE)Library(), AfxFindResourceHandle(MAKEINTRESOURCE(IDD_ERROR_DLG), RT_DIALOG));
    EXPECT_NE(nullptr, FindResourceA(Library(), MAKEINTRESOURCEA(IDI_ERROR_ICON), (LPCSTR)RT_GROUP_ICON));
}

#include "CQoException.h"
#include "CQoInterActive.h"
#include "CQoString.h"

#include <gtest/gtest.h>

#include <exception>
#include <string>

namespace {

CQoException Caught(void (*thrower)())
{
    try {
        thrower();
    } catch (CQoException const &e) {
        return e;
    }
    ADD_FAILURE() << "nothing was thrown";
    return CQoException(-1, "", nullptr);
}

} // namespace

TEST(CQoException, CodedErrorsCarryTheGermanTableText)
{
    CQoException e = Caught([] { CQoException::Throw(CQoException::indexError, "Spalte 7"); });
    EXPECT_EQ(19, e.Code());
    EXPECT_STREQ("Index au\337erhalb des g\374ltigen Bereichs", e.Text());
    EXPECT_STREQ("Spalte 7", e.Where());
    EXPECT_STREQ("Index au\337erhalb des g\374ltigen Bereichs (Spalte 7)", e.Message());

    e = Caught([] { CQoException::Throw(CQoException::fileNotFound, "C:\\daten\\a.txt"); });
    EXPECT_EQ(1, e.Code());
    EXPECT_STREQ("Datei nicht gefunden (C:\\daten\\a.txt)", e.Message());

    // Without a place the message is the text alone.
    e = Caught([] { CQoException::Throw(CQoException::writeError, nullptr); });
    EXPECT_STREQ("Fehler beim Schreiben der Datei", e.Message());
    e = Caught([] { CQoException::Throw(CQoException::readError, ""); });
    EXPECT_STREQ("Fehler beim Lesen der Datei", e.Message());

    // Every code of the table has its own text.
    int const codes[] = {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 19};
    for (int a : codes) {
        for (int b : codes) {
            if (a != b) {
                EXPECT_STRNE(CQoException::CodeText(a), CQoException::CodeText(b));
            }
        }
    }

    e = Caught([] { CQoException::Throw(777, "x"); });
    EXPECT_EQ(777, e.Code());
    EXPECT_STREQ("Fehler 777 (x)", e.Message());
    EXPECT_EQ(nullptr, CQoException::CodeText(777));
}

TEST(CQoException, FreeTextsKeepTheirWording)
{
    CQoException e = Caught([] { CQoException::Throw("ODBC Datenbanken m\374ssen schon angelegt sein!", nullptr); });
    EXPECT_EQ(0, e.Code());
    EXPECT_STREQ("ODBC Datenbanken m\374ssen schon angelegt sein!", e.Message());

    e = Caught([] { CQoException::Throw(static_cast<char const *>(nullptr), "Tabelle"); });
    EXPECT_STREQ(" (Tabelle)", e.Message());

    // Thrown by value; also visible as a standard exception.
    try {
        CQoException::Throw("Text", "Ort");
    } catch (std::exception const &std) {
        EXPECT_STREQ("Text (Ort)", std.what());
    }
}

namespace {

int Corrector(CQoString &record)
{
    record += "!";
    return 1;
}

CQoString g_seenFile;
int Repairer(CQoString const &file, CQoString &data, int &pos)
{
    g_seenFile = file;
    data = data.Left(pos);
    pos = 3;
    return CQoInterActive::repairTakeOver;
}

} // namespace

TEST(CQoInterActive, HooksAreCalledOnlyWhenInstalled)
{
    CQoString record("abc");
    CQoInterActive::SetCorrectRepair(nullptr);
    EXPECT_EQ(0, CQoInterActive::CorrectRepair(record));
    EXPECT_STREQ("abc", record);
    CQoInterActive::SetCorrectRepair(&Corrector);
    EXPECT_EQ(1, CQoInterActive::CorrectRepair(record));
    EXPECT_STREQ("abc!", record);
    CQoInterActive::SetCorrectRepair(nullptr);

    CQoString data("bad;rest\nnext");
    int pos = 8;
    EXPECT_EQ(CQoInterActive::repairNoHandler, CQoInterActive::RepairRecord("in.txt", data, pos));
    EXPECT_EQ(8, pos);
    CQoInterActive::SetRepairRecord(&Repairer);
    EXPECT_EQ(CQoInterActive::repairTakeOver, CQoInterActive::RepairRecord("in.txt", data, pos));
    EXPECT_STREQ("in.txt", g_seenFile);
    EXPECT_STREQ("bad;rest", data);
    EXPECT_EQ(3, pos);
    CQoInterActive::SetRepairRecord(nullptr);
}

// Taken before any test runs.
bool const g_quietAtStart = CQoInterActive::IsQuiet();

TEST(CQoInterActive, QuietModeIsASwitchThatStartsOff)
{
    EXPECT_FALSE(g_quietAtStart);
    bool const before = CQoInterActive::IsQuiet();
    CQoInterActive::SetQuiet(true);
    EXPECT_TRUE(CQoInterActive::IsQuiet());
    CQoInterActive::SetQuiet(false);
    EXPECT_FALSE(CQoInterActive::IsQuiet());
    CQoInterActive::SetQuiet(before);
}

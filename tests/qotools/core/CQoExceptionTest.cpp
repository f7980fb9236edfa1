#include "CQoException.h"

#include <gtest/gtest.h>

#include <exception>
#include <string>

TEST(CQoException, MessagesJoinTheGermanTextAndThePlace)
{
    struct Case {
        bool freeText;    // Throw(text, where) instead of Throw(code, where)
        int code;         // the code raised, and the code it carries
        char const *text; // free text
        char const *where;
        char const *message;
    };
    Case const cases[] = {
        {false, 19, nullptr, "Spalte 7", "Index au\337erhalb des g\374ltigen Bereichs (Spalte 7)"},
        // Without a place the message is the text alone.
        {false, CQoException::readError, nullptr, "", "Fehler beim Lesen der Datei"},
        {false, 777, nullptr, "x", "Fehler 777 (x)"},
        // Free texts keep their wording.
        {true, 0, "ODBC Datenbanken m\374ssen schon angelegt sein!", nullptr,
         "ODBC Datenbanken m\374ssen schon angelegt sein!"},
        {true, 0, nullptr, "Tabelle", " (Tabelle)"},
    };
    for (Case const &c : cases) {
        SCOPED_TRACE(c.message);
        try {
            if (c.freeText)
                CQoException::Throw(c.text, c.where);
            else
                CQoException::Throw(c.code, c.where);
            ADD_FAILURE() << "nothing was thrown";
        } catch (CQoException const &e) {
            EXPECT_EQ(c.code, e.Code());
            EXPECT_STREQ(c.message, e.Message());
            // Also visible as a standard exception.
            EXPECT_STREQ(c.message, static_cast<std::exception const &>(e).what());
        }
    }
}

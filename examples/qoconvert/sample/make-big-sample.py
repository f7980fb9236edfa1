#!/usr/bin/python3
"""Writes the large sample project of qoconvert into FOLDER:

    kunden-gross.txt  ROWS customer records (default 120000) plus a line of
                      names, 10 fields separated by ';', Windows-1252 with
                      umlauts, CR LF; company names that hold a ';' are in
                      double quotes
    qoconvert.ini     the project: the file through the delimited input into
                      a delimited output kunden-gross-dos.txt in code page 850

Unless --clean is given, four records are defective, as a user's file may be:
record 5000 and 50000 have an eleventh field, record 60000 opens a double
quote that it never closes (the filter finds the next quote some lines later
and sees too many fields), and the last record ends inside an open quote.
The file is the same for the same arguments.

    make-big-sample.py FOLDER [ROWS] [--clean]
"""
import os
import random
import sys

FIRST = ["Jürgen", "Käthe", "Björn", "Sören", "Anna", "Maximilian", "Zoë", "Hans", "Günther", "Ärmin"]
LAST = ["Müller", "Größer", "Bäcker", "Weiß", "Öztürk", "Schäfer", "Jäger", "Fuß", "Krüger", "Hoffmann"]
STREET = ["Hauptstraße", "Am Bächle", "Königsallee", "Übergasse", "Mühlweg", "Schloßplatz", "Lindenstraße"]
TOWN = ["München", "Öhringen", "Düsseldorf", "Köln", "Fürth", "Lübeck", "Tübingen", "Görlitz"]
FIRM = ["Bäckerei Groß", "Müller & Söhne", "Fußpflege Süd", "Schäfer; Jäger GbR", "Café Größenwahn"]
NAMES = ["Nr", "Name", "Vorname", "Straße", "PLZ", "Ort", "Telefon", "Firma", "Betrag", "Bemerkung"]

# The defective records (1-based numbers of the data records).
TOO_MANY = (5000, 50000)
OPEN_QUOTE = 60000


def field(text):
    return '"%s"' % text if ";" in text else text


def record(number, rnd):
    return [
        str(number),
        rnd.choice(LAST),
        rnd.choice(FIRST),
        "%s %d" % (rnd.choice(STREET), rnd.randint(1, 199)),
        "%05d" % rnd.randint(1067, 99998),
        rnd.choice(TOWN),
        "0%d-%d" % (rnd.randint(30, 9999), rnd.randint(10000, 999999)),
        field(rnd.choice(FIRM)),
        "%d,%02d" % (rnd.randint(0, 99999), rnd.randint(0, 99)),
        rnd.choice(["", "Stammkunde", "Lieferung über Tor 2", "bitte rückrufen", "Rabatt 5%"]),
    ]


def main():
    args = [a for a in sys.argv[1:] if not a.startswith("--")]
    clean = "--clean" in sys.argv[1:]
    if not args:
        sys.exit(__doc__)
    folder = args[0]
    rows = int(args[1]) if len(args) > 1 else 120000
    if rows < 1 or rows > 100000000:
        sys.exit("ROWS must lie between 1 and 100000000")
    os.makedirs(folder, exist_ok=True)
    rnd = random.Random(1)
    with open(os.path.join(folder, "kunden-gross.txt"), "w", encoding="cp1252", newline="") as out:
        out.write(";".join(NAMES) + "\r\n")
        for number in range(1, rows + 1):
            fields = record(number, rnd)
            if not clean:
                if number in TOO_MANY:
                    fields[9] += ";zu viel"
                elif number == OPEN_QUOTE:
                    fields[9] = '"Anführung ohne Ende'
                elif number == rows:
                    fields[9] = '"offen bis zum Dateiende'
            out.write(";".join(fields) + "\r\n")
    with open(os.path.join(folder, "qoconvert.ini"), "w", encoding="cp1252", newline="") as ini:
        ini.write(
            "[Eingabe]\r\nDatei=kunden-gross.txt\r\n"
            "[Eingabefilter]\r\ndelimiter=59\r\nencloser=34\r\nescape=0\r\nskip=0\r\nfirstrownames=1\r\ncharset=32\r\n"
            "[Ausgabe]\r\nDatei=kunden-gross-dos.txt\r\nFormat=0\r\n"
            "[Ausgabefilter]\r\ncharset=16\r\ndelimiter=59\r\nencloser=34\r\nescape=0\r\nheader=1\r\n")


if __name__ == "__main__":
    main()

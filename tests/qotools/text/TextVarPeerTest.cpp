// The delimited reader against Python's csv module reading the same files.
#include "CQoInputFilterTextVar.h"

#include "PythonPeer.h"
#include "TempFolder.h"
#include "TextFilterTestSupport.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <random>

namespace {

// Python's reading of peer.csv in the folder, one canonical row per line;
// empty when the peer could not run.
std::string PythonRows(PeerFolder const &folder, char delimiter, char quote, char escape)
{
    std::string text = "import csv\n"
                       "kw = dict(delimiter=chr(" + std::to_string(static_cast<unsigned char>(delimiter)) + "))\n";
    if (quote)
        text += "kw['quotechar'] = chr(" + std::to_string(static_cast<unsigned char>(quote)) + ")\n";
    else
        text += "kw['quoting'] = csv.QUOTE_NONE\n";
    if (escape)
        text += "kw['escapechar'] = chr(" + std::to_string(static_cast<unsigned char>(escape)) + ")\n";
    text += "out = open(os.path.join(folder, 'rows.txt'), 'w', newline='')\n"
            "with open(os.path.join(folder, 'peer.csv'), encoding='latin-1', newline='') as f:\n"
            "    for row in csv.reader(f, **kw):\n"
            "        while row and row[-1] == '': row.pop()\n"
            "        out.write('|'.join(x.encode('latin-1').hex() for x in row) + '\\n')\n"
            "out.close()\n";
    if (!RunPython(folder, "csvpeer", text))
        return std::string();
    return ReadBytes(folder.Path("rows.txt"));
}

std::string OurRows(std::string const &path, char delimiter, char quote, char escape)
{
    CQoInputFilterTextVar f;
    f.Delimiter(delimiter);
    f.Encloser(quote);
    f.Escape(escape);
    f.Init(path.c_str());
    // Fields in hex joined by '|', trailing empty fields dropped (Python gives
    // shorter rows where this filter gives empty values).
    std::string out;
    for (bool ok = f.FirstRow(); ok; ok = f.NextRow()) {
        Row row = CurrentRow(f);
        while (!row.empty() && row.back().empty())
            row.pop_back();
        for (std::size_t i = 0; i < row.size(); ++i) {
            if (i)
                out += '|';
            for (unsigned char c : row[i])
                out += "0123456789abcdef"[c >> 4], out += "0123456789abcdef"[c & 15];
        }
        out += "\n";
    }
    return out;
}

// Random records made of the characters that matter to the dialect.
std::string RandomFile(std::mt19937 &random, char delimiter, char quote, char escape, int rows)
{
    std::string const plain = "ab \xE4\xDF\x80xyz12";
    std::string file;
    for (int r = 0; r < rows; ++r) {
        int fields = 1 + static_cast<int>(random() % 5);
        for (int i = 0; i < fields; ++i) {
            if (i)
                file += delimiter;
            int kind = static_cast<int>(random() % 6);
            int length = static_cast<int>(random() % 8);
            if (kind == 0 || !quote) {
                for (int k = 0; k < length; ++k)
                    file += plain[random() % plain.size()];
                if (escape && random() % 4 == 0)
                    file += std::string(1, escape) + delimiter;
            } else {
                // Enclosed, with delimiters, doubled enclosers, line breaks.
                std::string const special[] = {std::string(1, delimiter), std::string(2, quote), "\r\n", "\n",
                                               escape ? std::string{escape, quote} : std::string()};
                file += quote;
                for (int k = 0; k < length; ++k) {
                    std::size_t pick = random() % 7;
                    file += pick < 5 ? special[pick] : std::string(1, plain[random() % plain.size()]);
                }
                file += quote;
                if (kind == 5)
                    file += "nach"; // text after the closing encloser
            }
        }
        if (r + 1 < rows || random() % 2)
            file += (random() % 3 == 0) ? "\n" : "\r\n";
        if (random() % 25 == 0)
            file += "\r\n"; // an empty line
    }
    return file;
}

} // namespace

TEST(TextVarPeer, ReadsAsPythonCsvReadsTheSameDialect)
{
    PeerFolder folder;
    if (!folder.Usable())
        PEER_UNAVAILABLE();
    std::string path = folder.Path("peer.csv");
    struct Dialect {
        char delimiter, quote, escape;
    } const dialects[] = {{'\t', '\'', 0}, {';', '"', '\\'}, {'|', 0, '\\'}};
    std::mt19937 random(2024);
    for (Dialect const &d : dialects) {
        WriteBytes(path, RandomFile(random, d.delimiter, d.quote, d.escape, 800));
        std::string python = PythonRows(folder, d.delimiter, d.quote, d.escape);
        if (python.empty())
            PEER_UNAVAILABLE();
        ASSERT_EQ(python, OurRows(path, d.delimiter, d.quote, d.escape))
            << "dialect " << int(d.delimiter) << " " << int(d.quote) << " " << int(d.escape);
    }
}

// Fuzz target of the delimited reader: the first bytes choose the dialect and
// how defective records are answered, the rest is the file. Besides not
// crashing, every row read in sequence must read the same through AbsoluteRow.
#include "CQoInputFilterTextVar.h"
#include "FuzzSupport.h"

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size)
{
    if (size < 4)
        return 0;
    static char const delimiters[] = {';', ',', '\t', '|'};
    static char const enclosers[] = {'"', '\'', 0, '"'};
    static char const escapes[] = {0, '\\', 0, '"'};
    CQoInputFilterTextVar f;
    f.Delimiter(delimiters[data[0] & 3]);
    f.Encloser(enclosers[(data[0] >> 2) & 3]);
    f.Escape(escapes[(data[0] >> 4) & 3]);
    f.SetFirstRowHasNames(data[0] & 0x40);
    f.Skip(data[1] % 3);
    fuzz::InstallHooks(data[2]);
    std::uint8_t const pick = data[3];
    std::string const path = fuzz::WriteFile("fuzz_textvar", data + 4, size - 4);
    fuzz::ReadFile(f, path, pick);
    return 0;
}

// Fuzz target of the fixed-length record filter and the fixed-column lines
// filter, their settings fuzzed too: the input starts with a settings text
// (record length, column count and widths, as a project holds them), then a
// byte of flags, then the file. Settings out of bounds must be refused with
// CQoException; any file must read consistently or raise CQoException.
#include "CQoFile.h"
#include "CQoInputFilterTextFix.h"
#include "CQoInputFilterTextVF.h"
#include "FuzzSupport.h"

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size)
{
    fuzz::Split split;
    if (!fuzz::SplitSettings(data, size, split) || split.restSize < 1)
        return 0;
    std::uint8_t const flags = split.rest[0];
    std::string const path = fuzz::WriteFile("fuzz_textfixed", split.rest + 1, split.restSize - 1);
    fuzz::InstallHooks(flags >> 3);
    CQoInputFilterTextFix fix;
    CQoInputFilterTextVF lines;
    CQoInputFilter &f = (flags & 1) ? static_cast<CQoInputFilter &>(lines) : fix;
    try {
        f.ReadConfig(split.settings, "s");
    } catch (CQoException const &) {
        return 0; // a refused project
    }
    f.SetFirstRowHasNames(flags & 2);
    f.CharSet((flags & 4) ? CQoFile::ascii : CQoFile::ansi);
    fuzz::ReadFile(f, path, flags);
    return 0;
}

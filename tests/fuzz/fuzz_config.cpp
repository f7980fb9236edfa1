// Fuzz target of the configuration file reader: any bytes must parse without a
// crash, and what the reader keeps must survive being written and read again
// unchanged (the text form is a fixed point, every key keeps its value).
#include "CQoConfigFile.h"

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace {

[[noreturn]] void Fail(char const *what, char const *detail)
{
    std::fprintf(stderr, "fuzz_config: %s: %s\n", what, detail ? detail : "");
    std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size)
{
    CQoConfigFile first;
    first.FromText(reinterpret_cast<char const *>(data), size);

    CQoString const text = first.ToText();
    CQoConfigFile second;
    second.FromText(text.GetString(), static_cast<std::size_t>(text.GetLength()));
    if (second.ToText() != text)
        Fail("text form changes when read again", text);

    // The same sections and keys, in the same order, with the same values.
    std::vector<CQoString> const sections = first.GetSections();
    if (sections != second.GetSections())
        Fail("sections differ after reading the text form", text);
    for (CQoString const &section : sections) {
        if (section.IsEmpty())
            Fail("a section without a name was kept", text);
        std::vector<CQoString> const keys = first.GetKeys(section);
        if (keys != second.GetKeys(section))
            Fail("keys differ after reading the text form", section);
        for (CQoString const &key : keys) {
            if (key.IsEmpty())
                Fail("a key without a name was kept", section);
            CQoString a("unset-a"), b("unset-b");
            if (!first.GetValue(section, key, a))
                Fail("a listed key cannot be read", key);
            if (!second.GetValue(section, key, b))
                Fail("a listed key cannot be read after reading the text form", key);
            if (a.Str() != b.Str())
                Fail("a value changed after reading the text form", key);
            // Integer reading must answer consistently and never crash.
            long number = 0;
            first.GetValue(section, key, number);
        }
    }

    // Copying a section into an empty configuration gives the same keys.
    if (!sections.empty()) {
        CQoConfigFile copy;
        copy.CopySection(first, sections.front());
        if (copy.GetKeys(sections.front()) != first.GetKeys(sections.front()))
            Fail("CopySection lost keys", sections.front());
    }
    return 0;
}

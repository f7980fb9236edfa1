// Fuzz target of the text and dBase outputs: a settings text as a project
// holds it is read with ReadConfig, then rows made of the rest of the input
// are written, to a string and to a file. Settings out of bounds must be
// refused with CQoException; whatever is accepted must write records of the
// promised shape, and a dBase file must read back with its row count.
#include "CQoInputFilterDbase34.h"
#include "CQoOutputFilterDbase.h"
#include "CQoOutputFilterTextFix.h"
#include "CQoOutputFilterTextVar.h"
#include "FuzzSupport.h"

#include <memory>

namespace {

void Fill(CQoOutputFilter &out, std::uint8_t const *data, std::size_t size, std::size_t row)
{
    out.InitRow();
    std::string text(reinterpret_cast<char const *>(data), size);
    for (int c = 0; c < out.NumCols() && c < 64; ++c) {
        std::size_t from = (std::size_t(c) * 7 + row * 3) % (text.size() + 1);
        out.Value(c, text.substr(from, std::size_t(c) % 11 + row).c_str());
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size)
{
    fuzz::Split split;
    if (!fuzz::SplitSettings(data, size, split) || split.restSize < 1)
        return 0;
    std::uint8_t const kind = split.rest[0] % 3;
    std::unique_ptr<CQoOutputFilter> out;
    if (kind == 0)
        out.reset(new CQoOutputFilterTextFix);
    else if (kind == 1)
        out.reset(new CQoOutputFilterTextVar);
    else
        out.reset(new CQoOutputFilterDbase);
    try {
        out->ReadConfig(split.settings, "s");
    } catch (CQoException const &) {
        return 0; // a refused project
    }
    if (out->NumCols() > 300)
        return 0; // valid, but too slow to write for every input
    std::string const path = fuzz::TempPath("fuzz_outputs");
    std::uint8_t const *values = split.rest + 1;
    std::size_t const valuesSize = split.restSize - 1;
    long written = 0;
    CQoFile file; // outlives the filter's use of it, whatever is raised
    try {
        CQoString text;
        out->WriteHeader(&text);
        for (std::size_t row = 0; row < 3; ++row) {
            Fill(*out, values, valuesSize, row);
            out->WriteRow(&text);
            if (kind == 0) {
                auto &fix = static_cast<CQoOutputFilterTextFix &>(*out);
                if (text.GetLength() != fix.RecordLength() + (fix.GetCrLf() ? 2 : 0))
                    std::abort();
            }
        }
        if (!file.Open(path.c_str(), CQoFile::write | CQoFile::create | CQoFile::binary))
            return 0;
        out->UseFile(&file, true);
        if (out->Init()) {
            out->WriteHeader();
            for (std::size_t row = 0; row < 3; ++row) {
                Fill(*out, values, valuesSize, row);
                out->WriteRow();
                ++written;
            }
        }
        out->ReleaseFile();
    } catch (CQoException const &) {
        // settings that cannot make a file, or values a field cannot hold
        try {
            out->ReleaseFile();
        } catch (CQoException const &) {
        }
        return 0;
    }
    if (kind == 2 && written > 0) {
        CQoInputFilterDbase34 back;
        back.SkipDeleted(false);
        back.Init(path.c_str());
        if (back.NumRows() != written)
            std::abort();
    }
    std::remove(path.c_str());
    return 0;
}

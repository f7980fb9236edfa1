// Shared pieces of the fuzz targets: a file of the fuzzer's bytes, settings
// as a configuration text, the repair hooks answered by the input, and the
// check that every row read in sequence reads the same through AbsoluteRow.
#pragma once

#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoInputFilter.h"
#include "CQoInterActive.h"

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <unistd.h>
#include <vector>

namespace fuzz {

// A file name of this process (fuzzers may run in parallel).
inline std::string TempPath(char const *name, char const *suffix = "")
{
    return "/tmp/" + std::string(name) + "_" + std::to_string(getpid()) + suffix;
}

// That file, holding `size` bytes.
inline std::string WriteFile(char const *name, std::uint8_t const *data, std::size_t size, char const *suffix = "")
{
    std::string path = TempPath(name, suffix);
    if (std::FILE *fp = std::fopen(path.c_str(), "wb")) {
        std::fwrite(data, 1, size, fp);
        std::fclose(fp);
    }
    return path;
}

// Splits the input: the first two bytes give the length of a settings text
// (section [s] of a configuration), the rest is what follows it.
struct Split {
    CQoConfigFile settings;
    std::uint8_t const *rest = nullptr;
    std::size_t restSize = 0;
};

inline bool SplitSettings(std::uint8_t const *data, std::size_t size, Split &out)
{
    if (size < 2)
        return false;
    std::size_t length = (std::size_t(data[0]) | std::size_t(data[1]) << 8) % 1024;
    data += 2;
    size -= 2;
    if (length > size)
        length = size;
    std::string text = "[s]\n" + std::string(reinterpret_cast<char const *>(data), length);
    out.settings.FromText(text.data(), text.size());
    out.rest = data + length;
    out.restSize = size - length;
    return true;
}

// Repair hooks whose answers follow the mode set per input.
inline int repairMode = 0, repairCalls = 0;

inline int Repair(CQoString const &, CQoString &data, int &pos)
{
    switch ((repairMode + ++repairCalls) % 4) {
    case 0: return CQoInterActive::repairStop;
    case 1: return CQoInterActive::repairSkip;
    case 2: data = data.Left(pos); return CQoInterActive::repairTakeOver;
    default: pos = pos / 2; return CQoInterActive::repairSkip;
    }
}

inline int Correct(CQoString &record)
{
    record = "x";
    return repairCalls % 2;
}

// Installs the hooks; modes 6 and 7 leave the repair hook out, so defects raise.
inline void InstallHooks(int mode)
{
    repairMode = mode & 7;
    repairCalls = 0;
    CQoInterActive::SetRepairRecord(repairMode < 6 ? &Repair : nullptr);
    CQoInterActive::SetCorrectRepair(&Correct);
}

inline std::vector<std::string> Row(CQoInputFilter &f)
{
    std::vector<std::string> row;
    CQoString value;
    for (int c = 0; c < f.NumCols(); ++c) {
        f.Value(c, value);
        row.emplace_back(value.Str());
    }
    return row;
}

// Reads every row, then jumps to them in a scattered order: a row found by
// walking must be found again with the same values, and the count must match.
inline void ReadAndRevisit(CQoInputFilter &f, unsigned pick)
{
    std::vector<std::vector<std::string>> rows;
    for (bool ok = f.FirstRow(); ok && rows.size() < 5000; ok = f.NextRow())
        rows.push_back(Row(f));
    if (rows.size() >= 5000)
        return;
    if (static_cast<long>(rows.size()) != f.NumRows())
        std::abort();
    for (std::size_t k = 0; k < rows.size(); ++k) {
        long r = static_cast<long>((k * 7 + pick) % rows.size());
        if (!f.AbsoluteRow(r) || Row(f) != rows[std::size_t(r)])
            std::abort();
    }
    if (f.AbsoluteRow(static_cast<long>(rows.size())))
        std::abort();
}

// Opens the file with the filter, reads the column names and the rows; a
// CQoException is a valid answer to a bad file.
inline void ReadFile(CQoInputFilter &f, std::string const &path, unsigned pick)
{
    try {
        f.Init(path.c_str());
        CQoString name;
        for (int c = 0; c < f.NumCols(); ++c)
            f.ColName(c, name);
        ReadAndRevisit(f, pick);
    } catch (CQoException const &) {
    }
}

} // namespace fuzz

// The state of a CMultiColumnHandler, shared with the split input filter and
// the composed output source that it makes, so that they follow the handler's
// changes and stay usable after the handler is gone. Internal to qotools.
#pragma once

#include "CQoString.h"

#include <string>
#include <vector>

class CQoConfigFile;
class CQoInputFilter;
class CQoOutputSource;

struct MultiColumnMapping {
    struct Inner {
        int id;
        long function;
        CQoString name;
        int sourceColumn; // -1: the inner column's own position
    };
    struct Outer {
        int id;
        CQoString name;
    };
    struct Assignment {
        int outer; // outer column id
        int inner; // inner column id
        CQoString separator;
        bool always;
    };

    explicit MultiColumnMapping(int handlerType) : type(handlerType) {}

    bool Splits() const { return type == 0; }

    int FindInner(int id) const;
    // composeOutput: index of the outer column with `id`; splitInput: the id
    // itself when it is a column of the read filter (or any id >= 0 without one).
    int FindOuter(int id) const;
    int NumOuter() const;
    int OuterId(int index) const;
    // splitInput: the name given with ChangeColumnName, or null.
    Outer const *SplitOuterName(int index) const;
    bool OuterName(int index, CQoString &name) const;
    // The assignments of the outer column `outerId`, in part order.
    std::vector<Assignment const *> PartsOf(int outerId) const;
    // The first assignment of the inner column `innerId`, or null.
    Assignment const *AssignmentOf(int innerId) const;
    // The source column that the inner column at `index` reads.
    int SourceColumnOf(int index) const;
    void Changed() { ++version; }

    // The rules of CMultiColumnHandler's Add operations.
    bool AddInner(int id, long function, CQoString const &name, int sourceColumn);
    bool AddOuter(int id, CQoString const &name);
    bool AddAssignment(int outerId, int innerId, CQoString const &separator, bool always);

    // The mapping's settings (see CMultiColumnHandler::WriteConfig/ReadConfig).
    void WriteConfig(CQoConfigFile &cfg, char const *section) const;
    bool ReadConfig(CQoConfigFile const &cfg, char const *section);

    // Cuts `text` into the parts' values (see CMultiColumnHandler.h).
    static void Split(std::string_view text, std::vector<Assignment const *> const &parts,
                      std::vector<std::string> &values);
    // Appends a part's value with its separator to `out`.
    static void AppendPart(std::string &out, Assignment const &part, std::string_view value);

    int type;
    bool alwaysUseOuterNames = false;
    CQoInputFilter *readFilter = nullptr;
    CQoOutputSource *writeSource = nullptr;
    std::vector<Inner> inner;
    // composeOutput: the outer columns. splitInput: names given to columns of
    // the read filter (id = column index).
    std::vector<Outer> outer;
    std::vector<Assignment> assignments;
    // Grows with every change, so that readers can tell when cached work is stale.
    unsigned long version = 0;
};

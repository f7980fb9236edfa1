// CMultiColumnHandler: maps the columns of a file or an output onto the
// functions of a conversion, and back.
//
// A conversion knows "functions" (field roles such as name, first name, postcode);
// a file or an output has "outer" columns. The handler holds "inner" columns, one
// per function used, and assignments that tie each inner column to an outer one.
// An outer column may hold several inner columns, each part preceded by its
// separator text, as in "Name, Vorname". The handler works in one of two types,
// fixed at construction:
//
// * splitInput (0): the outer columns are those of an input filter given with
//   SetReadFilter (outer id = the filter's column index). The assignments say which
//   parts an input column is cut into; CreateMultiColumnInputFilter gives an input
//   filter that delivers the inner columns, row by row, from the input's rows.
// * composeOutput (1): the outer columns are made with AddOuterColumn (outer id of
//   the caller's choice); the inner columns read the columns of an output source
//   given with SetWriteOutputSource. CreateMultiColumnOutputSource gives an output
//   source whose columns are the outer columns, each composed of its parts.
//
// Composing: each part's value is preceded by its separator. The separator is
// written only before a non-empty value, unless the part was assigned with
// `always` set. Splitting is the reverse: the value of a part runs up to the next
// separator of a later part that occurs in the text; a later part whose separator
// does not occur (or is empty) gets empty text, so "Meier Dr." with the parts
// (Name, ""), (Vorname, ", "), (Titel, " ") gives "Meier", "", "Dr.".
//
// Indexes and ids: operations named with an index (Get...(int index, ...),
// DeleteColumn, ChangeColumnName) count columns in their order, from 0 (inner
// columns in the order they were added). AddAssignment takes ids: the outer
// column's id and the inner column's id as given to AddInnerColumn.
//
// The objects made by Create... read the handler's mapping live: changes to the
// handler show in their next value. They stay valid after the handler is gone
// (they share the mapping), but the read filter and the output source they read
// are not owned and must outlive them. The split filter moves the read filter:
// while reading through it, do not move the read filter by other means. The
// caller owns what Create... returns and releases it with its Delete().
//
//     CMultiColumnHandler handler(CMultiColumnHandler::splitInput);
//     handler.SetReadFilter(&file);                     // "Name" = "Meier, Hans"
//     handler.AddInnerColumn(0, 10001, "Name");
//     handler.AddInnerColumn(1, 10002, "Vorname");
//     handler.AddAssignment(0, 0, "", false);
//     handler.AddAssignment(0, 1, ", ", false);
//     CQoInputFilter *split = handler.CreateMultiColumnInputFilter();
//     ... split->Value(1, v) gives "Hans" ...
//     split->Delete();
#pragma once

#include "QoToolsApi.h"

#include "CQoString.h"

#include <memory>

class CQoConfigFile;
class CQoInputFilter;
class CQoOutputSource;
struct MultiColumnMapping;

class QOTOOLS_API CMultiColumnHandler {
public:
    enum handlerType {
        splitInput = 0,   // outer columns of an input filter, split into inner ones
        composeOutput = 1 // outer output columns, composed of inner ones
    };

    // `type` is one of handlerType; any other value counts as splitInput.
    explicit CMultiColumnHandler(int type);
    ~CMultiColumnHandler();
    // Copies hold their own mapping (the same read filter and output source).
    CMultiColumnHandler(CMultiColumnHandler const &other);
    CMultiColumnHandler &operator=(CMultiColumnHandler const &other);

    int GetType() const;

    // With this set, column names are always those of the outer columns: the
    // split filter names every inner column after its outer column, and a composed
    // column without a name stays without one. Otherwise the split filter uses the
    // inner columns' own names, and a composed column without a name is named
    // after its parts (as GetInnerNamesOfOuterColumn). Off at construction.
    void SetAlwaysUseOuterNames(bool always);
    bool GetAlwaysUseOuterNames() const;

    // --- what is read -----------------------------------------------------------
    // splitInput: the input whose columns are the outer columns. Not owned.
    // Names given to outer columns with ChangeColumnName are dropped.
    void SetReadFilter(CQoInputFilter *filter);
    CQoInputFilter *GetReadFilter() const;
    // composeOutput: the source the inner columns read. Not owned.
    void SetWriteOutputSource(CQoOutputSource *source);
    CQoOutputSource *GetWriteOutputSource() const;

    // splitInput only (null otherwise): an input filter over the read filter
    // whose columns are the inner columns. The caller releases it with Delete().
    CQoInputFilter *CreateMultiColumnInputFilter();
    // composeOutput only (null otherwise): an output source whose columns are
    // the outer columns. The caller releases it with Delete().
    CQoOutputSource *CreateMultiColumnOutputSource();

    // --- inner columns ------------------------------------------------------------
    // Adds an inner column. `id` must be new (false otherwise). `function` is the
    // function it stands for. `sourceColumn` (composeOutput) is the column of the
    // output source it reads; -1 reads the column at the inner column's own
    // position (the n-th inner column reads source column n).
    bool AddInnerColumn(int id, long function, char const *name, int sourceColumn = -1);
    int NumInnerColumns() const;
    // The id of the inner column at `index`, or -1.
    int GetInnerColumnId(int index) const;
    // The index of the inner column with `id`, or -1.
    int FindInnerColumn(int id) const;
    // With `nameOnly` the inner column's name; otherwise its name preceded by the
    // separator of its first assignment (as it appears in a combination's name).
    // False (text emptied) for an index out of range.
    bool GetInnerColName(int index, CQoString &name, bool nameOnly) const;
    // The function of the inner column at `index`, or -1 for an index out of range.
    long GetInnerFunction(int index) const;
    // The column of the output source the inner column at `index` reads, or -1
    // for an index out of range.
    int GetInnerSourceColumn(int index) const;

    // --- outer columns -------------------------------------------------------------
    // composeOutput: adds an outer column at the end; false when the id is in use
    // or in splitInput (whose outer columns are the read filter's).
    bool AddOuterColumn(int id, char const *name);
    // splitInput: the read filter's column count (0 without one).
    int NumOuterColumns() const;
    // An id that no outer column has (one more than the greatest in use, 0 when
    // there are none); splitInput: the column count.
    int GetNextFreeOuterColumnId() const;
    // The id of the outer column at `index`, or -1.
    int GetOuterColumnId(int index) const;
    // The index of the outer column with `id`, or -1.
    int FindOuterColumn(int id) const;
    // The outer column's name: composeOutput its given name; splitInput a name
    // given with ChangeColumnName, else the read filter's column name. False (text
    // emptied) for an index out of range.
    bool GetOuterColName(int index, CQoString &name) const;
    // The names of the inner columns assigned to the outer column at `index`, each
    // preceded by its separator, in part order ("Name, Vorname"). False (text
    // emptied) for an index out of range; empty text when nothing is assigned.
    bool GetInnerNamesOfOuterColumn(int index, CQoString &names) const;
    // The index of the outer column the inner column at `index` is (first)
    // assigned to, with the outer column's name; -1 (name untouched) when it is
    // not assigned or the index is out of range.
    int GetOuterNameOfInnerColumn(int index, CQoString &name) const;

    // --- removing and renaming -------------------------------------------------------
    // Removes the inner (`inner` true) or outer column at `index` with its
    // assignments. Outer columns of splitInput cannot be removed (false).
    bool DeleteColumn(bool inner, int index);
    // Removes all inner (`inner` true) or all outer columns with their
    // assignments; in splitInput removing the outer columns drops the names given
    // to them and their assignments (the read filter's columns stay).
    void DeleteColumns(bool inner);
    // Renames the outer (`outer` true) or inner column at `index`. In splitInput
    // the outer name is kept by the handler; the read filter is not changed.
    bool ChangeColumnName(bool outer, int index, CQoString const &name);

    // --- assignments -------------------------------------------------------------------
    // Appends the inner column `innerId` as the next part of the outer column
    // `outerId`, preceded by `separator` (written only before a non-empty value
    // unless `always`). False when either column does not exist, or in splitInput
    // when the inner column is assigned already (its value comes from one place).
    bool AddAssignment(int outerId, int innerId, char const *separator, bool always);
    void ClearAssignments();
    int NumAssignments() const;
    // The assignment at `index` in the order added; false when out of range.
    bool GetAssignment(int index, int &outerId, int &innerId, CQoString &separator, bool &always) const;

    // --- settings --------------------------------------------------------------------------
    // The whole mapping (type, name rule, columns and assignments) as keys of
    // `section`; ReadConfig replaces the mapping by the one stored (entries that
    // no longer fit, such as an assignment to a missing column, are left out) and
    // answers false when the section holds no mapping, which then stays as it was.
    // The read filter and the output source are not part of the settings.
    void WriteConfig(CQoConfigFile &cfg, CQoString const &section) const;
    bool ReadConfig(CQoConfigFile const &cfg, CQoString const &section);

private:
    std::shared_ptr<MultiColumnMapping> m_map;
};

// CColumnMapping - the output columns of a conversion: composed of the
// input's columns, chosen and ordered by the user, kept in the project. The
// conversion module and the window build the same chain with it:
//
//     input filter -> CInputRecords (the input's columns)
//       -> composed columns (CMultiColumnHandler: each output column is one
//          input column or a combination of several with separators)
//       -> CColumnView (which composed columns are written, in which order)
//       -> output filter
//
// Functions: input column i is the function i + 1 (of the predefined range),
// named after the column unless the project names it otherwise; combinations
// of them carry ids of the combination range. The window edits them on the
// combination field page and the column view on the output source page.
//
// The project's sections:
//
//     [Funktionen]      Funktionen=<n>; per function k: Funktion<k>Id,
//                       Funktion<k>Name, and for a combination Funktion<k>Teile=<m>
//                       with Funktion<k>Teil<j>Id, ...Trenner, ...Immer (1: the
//                       separator also before an empty value)
//     [Spalten]         the composition, as CMultiColumnHandler stores it
//     [Spaltenauswahl]  Spalten=<n>; per column k in output order:
//                       Spalte<k>Name, Spalte<k>Ausgabe (1 written, 0 left out)
//
// A project without them writes every input column as it is, in the
// input's order, and the chain follows the input when its columns change.
#pragma once

#include <CFunctionManager.h>
#include <CMultiColumnHandler.h>

#include <vector>

#include "CColumnView.h"

class COutputFilterSource;
class CQoConfigFile;
class CQoOutputSource;

class CColumnMapping
{
public:
    CColumnMapping();
    ~CColumnMapping();
    CColumnMapping(const CColumnMapping&) = delete;
    CColumnMapping& operator=(const CColumnMapping&) = delete;

    // Raises CQoException for a section that cannot be used (a count out of
    // range, a composition of the wrong kind). Takes effect with Build.
    void ReadConfig(const CQoConfigFile& config);
    // Writes the three sections once the columns were defined; leaves the
    // file's own otherwise (sections that could not be read are not lost).
    void WriteConfig(CQoConfigFile& config) const;
    // Whether the project defines the columns (else every input column is
    // written as it is).
    bool IsDefined() const { return m_bDefined; }

    // Builds the chain over the input's rows (not owned; all their columns
    // in their order): the functions of the input's columns, the composition
    // (the stored one, or one output column per input column) and the view.
    // Again after the input's columns changed.
    void Build(COutputFilterSource& records);

    // What an output filter writes.
    CColumnView& View() { return m_view; }
    // The functions: the input's columns and the project's combinations.
    CFunctionManager& Functions();
    const CMultiColumnHandler& Handler() const { return m_handler; }
    // The number of the input's columns at the last Build.
    int NumInputColumns() const { return m_nInputColumns; }
    // After Build: one text for each written column that the project
    // composes of an input column the input does not have (it stays empty).
    std::vector<CQoString> MissingSources() const;

    // The function of each output column, as the combination page holds it:
    // a single input column's function, or the combination whose parts the
    // column is composed of (a composition that no combination describes
    // becomes a new combination, so that nothing of it is lost).
    std::vector<long> OuterFunctions();

    // The composition as the user left it on the page: the view keeps the
    // choice for the columns it knows, by name, or with `sameIds` (the
    // composition was taken from that page before) by the column's id, so
    // that a renamed column keeps its place. The columns count as defined.
    void TakeComposition(const CMultiColumnHandler& edited, bool sameIds);

private:
    void BuildFunctions();
    // The function name of an input column: the project's, else the column's.
    CString FunctionName(int column);
    void BuildDefaultComposition();

    CFunctionManager m_functions;
    CMultiColumnHandler m_handler;
    CQoOutputSource* m_pComposed;   // made by the handler, follows it
    CColumnView m_view;
    COutputFilterSource* m_pRecords;
    int m_nInputColumns;
    bool m_bFunctionsBuilt;

    bool m_bDefined;
    bool m_bComposition;      // the handler holds a stored or edited composition
    bool m_bSelectionPending; // m_selection waits for the next Build
    CColumnView::Selection m_selection;
};

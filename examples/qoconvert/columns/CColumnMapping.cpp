#include "CColumnMapping.h"

#include <COutputFilterSource.h>
#include <CQoConfigFile.h>
#include <CQoException.h>
#include <CQoOutputSource.h>
#include <CQoString.h>
#include <QoLimits.h>

#include <algorithm>

namespace {
const char kFunctions[] = "Funktionen";
const char kComposition[] = "Spalten";
const char kSelection[] = "Spaltenauswahl";

CQoString Key(const char* prefix, int n, const char* suffix)
{
    CQoString key;
    key.Format("%s%d%s", prefix, n, suffix);
    return key;
}

CQoString PartKey(int function, int part, const char* suffix)
{
    CQoString key;
    key.Format("Funktion%dTeil%d%s", function, part, suffix);
    return key;
}

bool SameParts(const std::vector<CFunctionManager::CCombiPart>& a, const std::vector<CFunctionManager::CCombiPart>& b)
{
    if (a.size() != b.size())
        return false;
    for (size_t i = 0; i < a.size(); ++i)
        if (a[i].GetFunctionId() != b[i].GetFunctionId() || a[i].GetSeparator() != b[i].GetSeparator()
            || a[i].GetAlwaysSeparate() != b[i].GetAlwaysSeparate())
            return false;
    return true;
}
}  // namespace

CColumnMapping::CColumnMapping()
    : m_handler(CMultiColumnHandler::composeOutput), m_pComposed(nullptr), m_pRecords(nullptr), m_nInputColumns(0),
      m_bFunctionsBuilt(false), m_bDefined(false), m_bComposition(false), m_bSelectionPending(false)
{
    m_pComposed = m_handler.CreateMultiColumnOutputSource();
    m_view.SetComposed(m_pComposed);
}

CColumnMapping::~CColumnMapping()
{
    m_view.SetComposed(nullptr);
    if (m_pComposed != nullptr)
        m_pComposed->Delete();
}

void CColumnMapping::ReadConfig(const CQoConfigFile& config)
{
    // Read completely before anything is taken over: a project refused for
    // one bad value leaves the columns as they were.
    CFunctionManager functions;
    if (config.HasSection(kFunctions)) {
        int count = 0;
        config.GetValue(kFunctions, "Funktionen", count, 0, qolimits::maxColumns);
        for (int k = 0; k < count; ++k) {
            long id = 0;
            if (!config.GetValue(kFunctions, Key("Funktion", k, "Id"), id))
                continue;
            CQoString name;
            config.GetValue(kFunctions, Key("Funktion", k, "Name"), name);
            int parts = 0;
            config.GetValue(kFunctions, Key("Funktion", k, "Teile"), parts, 0, qolimits::maxColumns);
            std::vector<CFunctionManager::CCombiPart> combination;
            for (int j = 0; j < parts; ++j) {
                long part = 0;
                if (!config.GetValue(kFunctions, PartKey(k, j, "Id"), part))
                    continue;
                CQoString separator;
                config.GetValue(kFunctions, PartKey(k, j, "Trenner"), separator);
                int always = 0;
                config.GetValue(kFunctions, PartKey(k, j, "Immer"), always);
                combination.push_back(CFunctionManager::CCombiPart(part, separator.GetString(), always != 0));
            }
            CFunctionManager::CFunction function(id, name.GetString());
            function.SetCombination(combination);
            functions.AddFunction(function);
        }
    }

    CMultiColumnHandler composition(CMultiColumnHandler::composeOutput);
    const bool hasComposition = config.HasSection(kComposition);
    if (hasComposition && !composition.ReadConfig(config, kComposition))
        CQoException::Throw("Der Abschnitt [Spalten] beschreibt keine Zusammensetzung der Ausgabespalten "
                            "(MultiColumnType=1 fehlt).",
                            kComposition);

    CColumnView::Selection selection;
    const bool hasSelection = config.HasSection(kSelection);
    if (hasSelection) {
        int count = 0;
        config.GetValue(kSelection, "Spalten", count, 0, qolimits::maxColumns);
        for (int k = 0; k < count; ++k) {
            CQoString name;
            if (!config.GetValue(kSelection, Key("Spalte", k, "Name"), name))
                continue;
            int written = 1;
            config.GetValue(kSelection, Key("Spalte", k, "Ausgabe"), written);
            selection.push_back(std::make_pair(CString(name.GetString()), written != 0));
        }
    }

    m_functions = functions;
    if (hasComposition) {
        m_handler = composition;   // the composed source follows the handler
        m_handler.SetWriteOutputSource(m_pRecords);
    }
    m_bComposition = hasComposition;
    m_selection = selection;
    m_bSelectionPending = hasSelection;
    m_bDefined = config.HasSection(kFunctions) || hasComposition || hasSelection;
}

void CColumnMapping::WriteConfig(CQoConfigFile& config) const
{
    // Sections this program could not read stay for the user to mend.
    if (!m_bDefined)
        return;
    config.DeleteSection(kFunctions);
    config.DeleteSection(kComposition);
    config.DeleteSection(kSelection);

    const int count = m_functions.GetNumFunctions();
    config.SetValue(kFunctions, "Funktionen", count);
    for (int k = 0; k < count; ++k) {
        CFunctionManager::CFunction function(CFunctionManager::unusedFunction, CString());
        m_functions.GetFunctionAt(k, function);
        config.SetValue(kFunctions, Key("Funktion", k, "Id"), function.GetId());
        config.SetValue(kFunctions, Key("Funktion", k, "Name"), (const char*)function.GetName());
        const std::vector<CFunctionManager::CCombiPart> parts = function.GetCombination();
        if (parts.empty())
            continue;
        config.SetValue(kFunctions, Key("Funktion", k, "Teile"), static_cast<int>(parts.size()));
        for (size_t j = 0; j < parts.size(); ++j) {
            const int part = static_cast<int>(j);
            config.SetValue(kFunctions, PartKey(k, part, "Id"), parts[j].GetFunctionId());
            config.SetValue(kFunctions, PartKey(k, part, "Trenner"), (const char*)parts[j].GetSeparator());
            config.SetValue(kFunctions, PartKey(k, part, "Immer"), parts[j].GetAlwaysSeparate() ? 1 : 0);
        }
    }

    // Without a composition of its own the project follows the input's columns.
    if (m_bComposition)
        m_handler.WriteConfig(config, kComposition);

    const CColumnView::Selection selection =
        m_bSelectionPending ? m_selection : const_cast<CColumnView&>(m_view).GetSelection();
    config.SetValue(kSelection, "Spalten", static_cast<int>(selection.size()));
    for (size_t k = 0; k < selection.size(); ++k) {
        config.SetValue(kSelection, Key("Spalte", static_cast<int>(k), "Name"), (const char*)selection[k].first);
        config.SetValue(kSelection, Key("Spalte", static_cast<int>(k), "Ausgabe"), selection[k].second ? 1 : 0);
    }
}

void CColumnMapping::Build(COutputFilterSource& records)
{
    // Keep the choice made for the columns as they were.
    const CColumnView::Selection wanted = m_bSelectionPending ? m_selection : m_view.GetSelection();
    m_bSelectionPending = false;

    m_pRecords = &records;
    m_handler.SetWriteOutputSource(&records);
    m_nInputColumns = std::max(0, std::min(records.GetNumColumns(), qolimits::maxColumns));
    // The functions only for the page that shows them: the manager sorts
    // anew with every function added, too slow for wide inputs in a run.
    m_bFunctionsBuilt = false;
    if (!m_bComposition) {
        BuildDefaultComposition();
    } else {
        // Every input column can be composed, also one the input has gained.
        for (int i = 0; i < m_nInputColumns; ++i) {
            if (m_handler.FindInnerColumn(i + 1) >= 0)
                continue;
            m_handler.AddInnerColumn(i + 1, i + 1, FunctionName(i), i);
        }
    }
    // Without a composition of the project's the columns are the input's as
    // read: the view reads them straight (the handler holds the same
    // composition for the page that edits it).
    m_view.SetComposed(m_bComposition ? m_pComposed : &records);
    m_view.Sync(wanted);
}

std::vector<CQoString> CColumnMapping::MissingSources() const
{
    std::vector<CQoString> missing;
    if (!m_bComposition)
        return missing;
    for (int index = 0; index < m_handler.NumInnerColumns(); ++index) {
        const int source = m_handler.GetInnerSourceColumn(index);
        CQoString outer, inner;
        if (source < m_nInputColumns || m_handler.GetOuterNameOfInnerColumn(index, outer) < 0)
            continue;
        m_handler.GetInnerColName(index, inner, true);
        CQoString text;
        text.Format("Die Ausgabespalte '%s' liest '%s' aus der Eingabespalte %d, die Eingabe hat aber nur %d "
                    "Spalten: der Teil bleibt leer.",
                    outer.GetString(), inner.GetString(), source + 1, m_nInputColumns);
        missing.push_back(text);
    }
    return missing;
}

CString CColumnMapping::FunctionName(int column)
{
    CFunctionManager::CFunction stored(column + 1, CString());
    if (m_bDefined && m_functions.GetFunction(column + 1, stored) && !stored.GetName().IsEmpty())
        return stored.GetName();
    CString name;
    m_pRecords->GetName(column, name, 0);
    return name;
}

CFunctionManager& CColumnMapping::Functions()
{
    if (!m_bFunctionsBuilt && m_pRecords != nullptr)
        BuildFunctions();
    return m_functions;
}

void CColumnMapping::BuildFunctions()
{
    m_bFunctionsBuilt = true;
    // The input's columns are the plain functions; what else the project
    // defines (combinations) stays as it is. Functions of columns the input no
    // longer has are dropped, combinations then skip those parts.
    CFunctionManager rebuilt;
    // Input column i is function i + 1: the predefined range holds them all.
    if (m_nInputColumns > rebuilt.GetMaxPredefinedId()) {
        rebuilt.SetMaxPredefinedId(m_nInputColumns);
        rebuilt.SetMinUserdefinedId(m_nInputColumns + 1);
    }
    for (int i = 0; i < m_nInputColumns; ++i) {
        CFunctionManager::CFunction function(i + 1, FunctionName(i));
        rebuilt.AddFunction(function);
    }
    long nextCombi = rebuilt.GetMinCombiId();
    long nextUser = rebuilt.GetMinUserdefinedId();
    for (int k = 0; k < m_functions.GetNumFunctions(); ++k) {
        CFunctionManager::CFunction function(CFunctionManager::unusedFunction, CString());
        if (!m_functions.GetFunctionAt(k, function))
            continue;
        const CFunctionManager::type kind = rebuilt.Id2Type(function.GetId());
        if (kind == CFunctionManager::predefinedType)
            continue;
        if (kind == CFunctionManager::combiType)
            nextCombi = std::max(nextCombi, function.GetId() + 1);
        if (kind == CFunctionManager::userdefinedType)
            nextUser = std::max(nextUser, function.GetId() + 1);
        rebuilt.AddFunction(function);
    }
    rebuilt.SetNextPredefinedId(m_nInputColumns + 1);
    rebuilt.SetNextCombiId(nextCombi);
    rebuilt.SetNextUserdefinedId(nextUser);
    m_functions = rebuilt;
}

void CColumnMapping::BuildDefaultComposition()
{
    m_handler.ClearAssignments();
    m_handler.DeleteColumns(true);
    m_handler.DeleteColumns(false);
    for (int i = 0; i < m_nInputColumns; ++i) {
        CString name;
        m_pRecords->GetName(i, name, 0);
        m_handler.AddInnerColumn(i + 1, i + 1, FunctionName(i), i);
        m_handler.AddOuterColumn(i, name);
        m_handler.AddAssignment(i, i + 1, "", false);
    }
}

std::vector<long> CColumnMapping::OuterFunctions()
{
    Functions();
    std::vector<long> result;
    for (int i = 0; i < m_handler.NumOuterColumns(); ++i) {
        const int outerId = m_handler.GetOuterColumnId(i);
        std::vector<CFunctionManager::CCombiPart> parts;
        for (int a = 0; a < m_handler.NumAssignments(); ++a) {
            int outer = -1, inner = -1;
            bool always = false;
            CQoString separator;
            if (!m_handler.GetAssignment(a, outer, inner, separator, always) || outer != outerId)
                continue;
            const long function = m_handler.GetInnerFunction(m_handler.FindInnerColumn(inner));
            if (function >= 0)
                parts.push_back(CFunctionManager::CCombiPart(function, separator.GetString(), always));
        }
        if (parts.empty()) {
            result.push_back(CFunctionManager::unusedFunction);
            continue;
        }
        if (parts.size() == 1 && parts[0].GetSeparator().IsEmpty() && !parts[0].GetAlwaysSeparate()) {
            result.push_back(parts[0].GetFunctionId());
            continue;
        }
        long found = -1;
        for (int k = 0; k < m_functions.GetNumFunctions() && found < 0; ++k) {
            CFunctionManager::CFunction function(CFunctionManager::unusedFunction, CString());
            if (m_functions.GetFunctionAt(k, function) && SameParts(function.GetCombination(), parts))
                found = function.GetId();
        }
        if (found < 0) {
            // Named as the combination dialog names one: each part's separator
            // and function.
            CString name;
            for (const CFunctionManager::CCombiPart& part : parts) {
                CFunctionManager::CFunction function(part.GetFunctionId(), CString());
                m_functions.GetFunction(part.GetFunctionId(), function);
                name += part.GetSeparator() + function.GetName();
            }
            CString unique = name;
            for (int n = 2; m_functions.ExistsFunction(unique); ++n)
                unique.Format("%s (%d)", (const char*)name, n);
            CFunctionManager::CFunction combination(m_functions.GetNextCombiId(true), unique);
            combination.SetCombination(parts);
            m_functions.AddFunction(combination);
            found = combination.GetId();
        }
        result.push_back(found);
    }
    return result;
}

void CColumnMapping::TakeComposition(const CMultiColumnHandler& edited, bool sameIds)
{
    // The choice made for each column, under the name the column carries in
    // the new composition: a renamed column keeps its place and tick.
    CColumnView::Selection keep;
    std::vector<int> ids;
    for (int i = 0, n = m_view.GetEntryCount(); i < n; ++i) {
        COutputFilterSource::CEntry entry;
        if (!m_view.GetEntry(i, entry))
            continue;
        keep.push_back(std::make_pair(entry.GetName(), entry.GetSelected()));
        ids.push_back(m_handler.GetOuterColumnId(entry.GetColumn()));
    }
    m_handler = edited;
    m_handler.SetWriteOutputSource(m_pRecords);
    if (sameIds) {
        CColumnView::Selection renamed;
        for (size_t i = 0; i < keep.size(); ++i) {
            const int index = m_handler.FindOuterColumn(ids[i]);
            if (index < 0)
                continue;   // the column was deleted
            CString name;
            m_view.GetSourceName(index, name, 0);
            renamed.push_back(std::make_pair(name, keep[i].second));
        }
        keep.swap(renamed);
    }
    m_bComposition = true;
    m_bDefined = true;
    m_bSelectionPending = false;
    m_view.SetComposed(m_pComposed);
    m_view.Sync(keep);
}

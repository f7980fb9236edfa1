#include "CMultiColumnInputFilter.h"

#include "CQoConfigFile.h"
#include "MultiColumnMapping.h"

CMultiColumnInputFilter::CMultiColumnInputFilter(std::shared_ptr<MultiColumnMapping> map)
    : m_map(std::move(map)), m_preparedVersion(m_map->version - 1)
{
    m_fileType = filterUnknown;
}

CMultiColumnInputFilter::~CMultiColumnInputFilter() = default;

void CMultiColumnInputFilter::Prepare()
{
    MultiColumnMapping const &map = *m_map;
    if (m_preparedVersion == map.version)
        return;
    m_preparedVersion = map.version;
    m_sources.assign(map.inner.size(), Source());
    int const outerCount = map.NumOuter();
    for (std::size_t i = 0; i < map.inner.size(); ++i) {
        MultiColumnMapping::Assignment const *a = map.AssignmentOf(map.inner[i].id);
        if (!a || a->outer >= outerCount)
            continue;
        std::vector<MultiColumnMapping::Assignment const *> const parts = map.PartsOf(a->outer);
        for (std::size_t p = 0; p < parts.size(); ++p)
            if (parts[p] == a)
                m_sources[i] = Source{a->outer, static_cast<int>(p)};
    }
    m_split.assign(outerCount, {});
    m_splitDone.assign(outerCount, false);
}

bool CMultiColumnInputFilter::Moved(bool ok)
{
    // A new row: the split values of the old one are gone.
    m_splitDone.assign(m_splitDone.size(), false);
    m_lCurrentRow = ok ? m_lCurrentRow : -1;
    return ok;
}

char const *CMultiColumnInputFilter::FileName() const
{
    return m_map->readFilter ? m_map->readFilter->FileName() : "";
}

void CMultiColumnInputFilter::ColName(int col, CQoString &name)
{
    MultiColumnMapping const &map = *m_map;
    if (col < 0 || col >= static_cast<int>(map.inner.size())) {
        name.Empty();
        return;
    }
    MultiColumnMapping::Inner const &column = map.inner[col];
    MultiColumnMapping::Assignment const *a = map.AssignmentOf(column.id);
    bool const assigned = a && a->outer < map.NumOuter();
    if (assigned && (map.alwaysUseOuterNames || column.name.IsEmpty())) {
        map.OuterName(a->outer, name);
        return;
    }
    if (!column.name.IsEmpty()) {
        name = column.name;
        return;
    }
    name.Format("Feld %d", col + 1);
}

void CMultiColumnInputFilter::SetColName(int col, CQoString const &name)
{
    MultiColumnMapping &map = *m_map;
    if (col < 0 || col >= static_cast<int>(map.inner.size()))
        return;
    map.inner[col].name = name;
    map.Changed();
    m_bModified = true;
}

int CMultiColumnInputFilter::NumCols() { return static_cast<int>(m_map->inner.size()); }

long CMultiColumnInputFilter::NumRows() { return CalculateRecordCount(); }

long CMultiColumnInputFilter::CalculateRecordCount()
{
    // The read filter keeps its own count; asking it each time follows its changes.
    return m_map->readFilter ? m_map->readFilter->NumRows() : 0;
}

bool CMultiColumnInputFilter::FirstRow()
{
    CQoInputFilter *in = m_map->readFilter;
    bool const ok = in && in->FirstRow();
    m_lCurrentRow = 0;
    return Moved(ok);
}

bool CMultiColumnInputFilter::NextRow()
{
    CQoInputFilter *in = m_map->readFilter;
    if (!in || m_lCurrentRow < 0)
        return false;
    bool const ok = in->NextRow();
    ++m_lCurrentRow;
    return Moved(ok);
}

bool CMultiColumnInputFilter::AbsoluteRow(long row)
{
    CQoInputFilter *in = m_map->readFilter;
    if (!in || row < 0)
        return false;
    bool const ok = in->AbsoluteRow(row);
    m_lCurrentRow = row;
    return Moved(ok);
}

void CMultiColumnInputFilter::Value(int col, CQoString &value)
{
    value.Empty();
    CQoInputFilter *in = m_map->readFilter;
    if (!in || m_lCurrentRow < 0)
        return;
    Prepare();
    if (col < 0 || col >= static_cast<int>(m_sources.size()))
        return;
    Source const &source = m_sources[col];
    if (source.outer < 0 || source.outer >= static_cast<int>(m_split.size()))
        return;
    if (!m_splitDone[source.outer]) {
        CQoString outerValue;
        in->Value(source.outer, outerValue);
        MultiColumnMapping::Split(outerValue.Str(), m_map->PartsOf(source.outer), m_split[source.outer]);
        m_splitDone[source.outer] = true;
    }
    std::vector<std::string> const &parts = m_split[source.outer];
    if (source.part < static_cast<int>(parts.size()))
        value = CQoString(parts[source.part]);
}

void CMultiColumnInputFilter::Init(CQoString const &name)
{
    if (m_map->readFilter)
        m_map->readFilter->Init(name);
    m_lCurrentRow = -1;
    m_lWrongInputs = 0;
    Moved(false);
}

int CMultiColumnInputFilter::InputFilterType() const { return filterUnknown; }

bool CMultiColumnInputFilter::StartDescription(CQoString &line)
{
    BeginDescription();
    MultiColumnMapping const &map = *m_map;
    for (int o = 0; o < map.NumOuter(); ++o) {
        std::vector<MultiColumnMapping::Assignment const *> const parts = map.PartsOf(o);
        if (parts.empty())
            continue;
        CQoString outerName, text;
        map.OuterName(o, outerName);
        for (MultiColumnMapping::Assignment const *part : parts) {
            int const i = map.FindInner(part->inner);
            if (i >= 0)
                text += part->separator + map.inner[i].name;
        }
        AddDescription(outerName + ": " + text);
    }
    return NextDescription(line);
}

void CMultiColumnInputFilter::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    m_map->WriteConfig(cfg, section);
}

void CMultiColumnInputFilter::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    if (m_map->ReadConfig(cfg, section))
        m_bModified = true;
}

bool CMultiColumnInputFilter::GetFirstRowHasNames() const
{
    return m_map->readFilter && m_map->readFilter->GetFirstRowHasNames();
}

void CMultiColumnInputFilter::LoadColumnNames()
{
    if (m_map->readFilter)
        m_map->readFilter->LoadColumnNames();
}

bool CMultiColumnInputFilter::CreateIndexFile()
{
    return m_map->readFilter && m_map->readFilter->CreateIndexFile();
}

void CMultiColumnInputFilter::NoCache(bool noCache)
{
    m_bNoCache = noCache;
    if (m_map->readFilter)
        m_map->readFilter->NoCache(noCache);
}

long long CMultiColumnInputFilter::getActPosInFile()
{
    return m_map->readFilter ? m_map->readFilter->getActPosInFile() : -1;
}

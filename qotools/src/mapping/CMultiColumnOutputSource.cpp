#include "CMultiColumnOutputSource.h"

#include "MultiColumnMapping.h"

CMultiColumnOutputSource::CMultiColumnOutputSource(std::shared_ptr<MultiColumnMapping> map)
    : m_map(std::move(map))
{
}

CMultiColumnOutputSource::~CMultiColumnOutputSource() = default;

int CMultiColumnOutputSource::GetNumColumns() { return m_map->NumOuter(); }

long CMultiColumnOutputSource::GetNumRows()
{
    return m_map->writeSource ? m_map->writeSource->GetNumRows() : 0;
}

void CMultiColumnOutputSource::GetValue(long row, int col, CQoString &value)
{
    MultiColumnMapping const &map = *m_map;
    int const id = map.OuterId(col);
    CQoOutputSource *source = map.writeSource;
    m_composed.clear();
    if (id >= 0 && source) {
        CQoString part;
        for (MultiColumnMapping::Assignment const *a : map.PartsOf(id)) {
            int const column = map.SourceColumnOf(map.FindInner(a->inner));
            part.Empty();
            if (column >= 0)
                source->GetValue(row, column, part);
            MultiColumnMapping::AppendPart(m_composed, *a, part.Str());
        }
    }
    value.Assign(m_composed.data(), m_composed.size());
}

void CMultiColumnOutputSource::GetColumnName(int col, CQoString &name)
{
    MultiColumnMapping const &map = *m_map;
    if (!map.OuterName(col, name) || !name.IsEmpty() || map.alwaysUseOuterNames)
        return;
    // A column without a name of its own is named after its parts.
    for (MultiColumnMapping::Assignment const *a : map.PartsOf(map.OuterId(col))) {
        int const i = map.FindInner(a->inner);
        if (i >= 0)
            name += a->separator + map.inner[i].name;
    }
}

int CMultiColumnOutputSource::GetDataLength(int col)
{
    MultiColumnMapping const &map = *m_map;
    int const id = map.OuterId(col);
    if (id < 0 || !map.writeSource)
        return -1;
    long total = 0;
    for (MultiColumnMapping::Assignment const *a : map.PartsOf(id)) {
        int const column = map.SourceColumnOf(map.FindInner(a->inner));
        int const length = column >= 0 ? map.writeSource->GetDataLength(column) : -1;
        if (length < 0)
            return -1;
        total += length + a->separator.GetLength();
        if (total > 0x7FFFFFFF)
            return -1;
    }
    return static_cast<int>(total);
}

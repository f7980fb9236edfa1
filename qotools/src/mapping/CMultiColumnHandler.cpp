#include "CMultiColumnHandler.h"

#include "CMultiColumnInputFilter.h"
#include "CMultiColumnOutputSource.h"
#include "CQoConfigFile.h"
#include "CQoInputFilter.h"
#include "CQoOutputSource.h"
#include "MultiColumnMapping.h"

#include <algorithm>

// ---------------------------------------------------------------------------
// MultiColumnMapping

int MultiColumnMapping::FindInner(int id) const
{
    for (std::size_t i = 0; i < inner.size(); ++i)
        if (inner[i].id == id)
            return static_cast<int>(i);
    return -1;
}

int MultiColumnMapping::FindOuter(int id) const
{
    if (Splits()) {
        if (id < 0)
            return -1;
        // Without a read filter the columns are not known yet: accept the id, a
        // column missing later simply delivers empty text.
        return (!readFilter || id < readFilter->NumCols()) ? id : -1;
    }
    for (std::size_t i = 0; i < outer.size(); ++i)
        if (outer[i].id == id)
            return static_cast<int>(i);
    return -1;
}

int MultiColumnMapping::NumOuter() const
{
    if (Splits())
        return readFilter ? std::max(0, readFilter->NumCols()) : 0;
    return static_cast<int>(outer.size());
}

int MultiColumnMapping::OuterId(int index) const
{
    if (index < 0 || index >= NumOuter())
        return -1;
    return Splits() ? index : outer[index].id;
}

MultiColumnMapping::Outer const *MultiColumnMapping::SplitOuterName(int index) const
{
    for (Outer const &o : outer)
        if (o.id == index)
            return &o;
    return nullptr;
}

bool MultiColumnMapping::OuterName(int index, CQoString &name) const
{
    if (index < 0 || index >= NumOuter()) {
        name.Empty();
        return false;
    }
    if (!Splits()) {
        name = outer[index].name;
        return true;
    }
    if (Outer const *given = SplitOuterName(index))
        name = given->name;
    else
        readFilter->ColName(index, name);
    return true;
}

std::vector<MultiColumnMapping::Assignment const *> MultiColumnMapping::PartsOf(int outerId) const
{
    std::vector<Assignment const *> parts;
    for (Assignment const &a : assignments)
        if (a.outer == outerId)
            parts.push_back(&a);
    return parts;
}

MultiColumnMapping::Assignment const *MultiColumnMapping::AssignmentOf(int innerId) const
{
    for (Assignment const &a : assignments)
        if (a.inner == innerId)
            return &a;
    return nullptr;
}

int MultiColumnMapping::SourceColumnOf(int index) const
{
    if (index < 0 || index >= static_cast<int>(inner.size()))
        return -1;
    return inner[index].sourceColumn >= 0 ? inner[index].sourceColumn : index;
}

bool MultiColumnMapping::AddInner(int id, long function, CQoString const &name, int sourceColumn)
{
    if (FindInner(id) >= 0)
        return false;
    inner.push_back({id, function, name, sourceColumn < 0 ? -1 : sourceColumn});
    Changed();
    return true;
}

bool MultiColumnMapping::AddOuter(int id, CQoString const &name)
{
    if (Splits() || FindOuter(id) >= 0)
        return false;
    outer.push_back({id, name});
    Changed();
    return true;
}

bool MultiColumnMapping::AddAssignment(int outerId, int innerId, CQoString const &separator, bool always)
{
    if (FindOuter(outerId) < 0 || FindInner(innerId) < 0)
        return false;
    if (Splits() && AssignmentOf(innerId))
        return false; // a split part's value comes from one place only
    assignments.push_back({outerId, innerId, separator, always});
    Changed();
    return true;
}

void MultiColumnMapping::Split(std::string_view text, std::vector<Assignment const *> const &parts,
                               std::vector<std::string> &values)
{
    std::size_t const count = parts.size();
    values.assign(count, std::string());
    if (count == 0)
        return;
    std::size_t pos = 0;
    std::string_view const lead = parts[0]->separator.Str();
    if (!lead.empty() && text.compare(0, lead.size(), lead) == 0)
        pos = lead.size();
    std::size_t current = 0;
    for (std::size_t m = 1; m < count; ++m) {
        std::string_view const separator = parts[m]->separator.Str();
        if (separator.empty())
            continue; // nothing marks where such a part starts: it stays empty
        std::size_t const at = text.find(separator, pos);
        if (at == std::string::npos)
            continue; // the part was empty, so its separator was left out
        values[current].assign(text, pos, at - pos);
        pos = at + separator.size();
        current = m;
    }
    values[current].assign(text, pos, std::string::npos);
}

void MultiColumnMapping::AppendPart(std::string &out, Assignment const &part, std::string_view value)
{
    if (!value.empty() || part.always)
        out += part.separator.Str();
    out += value;
}

// ---------------------------------------------------------------------------
// construction

CMultiColumnHandler::CMultiColumnHandler(int type)
    : m_map(std::make_shared<MultiColumnMapping>(type == composeOutput ? composeOutput : splitInput))
{
}

CMultiColumnHandler::~CMultiColumnHandler() = default;

CMultiColumnHandler::CMultiColumnHandler(CMultiColumnHandler const &other)
    : m_map(std::make_shared<MultiColumnMapping>(*other.m_map))
{
}

CMultiColumnHandler &CMultiColumnHandler::operator=(CMultiColumnHandler const &other)
{
    if (this != &other) {
        // Keep the shared object: filters made by this handler follow it.
        unsigned long const version = m_map->version;
        *m_map = *other.m_map;
        m_map->version = std::max(version, other.m_map->version) + 1;
    }
    return *this;
}

int CMultiColumnHandler::GetType() const { return m_map->type; }

void CMultiColumnHandler::SetAlwaysUseOuterNames(bool always)
{
    m_map->alwaysUseOuterNames = always;
    m_map->Changed();
}

bool CMultiColumnHandler::GetAlwaysUseOuterNames() const { return m_map->alwaysUseOuterNames; }

// ---------------------------------------------------------------------------
// sources

void CMultiColumnHandler::SetReadFilter(CQoInputFilter *filter)
{
    m_map->readFilter = filter;
    if (m_map->Splits())
        m_map->outer.clear(); // names given to the columns of another input
    m_map->Changed();
}

CQoInputFilter *CMultiColumnHandler::GetReadFilter() const { return m_map->readFilter; }

void CMultiColumnHandler::SetWriteOutputSource(CQoOutputSource *source)
{
    m_map->writeSource = source;
    m_map->Changed();
}

CQoOutputSource *CMultiColumnHandler::GetWriteOutputSource() const { return m_map->writeSource; }

CQoInputFilter *CMultiColumnHandler::CreateMultiColumnInputFilter()
{
    if (!m_map->Splits())
        return nullptr;
    return new CMultiColumnInputFilter(m_map);
}

CQoOutputSource *CMultiColumnHandler::CreateMultiColumnOutputSource()
{
    if (m_map->Splits())
        return nullptr;
    return new CMultiColumnOutputSource(m_map);
}

// ---------------------------------------------------------------------------
// inner columns

bool CMultiColumnHandler::AddInnerColumn(int id, long function, char const *name, int sourceColumn)
{
    return m_map->AddInner(id, function, CQoString(name), sourceColumn);
}

int CMultiColumnHandler::NumInnerColumns() const { return static_cast<int>(m_map->inner.size()); }

int CMultiColumnHandler::GetInnerColumnId(int index) const
{
    if (index < 0 || index >= NumInnerColumns())
        return -1;
    return m_map->inner[index].id;
}

int CMultiColumnHandler::FindInnerColumn(int id) const { return m_map->FindInner(id); }

bool CMultiColumnHandler::GetInnerColName(int index, CQoString &name, bool nameOnly) const
{
    if (index < 0 || index >= NumInnerColumns()) {
        name.Empty();
        return false;
    }
    MultiColumnMapping::Inner const &column = m_map->inner[index];
    if (nameOnly) {
        name = column.name;
        return true;
    }
    MultiColumnMapping::Assignment const *a = m_map->AssignmentOf(column.id);
    name = a ? a->separator + column.name : column.name;
    return true;
}

long CMultiColumnHandler::GetInnerFunction(int index) const
{
    if (index < 0 || index >= NumInnerColumns())
        return -1;
    return m_map->inner[index].function;
}

int CMultiColumnHandler::GetInnerSourceColumn(int index) const
{
    return m_map->SourceColumnOf(index);
}

// ---------------------------------------------------------------------------
// outer columns

bool CMultiColumnHandler::AddOuterColumn(int id, char const *name)
{
    return m_map->AddOuter(id, CQoString(name));
}

int CMultiColumnHandler::NumOuterColumns() const { return m_map->NumOuter(); }

int CMultiColumnHandler::GetNextFreeOuterColumnId() const
{
    if (m_map->Splits())
        return m_map->NumOuter();
    int next = 0;
    for (MultiColumnMapping::Outer const &o : m_map->outer)
        next = std::max(next, o.id + 1);
    return next;
}

int CMultiColumnHandler::GetOuterColumnId(int index) const { return m_map->OuterId(index); }

int CMultiColumnHandler::FindOuterColumn(int id) const { return m_map->FindOuter(id); }

bool CMultiColumnHandler::GetOuterColName(int index, CQoString &name) const
{
    return m_map->OuterName(index, name);
}

bool CMultiColumnHandler::GetInnerNamesOfOuterColumn(int index, CQoString &names) const
{
    names.Empty();
    int const id = m_map->OuterId(index);
    if (id < 0)
        return false;
    for (MultiColumnMapping::Assignment const *part : m_map->PartsOf(id)) {
        int const i = m_map->FindInner(part->inner);
        if (i >= 0)
            names += part->separator + m_map->inner[i].name;
    }
    return true;
}

int CMultiColumnHandler::GetOuterNameOfInnerColumn(int index, CQoString &name) const
{
    if (index < 0 || index >= NumInnerColumns())
        return -1;
    MultiColumnMapping::Assignment const *a = m_map->AssignmentOf(m_map->inner[index].id);
    if (!a)
        return -1;
    int const outer = m_map->Splits() ? a->outer : m_map->FindOuter(a->outer);
    if (outer < 0 || outer >= m_map->NumOuter())
        return -1;
    m_map->OuterName(outer, name);
    return outer;
}

// ---------------------------------------------------------------------------
// removing and renaming

namespace {

template <class Pred>
void RemoveAssignments(std::vector<MultiColumnMapping::Assignment> &list, Pred pred)
{
    list.erase(std::remove_if(list.begin(), list.end(), pred), list.end());
}

} // namespace

bool CMultiColumnHandler::DeleteColumn(bool inner, int index)
{
    MultiColumnMapping &map = *m_map;
    if (inner) {
        if (index < 0 || index >= NumInnerColumns())
            return false;
        int const id = map.inner[index].id;
        map.inner.erase(map.inner.begin() + index);
        RemoveAssignments(map.assignments, [id](auto const &a) { return a.inner == id; });
    } else {
        if (map.Splits() || index < 0 || index >= NumOuterColumns())
            return false;
        int const id = map.outer[index].id;
        map.outer.erase(map.outer.begin() + index);
        RemoveAssignments(map.assignments, [id](auto const &a) { return a.outer == id; });
    }
    map.Changed();
    return true;
}

void CMultiColumnHandler::DeleteColumns(bool inner)
{
    MultiColumnMapping &map = *m_map;
    if (inner) {
        map.inner.clear();
    } else {
        map.outer.clear();
    }
    // Every assignment has an inner and an outer column: none is left.
    map.assignments.clear();
    map.Changed();
}

bool CMultiColumnHandler::ChangeColumnName(bool outer, int index, CQoString const &name)
{
    MultiColumnMapping &map = *m_map;
    if (!outer) {
        if (index < 0 || index >= NumInnerColumns())
            return false;
        map.inner[index].name = name;
    } else {
        if (index < 0 || index >= NumOuterColumns())
            return false;
        if (!map.Splits()) {
            map.outer[index].name = name;
        } else {
            bool found = false;
            for (MultiColumnMapping::Outer &o : map.outer)
                if (o.id == index) {
                    o.name = name;
                    found = true;
                }
            if (!found)
                map.outer.push_back({index, name});
        }
    }
    map.Changed();
    return true;
}

// ---------------------------------------------------------------------------
// assignments

bool CMultiColumnHandler::AddAssignment(int outerId, int innerId, char const *separator, bool always)
{
    return m_map->AddAssignment(outerId, innerId, CQoString(separator), always);
}

void CMultiColumnHandler::ClearAssignments()
{
    m_map->assignments.clear();
    m_map->Changed();
}

int CMultiColumnHandler::NumAssignments() const { return static_cast<int>(m_map->assignments.size()); }

bool CMultiColumnHandler::GetAssignment(int index, int &outerId, int &innerId, CQoString &separator,
                                        bool &always) const
{
    if (index < 0 || index >= NumAssignments())
        return false;
    MultiColumnMapping::Assignment const &a = m_map->assignments[index];
    outerId = a.outer;
    innerId = a.inner;
    separator = a.separator;
    always = a.always;
    return true;
}

// ---------------------------------------------------------------------------
// settings
//
// Keys: MultiColumnType, AlwaysUseOuterNames; InnerColumns (count) with
// Inner<n>Id, Inner<n>Function, Inner<n>Name, Inner<n>Source; OuterColumns with
// Outer<n>Id, Outer<n>Name; Assignments with Assign<n>Outer, Assign<n>Inner,
// Assign<n>Separator, Assign<n>Always. Old numbered keys beyond the counts are
// removed on writing, so a shrinking mapping leaves no stale entries behind.

namespace {

CQoString Key(char const *prefix, int n, char const *suffix)
{
    CQoString key;
    key.Format("%s%d%s", prefix, n, suffix);
    return key;
}

void DeleteNumbered(CQoConfigFile &cfg, char const *section, char const *prefix, int from,
                    char const *const *suffixes)
{
    for (int n = from;; ++n) {
        bool any = false;
        for (char const *const *s = suffixes; *s; ++s)
            any = cfg.DeleteKey(section, Key(prefix, n, *s)) || any;
        if (!any)
            return;
    }
}

char const *const kInnerKeys[] = {"Id", "Function", "Name", "Source", nullptr};
char const *const kOuterKeys[] = {"Id", "Name", nullptr};
char const *const kAssignKeys[] = {"Outer", "Inner", "Separator", "Always", nullptr};

} // namespace

void MultiColumnMapping::WriteConfig(CQoConfigFile &cfg, char const *s) const
{
    MultiColumnMapping const &map = *this;
    cfg.SetValue(s, "MultiColumnType", map.type);
    cfg.SetValue(s, "AlwaysUseOuterNames", map.alwaysUseOuterNames ? 1 : 0);

    int const inner = static_cast<int>(map.inner.size());
    cfg.SetValue(s, "InnerColumns", inner);
    for (int n = 0; n < inner; ++n) {
        cfg.SetValue(s, Key("Inner", n, "Id"), map.inner[n].id);
        cfg.SetValue(s, Key("Inner", n, "Function"), map.inner[n].function);
        cfg.SetValue(s, Key("Inner", n, "Name"), map.inner[n].name);
        cfg.SetValue(s, Key("Inner", n, "Source"), map.inner[n].sourceColumn);
    }
    DeleteNumbered(cfg, s, "Inner", inner, kInnerKeys);

    int const outer = static_cast<int>(map.outer.size());
    cfg.SetValue(s, "OuterColumns", outer);
    for (int n = 0; n < outer; ++n) {
        cfg.SetValue(s, Key("Outer", n, "Id"), map.outer[n].id);
        cfg.SetValue(s, Key("Outer", n, "Name"), map.outer[n].name);
    }
    DeleteNumbered(cfg, s, "Outer", outer, kOuterKeys);

    int const assignments = static_cast<int>(map.assignments.size());
    cfg.SetValue(s, "Assignments", assignments);
    for (int n = 0; n < assignments; ++n) {
        cfg.SetValue(s, Key("Assign", n, "Outer"), map.assignments[n].outer);
        cfg.SetValue(s, Key("Assign", n, "Inner"), map.assignments[n].inner);
        cfg.SetValue(s, Key("Assign", n, "Separator"), map.assignments[n].separator);
        cfg.SetValue(s, Key("Assign", n, "Always"), map.assignments[n].always ? 1 : 0);
    }
    DeleteNumbered(cfg, s, "Assign", assignments, kAssignKeys);
}

bool MultiColumnMapping::ReadConfig(CQoConfigFile const &cfg, char const *s)
{
    int type = -1;
    if (!cfg.GetValue(s, "MultiColumnType", type) || type != this->type)
        return false;

    // Counts larger than the section's keys cannot be right: never loop beyond.
    int const keys = static_cast<int>(cfg.GetKeys(s).size());
    auto bounded = [keys](int n) { return std::min(std::max(n, 0), keys); };

    // Read into a copy so that the rules of the Add operations apply, then take
    // it over in one step.
    MultiColumnMapping read(type);
    read.readFilter = readFilter;
    read.writeSource = writeSource;
    int always = 0;
    cfg.GetValue(s, "AlwaysUseOuterNames", always);
    read.alwaysUseOuterNames = always != 0;

    int count = 0;
    cfg.GetValue(s, "InnerColumns", count);
    count = bounded(count);
    for (int n = 0; n < count; ++n) {
        int id = 0, source = -1;
        long function = 0;
        CQoString name;
        if (!cfg.GetValue(s, Key("Inner", n, "Id"), id))
            continue;
        cfg.GetValue(s, Key("Inner", n, "Function"), function);
        cfg.GetValue(s, Key("Inner", n, "Name"), name);
        cfg.GetValue(s, Key("Inner", n, "Source"), source);
        read.AddInner(id, function, name, source);
    }

    count = 0;
    cfg.GetValue(s, "OuterColumns", count);
    count = bounded(count);
    for (int n = 0; n < count; ++n) {
        int id = 0;
        CQoString name;
        if (!cfg.GetValue(s, Key("Outer", n, "Id"), id))
            continue;
        cfg.GetValue(s, Key("Outer", n, "Name"), name);
        if (read.Splits()) {
            if (id >= 0 && !read.SplitOuterName(id))
                read.outer.push_back({id, name});
        } else {
            read.AddOuter(id, name);
        }
    }

    count = 0;
    cfg.GetValue(s, "Assignments", count);
    count = bounded(count);
    for (int n = 0; n < count; ++n) {
        int outerId = 0, innerId = 0, flag = 0;
        CQoString separator;
        if (!cfg.GetValue(s, Key("Assign", n, "Outer"), outerId) ||
            !cfg.GetValue(s, Key("Assign", n, "Inner"), innerId))
            continue;
        cfg.GetValue(s, Key("Assign", n, "Separator"), separator);
        cfg.GetValue(s, Key("Assign", n, "Always"), flag);
        read.AddAssignment(outerId, innerId, separator, flag != 0);
    }

    read.version = version + 1;
    *this = read;
    return true;
}

void CMultiColumnHandler::WriteConfig(CQoConfigFile &cfg, CQoString const &section) const
{
    m_map->WriteConfig(cfg, section);
}

bool CMultiColumnHandler::ReadConfig(CQoConfigFile const &cfg, CQoString const &section)
{
    return m_map->ReadConfig(cfg, section);
}

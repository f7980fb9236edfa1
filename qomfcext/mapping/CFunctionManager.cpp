#include "CFunctionManager.h"

const long CFunctionManager::unusedFunction = 0;

namespace {

CString Lowered(CString name)
{
    name.MakeLower();
    return name;
}

} // namespace

CFunctionManager::CFunctionManager()
    : m_lMinPredefinedId(0),
      m_lMaxPredefinedId(9999),
      m_lNextPredefinedId(0),
      m_lMinUserdefinedId(10000),
      m_lMaxUserdefinedId(19999),
      m_lNextUserdefinedId(10000),
      m_lMinCombiId(20000),
      m_lMaxCombiId(29999),
      m_lNextCombiId(20000),
      m_lMinUnusedFileId(30000)
{
}

CFunctionManager::~CFunctionManager() {}

int CFunctionManager::GetNumFunctions() const
{
    return static_cast<int>(m_functions.size());
}

bool CFunctionManager::GetFunctionAt(int index, CFunction& function) const
{
    if (index < 0 || index >= static_cast<int>(m_list.size()))
        return false;
    function = m_list[index];
    return true;
}

bool CFunctionManager::GetFunction(long id, CFunction& function) const
{
    std::map<long, CFunction>::const_iterator it = m_functions.find(id);
    if (it == m_functions.end())
        return false;
    function = it->second;
    return true;
}

void CFunctionManager::AddFunction(CFunction& function)
{
    std::map<CString, CFunction>::iterator deleted = m_deleted.find(Lowered(function.GetName()));
    if (deleted != m_deleted.end()) {
        long oldId = deleted->second.GetId();
        // The old id comes back only for a function of the same kind, and
        // never at the cost of another function that holds it by now: taking
        // it would silently replace that one.
        if (Id2Type(oldId) == Id2Type(function.GetId())) {
            std::map<long, CFunction>::const_iterator holder = m_functions.find(oldId);
            if (holder == m_functions.end() || oldId == function.GetId())
                function.SetId(oldId);
        }
        m_deleted.erase(deleted);
    }
    std::map<long, CFunction>::iterator it = m_functions.find(function.GetId());
    if (it != m_functions.end())
        it->second = function;
    else
        m_functions.insert(std::make_pair(function.GetId(), function));
    RebuildList();
}

void CFunctionManager::DeleteFunction(long id)
{
    std::map<long, CFunction>::iterator it = m_functions.find(id);
    if (it == m_functions.end())
        return;
    CFunction removed = it->second;
    m_functions.erase(it);
    CString key = Lowered(removed.GetName());
    std::map<CString, CFunction>::iterator old = m_deleted.find(key);
    if (old != m_deleted.end())
        old->second = removed;
    else
        m_deleted.insert(std::make_pair(key, removed));
    RebuildList();
}

void CFunctionManager::ClearFunctions()
{
    m_functions.clear();
    RebuildList();
}

bool CFunctionManager::ExistsFunction(const CString& name) const
{
    for (const CFunction& f : m_list) {
        if (f.GetName().CollateNoCase(name) == 0)
            return true;
    }
    return false;
}

bool CFunctionManager::ExistsCombiWithId(long id) const
{
    for (const CFunction& f : m_list) {
        std::vector<CCombiPart> parts = f.GetCombination();
        for (const CCombiPart& part : parts) {
            if (part.GetFunctionId() == id)
                return true;
        }
    }
    return false;
}

bool CFunctionManager::IsDeleted(CString name) const
{
    name.MakeLower();
    return m_deleted.find(name) != m_deleted.end();
}

CFunctionManager::type CFunctionManager::Id2Type(long id) const
{
    if (id >= m_lMinPredefinedId && id <= m_lMaxPredefinedId)
        return predefinedType;
    if (id >= m_lMinUserdefinedId && id <= m_lMaxUserdefinedId)
        return userdefinedType;
    if (id >= m_lMinCombiId && id <= m_lMaxCombiId)
        return combiType;
    return id < m_lMinUnusedFileId ? noType : fileType;
}

long CFunctionManager::GetNextPredefinedId()
{
    return m_lNextPredefinedId++;
}

long CFunctionManager::GetNextUserdefinedId(bool take)
{
    return take ? m_lNextUserdefinedId++ : m_lNextUserdefinedId;
}

long CFunctionManager::GetNextCombiId(bool take)
{
    return take ? m_lNextCombiId++ : m_lNextCombiId;
}

void CFunctionManager::RebuildList()
{
    m_list.clear();
    m_list.reserve(m_functions.size());
    for (const std::pair<const long, CFunction>& entry : m_functions)
        m_list.push_back(entry.second);
}

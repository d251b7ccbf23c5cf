#include "Services/Time/VSourceMap.h"

#include "Services/Time/VTimeSource.h"

namespace Services
{

using namespace OrvanePluginInterface;

VSourceMap::VSourceMap(std::shared_ptr<TQL::IChangeSignal> i_pChanged, ThreadCheckPointer i_pCheck)
    : m_pChanged(std::move(i_pChanged)), m_pCheck(std::move(i_pCheck))
{
}

std::set<std::string> VSourceMap::GetNames() const
{
    CheckThread(m_pCheck, "ISourceMap::GetNames");
    std::set<std::string> names;
    for (const auto& [name, pSource] : Copy())
        names.insert(name);
    return names;
}

std::shared_ptr<ITimeSource> VSourceMap::Find(std::string_view i_Name) const
{
    CheckThread(m_pCheck, "ISourceMap::Find");
    return FindSource(i_Name);
}

void VSourceMap::ForEach(
    const std::function<void(const std::string&, const std::shared_ptr<ITimeSource>&)>& i_rVisit) const
{
    CheckThread(m_pCheck, "ISourceMap::ForEach");
    for (const auto& [name, pSource] : Copy())
        i_rVisit(name, pSource);
}

std::shared_ptr<TQL::IChangeSignal> VSourceMap::Changed() const
{
    CheckThread(m_pCheck, "ISourceMap::Changed");
    return m_pChanged;
}

void VSourceMap::Insert(const std::string& i_rName, std::shared_ptr<VTimeSource> i_pSource)
{
    const std::lock_guard lock(m_Mutex);
    m_Sources[i_rName].swap(i_pSource); // one that stood there goes after the mutex, with whoever listens to it
}

bool VSourceMap::Erase(std::string_view i_Name)
{
    Sources::node_type gone; // destroyed after the mutex: what listens to the source may come back here
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Sources.find(i_Name);
    if (found == m_Sources.end())
        return false;
    gone = m_Sources.extract(found);
    return true;
}

std::shared_ptr<VTimeSource> VSourceMap::FindSource(std::string_view i_Name) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Sources.find(i_Name);
    return found == m_Sources.end() ? nullptr : found->second;
}

VSourceMap::Sources VSourceMap::Copy() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Sources;
}

} // namespace Services

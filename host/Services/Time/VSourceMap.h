#pragma once

#include "OrvanePluginInterface/ITimeController.h"
#include "Services/Common/VThreadCheck.h"

#include <map>
#include <memory>
#include <mutex>

namespace Services
{

class VTimeSource;

/// The time sources of the host by name. Owned by the time controller, which changes it and raises the signal. The
/// reading operations are the interface's and belong to the UI thread.
class VSourceMap : public OrvanePluginInterface::ISourceMap
{
public:
    explicit VSourceMap(std::shared_ptr<TQL::IChangeSignal> i_pChanged, ThreadCheckPointer i_pCheck = nullptr);

    std::set<std::string> GetNames() const override;
    std::shared_ptr<OrvanePluginInterface::ITimeSource> Find(std::string_view i_Name) const override;
    void
    ForEach(const std::function<void(const std::string&, const std::shared_ptr<OrvanePluginInterface::ITimeSource>&)>&
                i_rVisit) const override;
    std::shared_ptr<TQL::IChangeSignal> Changed() const override;

    void Insert(const std::string& i_rName, std::shared_ptr<VTimeSource> i_pSource); ///< replaces one of that name
    bool Erase(std::string_view i_Name);
    std::shared_ptr<VTimeSource> FindSource(std::string_view i_Name) const;

private:
    using Sources = std::map<std::string, std::shared_ptr<VTimeSource>, std::less<>>;
    Sources Copy() const;

    const std::shared_ptr<TQL::IChangeSignal> m_pChanged;
    const ThreadCheckPointer m_pCheck;
    mutable std::mutex m_Mutex;
    Sources m_Sources; // guarded by m_Mutex
};

} // namespace Services

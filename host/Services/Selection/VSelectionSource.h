#pragma once

#include "ChannelSystem/ISelectionSource.h"
#include "NotificationSystem/VMultiCallbackPostal.h"
#include "Services/Common/VThreadCheck.h"

#include <functional>
#include <memory>
#include <vector>

namespace Services
{

/// What is selected in the host. Items are kept in the order in which they were selected, each once. Owned by the host
/// services. UI thread; Changed is raised inside Set and Add, after the selection has changed.
class VSelectionSource : public TQL::ISelectionSource
{
public:
    using RootSegmentFunction = std::function<std::uint64_t(std::uint64_t)>;
    using DevicesFunction = std::function<std::vector<TQL::SelectionItem>()>;

    explicit VSelectionSource(ThreadCheckPointer i_pCheck = nullptr);

    std::shared_ptr<const TQL::ISelection> GetSelection() const override;
    const std::vector<TQL::SelectionItem>& Items() const { return m_Items; } ///< of all kinds, as they were selected
    void Set(const std::vector<TQL::SelectionItem>& i_rItems) override;      ///< an equal selection raises nothing
    void Add(const std::vector<TQL::SelectionItem>& i_rItems) override;
    std::shared_ptr<TQL::IMultiCallbackPostal<void(bool)>> Changed() const override;
    std::uint64_t RootSegment(std::uint64_t i_Subject) const override;                 ///< 0 until SetRootSegments
    TQL::IResult GetDevices(std::vector<TQL::SelectionItem>& o_rItems) const override; ///< none until SetDevices

    void SetRootSegments(RootSegmentFunction i_Function);
    void SetDevices(DevicesFunction i_Function);
    /// Asks subscribers to look again though the selection is the same.
    void RaiseForced();

private:
    void Replace(std::vector<TQL::SelectionItem> i_Items);

    const ThreadCheckPointer m_pCheck;
    const std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void(bool)>> m_pChanged;
    std::vector<TQL::SelectionItem> m_Items;
    RootSegmentFunction m_RootSegment;
    DevicesFunction m_Devices;
};

} // namespace Services

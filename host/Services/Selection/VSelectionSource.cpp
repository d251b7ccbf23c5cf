#include "Services/Selection/VSelectionSource.h"

#include <algorithm>
#include <iterator>
#include <set>
#include <string_view>
#include <tuple>

namespace Services
{
namespace
{

class VSelection : public TQL::ISelection
{
public:
    explicit VSelection(std::vector<TQL::SelectionItem> i_Items) : m_Items(std::move(i_Items)) {}

    std::vector<TQL::SelectionItem> Items(TQL::ESelectionKind i_Kind) const override
    {
        std::vector<TQL::SelectionItem> items;
        std::ranges::copy_if(m_Items, std::back_inserter(items),
                             [i_Kind](const TQL::SelectionItem& i_rItem) { return i_rItem.Kind == i_Kind; });
        return items;
    }

private:
    const std::vector<TQL::SelectionItem> m_Items;
};

/// Adds each item that is not there yet, in order. A selection may hold thousands of things.
void Append(std::vector<TQL::SelectionItem>& o_rItems, const std::vector<TQL::SelectionItem>& i_rAdded)
{
    using Key = std::tuple<TQL::ESelectionKind, std::uint64_t, std::uint64_t, std::string_view>;
    const auto keyOf = [](const TQL::SelectionItem& i_rItem)
    {
        return Key(i_rItem.Kind, i_rItem.First, i_rItem.Second, i_rItem.Text);
    };
    o_rItems.reserve(o_rItems.size() + i_rAdded.size()); // the keys point into the items
    std::set<Key> present;
    for (const TQL::SelectionItem& rItem : o_rItems)
        present.insert(keyOf(rItem));
    for (const TQL::SelectionItem& rItem : i_rAdded)
        if (!present.contains(keyOf(rItem)))
            present.insert(keyOf(o_rItems.emplace_back(rItem)));
}

} // namespace

VSelectionSource::VSelectionSource(ThreadCheckPointer i_pCheck)
    : m_pCheck(std::move(i_pCheck))
    , m_pChanged(std::make_shared<NotificationSystem::VMultiCallbackPostal<void(bool)>>())
{
}

std::shared_ptr<const TQL::ISelection> VSelectionSource::GetSelection() const
{
    CheckThread(m_pCheck, "ISelectionSource::GetSelection");
    return std::make_shared<const VSelection>(m_Items);
}

void VSelectionSource::Set(const std::vector<TQL::SelectionItem>& i_rItems)
{
    CheckThread(m_pCheck, "ISelectionSource::Set");
    std::vector<TQL::SelectionItem> items;
    Append(items, i_rItems);
    Replace(std::move(items));
}

void VSelectionSource::Add(const std::vector<TQL::SelectionItem>& i_rItems)
{
    CheckThread(m_pCheck, "ISelectionSource::Add");
    std::vector<TQL::SelectionItem> items = m_Items;
    Append(items, i_rItems);
    Replace(std::move(items));
}

std::shared_ptr<TQL::IMultiCallbackPostal<void(bool)>> VSelectionSource::Changed() const
{
    CheckThread(m_pCheck, "ISelectionSource::Changed");
    return m_pChanged;
}

std::uint64_t VSelectionSource::RootSegment(std::uint64_t i_Subject) const
{
    CheckThread(m_pCheck, "ISelectionSource::RootSegment");
    return m_RootSegment ? m_RootSegment(i_Subject) : 0;
}

TQL::IResult VSelectionSource::GetDevices(std::vector<TQL::SelectionItem>& o_rItems) const
{
    CheckThread(m_pCheck, "ISelectionSource::GetDevices");
    o_rItems = m_Devices ? m_Devices() : std::vector<TQL::SelectionItem>{};
    return TQL::Result::Ok;
}

void VSelectionSource::SetRootSegments(RootSegmentFunction i_Function)
{
    m_RootSegment = std::move(i_Function);
}

void VSelectionSource::SetDevices(DevicesFunction i_Function)
{
    m_Devices = std::move(i_Function);
}

void VSelectionSource::RaiseForced()
{
    m_pChanged->Invoke(true);
}

void VSelectionSource::Replace(std::vector<TQL::SelectionItem> i_Items)
{
    if (m_Items == i_Items)
        return;
    m_Items = std::move(i_Items);
    m_pChanged->Invoke(false);
}

} // namespace Services

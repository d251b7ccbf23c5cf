#include "ChannelSystemSelection/VChannelSelectionManager.h"

#include <gtest/gtest.h>

#include <sstream>

namespace
{

using TQL::ESelectionKind;
using TQL::SelectionItem;

class FakeSelection : public TQL::ISelection
{
public:
    explicit FakeSelection(std::vector<SelectionItem> i_Items) : m_Items(std::move(i_Items)) {}
    std::vector<SelectionItem> Items(ESelectionKind i_Kind) const override
    {
        std::vector<SelectionItem> found;
        for (const SelectionItem& rItem : m_Items)
            if (rItem.Kind == i_Kind)
                found.push_back(rItem);
        return found;
    }

private:
    std::vector<SelectionItem> m_Items;
};

class FakeSelectionSource : public TQL::ISelectionSource
{
public:
    std::shared_ptr<const TQL::ISelection> GetSelection() const override
    {
        return std::make_shared<FakeSelection>(m_Items);
    }
    void Set(const std::vector<SelectionItem>& i_rItems) override { m_Items = i_rItems; }
    void Add(const std::vector<SelectionItem>& i_rItems) override
    {
        m_Items.insert(m_Items.end(), i_rItems.begin(), i_rItems.end());
    }
    std::shared_ptr<TQL::IMultiCallbackPostal<void(bool)>> Changed() const override { return m_pChanged; }
    std::uint64_t RootSegment(std::uint64_t i_Subject) const override { return 100 + i_Subject; }
    TQL::IResult GetDevices(std::vector<SelectionItem>&) const override { return TQL::Result::Ok; }

    std::vector<SelectionItem> m_Items;
    std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void(bool)>> m_pChanged =
        std::make_shared<NotificationSystem::VMultiCallbackPostal<void(bool)>>();
};

struct Fixture
{
    std::shared_ptr<FakeSelectionSource> pSource = std::make_shared<FakeSelectionSource>();
    std::shared_ptr<ChannelSystemSelection::VChannelSelectionManager> pManager =
        TQL::MakeShared<ChannelSystemSelection::VChannelSelectionManager>(pSource);

    std::string Ids(const std::string& i_rType) const
    {
        std::vector<TQL::IChannelInstanceId> ids;
        pManager->GetSelectedChannelIds("Live", i_rType, ids);
        std::ostringstream text;
        for (const auto& rId : ids)
            text << rId.DataContextName << '/' << rId.TypeName << '/' << rId.First << '/' << rId.Second << '/'
                 << rId.Text << ' ';
        return text.str();
    }
};

TEST(SelectionManager, NamesTheChannelsOfEveryKind)
{
    const Fixture fixture;
    struct Row
    {
        ESelectionKind Kind;
        std::vector<SelectionItem> Selection;
        const char* Expected;
    };
    const Row rows[] = {
        {ESelectionKind::None, {{ESelectionKind::Label, 1, 2, {}}}, ""},
        {ESelectionKind::Global, {}, "Live/T/0/0/ "},
        {ESelectionKind::Label, {{ESelectionKind::Label, 1, 2, "x"}}, "Live/T/1/2/ "},
        {ESelectionKind::Subject, {{ESelectionKind::Subject, 3, 9, {}}}, "Live/T/3/0/ "},
        {ESelectionKind::CentroidTrack, {{ESelectionKind::CentroidTrack, 1, 2, "c"}}, "Live/T/1/2/c "},
        {ESelectionKind::Segment, {{ESelectionKind::Subject, 3, 0, {}}}, "Live/T/3/103/ "},
        {ESelectionKind::SegmentSolve,
         {{ESelectionKind::SegmentSolve, 3, 103, {}}, {ESelectionKind::Subject, 3, 0, {}}},
         "Live/T/3/103/ "},
        {ESelectionKind::Monitor, {{ESelectionKind::Monitor, 7, 1, {}}}, "/T/7/0/ "},
        {ESelectionKind::ModelOutput, {{ESelectionKind::ModelOutput, 4, 1, "knee"}}, "Live/T/4/0/knee "},
        {ESelectionKind::Device, {{ESelectionKind::Device, 1, 0, {}}}, ""},
        {ESelectionKind::Joint, {{ESelectionKind::Joint, 1, 0, {}}}, ""},
    };
    for (const Row& rRow : rows)
    {
        fixture.pManager->RegisterChannelType("T", rRow.Kind, 0);
        fixture.pSource->m_Items = rRow.Selection;
        EXPECT_EQ(fixture.Ids("T"), rRow.Expected) << static_cast<int>(rRow.Kind);
    }
    EXPECT_EQ(fixture.Ids("Unknown"), "");
}

TEST(SelectionManager, CountsAndMasksTypes)
{
    const Fixture fixture;
    fixture.pManager->RegisterChannelType("SubjectSegmentPose", ESelectionKind::Segment, 0);
    fixture.pManager->RegisterChannelType("Internal", ESelectionKind::Label, 2);
    fixture.pManager->RegisterChannelType("Labelled Reconstructions", ESelectionKind::Label, 0);
    fixture.pManager->RegisterChannelType("Clock", ESelectionKind::Global, 4);
    fixture.pSource->m_Items = {
        {ESelectionKind::Label, 0, 1, {}}, {ESelectionKind::Label, 0, 2, {}}, {ESelectionKind::Subject, 0, 0, {}}};

    std::map<std::string, std::uint64_t> counts;
    fixture.pManager->GetSelectedTypeCounts(2, counts);
    EXPECT_EQ(counts,
              (std::map<std::string, std::uint64_t>{{"Labelled Reconstructions", 2}, {"SubjectSegmentPose", 1}}));

    std::set<std::string> types;
    fixture.pManager->GetSelectedChannelTypes(0, types);
    EXPECT_EQ(types, (std::set<std::string>{"Internal", "Labelled Reconstructions", "SubjectSegmentPose"}));

    // With a type of subjects a selected one brings the poses of its root segment, but for those under the mask.
    fixture.pManager->RegisterChannelType("Subject", ESelectionKind::Subject, 0);
    fixture.pManager->RegisterChannelType("SubjectSegmentPoseSolve", ESelectionKind::Segment, 2);
    fixture.pManager->GetSelectedChannelTypes(2, types);
    EXPECT_EQ(types, (std::set<std::string>{"Labelled Reconstructions", "Subject", "SubjectSegmentPose",
                                            "SubjectSegmentPoseRetarget"}));

    fixture.pManager->GetGlobalChannelTypes(0, types);
    EXPECT_EQ(types, std::set<std::string>{"Clock"});
    fixture.pManager->GetGlobalChannelTypes(4, types);
    EXPECT_TRUE(types.empty());
}

TEST(SelectionManager, ForwardsNoticesUntilItDies)
{
    Fixture fixture;
    int plain = 0;
    int forced = 0;
    fixture.pManager->SelectionChanged()->AddDirect([&](bool i_bForce) { ++(i_bForce ? forced : plain); });
    fixture.pSource->m_pChanged->Invoke(false);
    fixture.pSource->m_pChanged->Invoke(true);
    EXPECT_EQ(plain, 1);
    EXPECT_EQ(forced, 1);
    fixture.pManager.reset();
    EXPECT_EQ(fixture.pSource->m_pChanged->Count(), 0u);
}

} // namespace

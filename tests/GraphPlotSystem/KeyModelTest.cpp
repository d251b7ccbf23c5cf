#include "GraphPlotSystem/FakeHost.h"
#include "GraphPlotSystem/SubplotFixture.h"
#include "GraphPlotSystem/Subplots/VKeyModel.h"

#include <QtGui/QColor>

using namespace GraphPlotUI;
using namespace TQL::KeyModelRoles;

namespace
{

class KeyModel : public SubplotFixture
{
protected:
    using ChannelPointer = std::shared_ptr<FakeHost::Channel>;

    static std::shared_ptr<FakeHost::View> MakeOutput(std::size_t i_Components)
    {
        TQL::ComponentDescription description;
        description.Groups.resize(i_Components);
        return std::make_shared<FakeHost::Output>(std::move(description));
    }
    static ChannelPointer Make(const char* i_pType, const char* i_pName, std::size_t i_Components)
    {
        auto pChannel = std::make_shared<FakeHost::Channel>(FakeTexts::Id(i_pType, i_pName));
        pChannel->SetOutput(MakeOutput(i_Components));
        return pChannel;
    }
    void Select(const std::vector<ChannelPointer>& i_rChannels)
    {
        (void)Channels.SetChannels({i_rChannels.begin(), i_rChannels.end()});
        pUi->RunAll();
    }
    /// "name component/index", with "F" and "L" for the first and last that is on, "*" for a pin, "?" for no data.
    std::string Picture() const
    {
        QString text;
        for (int row = 0; row < Model.rowCount(); ++row)
        {
            const QModelIndex index = Model.index(row);
            const auto flag = [&](int i_Role, const char* i_pSign)
            {
                return QLatin1String(index.data(i_Role).toBool() ? i_pSign : "");
            };
            text += index.data(KeyChannelName).toString() + ' ' + index.data(KeyComponentName).toString() + '/' +
                    index.data(KeyComponentIndex).toString() + flag(KeyFirstEnabledComponent, "F") +
                    flag(KeyLastEnabledComponent, "L") + flag(KeyPinned, "*") + flag(KeyMissingData, "?") + "; ";
        }
        return text.toStdString();
    }

    const ChannelPointer pLasi = Make("Marker", "LASI", 3);
    const ChannelPointer pRasi = Make("Marker", "RASI", 3);
    const ChannelPointer pEmg = Make("Emg", "Emg", 1);
    VKeyModel Model{pUi, pTexts, pControls, pStorage, &Channels, nullptr};
    ModelJournal Journal{Model};
};

TEST_F(KeyModel, HasARowForEachComponentThatIsOn)
{
    EXPECT_EQ(Picture(), "");
    Select({pEmg});
    EXPECT_EQ(Picture(), "Emg /0FL; ");
    EXPECT_EQ(Journal.Take(), "insert 0; change 0; ");
    Select({pRasi, pEmg});
    EXPECT_EQ(Picture(), "Emg /0FL; RASI TX/0F; RASI TY/1; RASI TZ/2L; ");
    EXPECT_EQ(Journal.Take(), "change 0 263 267; insert 1..3; change 0..3; ");
    Select({pLasi, pRasi, pEmg});
    EXPECT_EQ(Picture(), "Emg /0FL; LASI TX/0F; LASI TY/1; LASI TZ/2L; RASI TX/0F; RASI TY/1; RASI TZ/2L; ");
    Journal.Take();
    ASSERT_TRUE(pControls->SetComponentEnabled(7, 0, false).IsSuccess());
    pUi->RunAll();
    EXPECT_EQ(Picture(), "Emg /0FL; LASI TY/1F; LASI TZ/2L; RASI TY/1F; RASI TZ/2L; ");
    EXPECT_EQ(Journal.Take(), "change 1..4; remove 5..6; change 0..4; ");
    EXPECT_EQ(Model.index(1).data(KeyEnabledComponentCount).toInt(), 2);
    EXPECT_EQ(Model.index(1).data(KeyEnabledComponents).toList(), QVariantList{0}) << "those that are off";
    EXPECT_EQ(Model.index(1).data(KeyTraceId).value<TQL::ITraceId>(), TQL::ITraceId(pLasi->Id, 1));
    EXPECT_EQ(Model.index(1).data(KeyChannelSubTypeName).toString(), "Position");
    Select({pRasi});
    EXPECT_EQ(Picture(), "RASI TY/1F; RASI TZ/2L; ");
    Select({});
    EXPECT_EQ(Model.rowCount(), 0);
}

TEST_F(KeyModel, FollowsDataThatComeAndGo)
{
    Select({pLasi, pEmg});
    ASSERT_TRUE(Model.setData(Model.index(0), true, KeyPinned));
    pEmg->SetOutput(nullptr);
    pLasi->SetOutput(nullptr);
    Select({pLasi, pEmg});
    EXPECT_EQ(Picture(), "Emg /0FL*?; LASI TX/0F?; ") << "one row for a channel without data";
    pLasi->SetOutput(MakeOutput(3));
    Select({pLasi});
    EXPECT_EQ(Picture(), "Emg /0FL*?; LASI TX/0F; LASI TY/1; LASI TZ/2L; ");
}

TEST_F(KeyModel, FollowsPinsAndColours)
{
    Select({pLasi, pRasi, pEmg});
    Journal.Take();
    ASSERT_TRUE(Model.setData(Model.index(2), true, KeyPinned));
    EXPECT_EQ(Journal.Take(), "change 1..3 263 267; ") << "all rows of the channel, and no other";
    EXPECT_EQ(Picture().substr(0, 40), "Emg /0FL; LASI TX/0F*; LASI TY/1*; LASI ");
    Channels.setAllPinned(false);
    EXPECT_EQ(Picture().find('*'), std::string::npos);
    Journal.Take();
    pStorage->SetPalette(GetTracePalette(0));
    TQL::IResult result;
    pStorage->AssignChannelColour(result, TQL::ITraceId(pLasi->Id, 0), 3);
    pUi->RunAll();
    EXPECT_EQ(Journal.Take(), "change 0..6 258; ");
    const Colour4f& rFirst = GetTracePalette(0)[0];
    EXPECT_EQ(Model.index(3).data(KeyColour).value<QColor>(), QColor::fromRgbF(rFirst[0], rFirst[1], rFirst[2]));
}

TEST_F(KeyModel, WritesPinsAndSwitchesOnly)
{
    Select({pLasi, pEmg});
    EXPECT_FALSE(Model.setData(Model.index(0), "name", KeyChannelName));
    EXPECT_FALSE(Model.setData(Model.index(9), true, KeyPinned));
    EXPECT_TRUE(Model.setData(Model.index(1), QVariantList({0, 2}), KeyEnabledComponents));
    pUi->RunAll();
    EXPECT_EQ(Picture(), "Emg /0FL; LASI TY/1FL; ");
    EXPECT_TRUE(Model.setData(Model.index(1), QVariantList({1}), KeyEnabledComponents));
    pUi->RunAll();
    EXPECT_EQ(Picture(), "Emg /0FL; LASI TX/0F; LASI TZ/2L; ");
}

TEST_F(KeyModel, FollowsTexts)
{
    Select({pLasi});
    Journal.Take();
    pTexts->Types["Marker"].Components[1].first = "Y";
    pTexts->NotifyTextChanged();
    pUi->RunAll();
    EXPECT_EQ(Picture(), "LASI TX/0F; LASI Y/1; LASI TZ/2L; ");
    EXPECT_EQ(Journal.Take(), "change 0..2 0 256 259 260 261 262 265; ");
    pTexts->Types["Marker"].SubType = 8;
    ASSERT_TRUE(pControls->SetComponentEnabled(8, 0, false).IsSuccess());
    pUi->RunAll();
    EXPECT_EQ(Picture(), "LASI Y/1F; LASI TZ/2L; ") << "another subtype, with other switches";
}

TEST_F(KeyModel, OutlivesTheListOfChannels)
{
    auto pChannels = std::make_unique<VActiveChannelModel>(pUi, pTexts, nullptr, nullptr);
    VKeyModel model(pUi, pTexts, pControls, pStorage, pChannels.get(), nullptr);
    (void)pChannels->SetChannels({pLasi});
    pUi->RunAll();
    ASSERT_EQ(model.rowCount(), 3);
    pChannels.reset();
    EXPECT_TRUE(model.index(0).data(KeyMissingData).toBool());
    EXPECT_FALSE(model.setData(model.index(0), true, KeyPinned));
    ASSERT_TRUE(pControls->SetComponentEnabled(7, 0, false).IsSuccess());
    pUi->RunAll();
}

} // namespace

#include "Channels/Blocks/VCacheChannel.h"
#include "Channels/Blocks/VSampleBlock.h"
#include "Channels/Contexts/VLiveContext.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "Reference.h"
#include "support/LogGuard.h"

#include <array>
#include <functional>
#include <map>
#include <sstream>

namespace ChannelsTest
{

namespace
{

using Channels::VChannelService;
using Channels::VLiveContext;
using ChannelSystem::VDerivedChannelParameters;
using Recordings::EChannelKind;
using TQL::TickRange;
using Channel = std::shared_ptr<TQL::IChannel>;

constexpr std::int64_t Period = TQL::DefaultFramePeriod;

VDerivedChannelParameters Algebra(const std::string& i_rExpression, std::string i_TypeName = "")
{
    VDerivedChannelParameters record;
    record.Hash = std::hash<std::string>()(i_rExpression);
    record.OperationParameters.emplace_back("Expression", i_rExpression);
    if (!i_TypeName.empty())
        record.TypeParameters.emplace_back("TypeDisplayName", std::move(i_TypeName));
    return record;
}

VDerivedChannelParameters Derivative(std::int32_t i_Order)
{
    VDerivedChannelParameters record;
    record.Hash = static_cast<std::uint64_t>(i_Order);
    record.OperationParameters.emplace_back("Order", i_Order);
    return record;
}

std::string Text(TQL::IChannel& i_rChannel, std::string_view i_Name)
{
    TQL::ParameterValue value;
    if (i_rChannel.GetParameters()->Read("", i_Name, value).IsError())
        return "absent";
    if (const bool* pBool = std::get_if<bool>(&value))
        return *pBool ? "yes" : "no";
    const std::string* pText = std::get_if<std::string>(&value);
    return pText ? *pText : "no text";
}

std::string Errors(TQL::IChannel& i_rChannel)
{
    std::vector<std::string> errors;
    i_rChannel.GetParameters()->GetErrors(errors);
    std::string text;
    for (const std::string& rError : errors)
        text += rError + "|";
    return text;
}

/// A channel whose texts the test changes.
class EditedChannel : public TQL::IChannel
{
public:
    void Edit(std::string_view i_Name, const std::string& i_rText)
    {
        m_pParameters->Define("ChannelInstanceParameters", i_Name, i_rText);
        ++m_Revision;
    }

    std::shared_ptr<TQL::IChannelParameters> GetParameters() const override { return m_pParameters; }
    void GetDependentChannels(std::vector<Channel>& o_rChannels) const override { o_rChannels.clear(); }
    std::shared_ptr<TQL::IChannelOutput> GetOutput() const override { return nullptr; }
    TQL::ComponentDescription GetDescription() const override { return {{{}}, false, ""}; }
    const TQL::IChannelInstanceId& GetInstanceId() const override { return m_Id; }
    std::uint64_t GetRevision() const override { return m_Revision; }

private:
    TQL::IChannelInstanceId m_Id{"Walk", "Edited", 0, 0, ""};
    std::shared_ptr<Channels::VChannelParameters> m_pParameters = std::make_shared<Channels::VChannelParameters>();
    std::uint64_t m_Revision = 1;
};

/// A recording with channels of every kind. Marker M<n> begins at frame n and has 30 rows of random values with gaps.
class DerivedChannel : public testing::Test
{
protected:
    DerivedChannel()
    {
        auto pRecording = std::make_shared<Recordings::VRecording>();
        pRecording->Range = {0, 30 * Period};
        const auto add = [&](EChannelKind i_Kind, std::string i_Name, std::string i_Units, std::size_t i_Components)
        {
            Recordings::RecordedChannel channel;
            channel.Kind = i_Kind;
            channel.Name = std::move(i_Name);
            channel.Units = std::move(i_Units);
            channel.ComponentNames.resize(i_Components);
            channel.Samples = RandomSamples(30 * i_Components, static_cast<std::uint32_t>(m_Ids.size()));
            pRecording->Channels.push_back(channel);
        };
        for (int n = 0; n < 3; ++n)
        {
            add(EChannelKind::Marker, "M" + std::to_string(n), "mm", 3);
            pRecording->Channels.back().FirstTick = n * Period;
            m_Ids["M" + std::to_string(n)] = {"Walk", "Labelled Reconstructions", 0, static_cast<std::uint64_t>(n), ""};
        }
        add(EChannelKind::SegmentPose, "Pelvis", "m", 6);
        m_Ids["Pelvis"] = {"Walk", "SubjectSegmentPose", 0, 0, ""};
        add(EChannelKind::Analog, "Fx", "N", 1);
        pRecording->Channels.back().SamplePeriod = Period / 10;
        m_Ids["Fx"] = {"Walk", "DeviceOutput", 0, 0, ""};
        add(EChannelKind::Analog, "Late", "N", 1);
        pRecording->Channels.back().FirstTick = Period / 2;
        m_Ids["Late"] = {"Walk", "DeviceOutput", 0, 1, ""};
        add(EChannelKind::JointAngles, "Knee", "deg", 3);
        pRecording->Channels.back().RotationOrder = "ZXY";
        m_Ids["Knee"] = {"Walk", "ModelSetSamplesOutput", 0, 0, "Knee"};
        add(EChannelKind::Column, "count", "", 1);
        m_Ids["count"] = {"Walk", "ModelSetSamplesOutput", 1, 0, "count"};
        m_pRecording = pRecording;
        Open();
    }

    void Open()
    {
        m_Service.AddContext(
            std::make_shared<Channels::VRecordedContext>("Walk", m_Service.GetSubTypes(), m_pRecording));
    }

    Channel Source(const std::string& i_rName) const { return m_Service.GetChannel(m_Ids.at(i_rName)); }

    Channel Make(const VDerivedChannelParameters& i_rRecord, const std::vector<Channel>& i_rInputs,
                 const char* i_pOperation = "AlgebraicExpression")
    {
        return m_Service.CreateDerivedChannel(i_pOperation, i_rRecord, i_rInputs);
    }

    /// "M0 M1" are the inputs.
    Channel Make(const std::string& i_rExpression, const std::string& i_rInputs)
    {
        std::vector<Channel> inputs;
        std::istringstream words(i_rInputs);
        for (std::string word; words >> word;)
            inputs.push_back(Source(word));
        return Make(Algebra(i_rExpression), inputs);
    }

    Channel MakeCache(const Channel& i_rpInput, bool i_bUnwrap = false, std::int64_t i_Frames = 0)
    {
        auto pCache = m_Service.CreateDerivedChannel("Cache", {}, {i_rpInput});
        const auto pParameters = pCache->GetParameters();
        EXPECT_TRUE(pParameters->SetParameter("SupportLodding", true).IsSuccess());
        EXPECT_TRUE(pParameters->SetParameter("EnableRotationUnwrapping", i_bUnwrap).IsSuccess());
        EXPECT_TRUE(pParameters->SetParameter("CacheRangeTicks", i_Frames * Period).IsSuccess());
        return pCache;
    }

    static std::vector<float> ReadAll(TQL::IChannel& i_rChannel, TickRange* o_pRange = nullptr)
    {
        const auto pBlock = i_rChannel.GetOutput()->GetBlock();
        TickRange range;
        pBlock->GetRange(range);
        if (o_pRange)
            *o_pRange = {range.First / Period, range.Last / Period};
        const auto rows = static_cast<std::size_t>((range.Last - range.First) / pBlock->GetShape().SamplePeriod);
        std::vector<float> values(rows * pBlock->GetShape().pLayout->ComponentCount);
        EXPECT_TRUE(pBlock->ReadSamples(range, values).IsSuccess());
        return values;
    }

    TestSupport::LogGuard m_Log; // nothing of this is worth a line in the log
    VChannelService m_Service;
    std::map<std::string, TQL::IChannelInstanceId> m_Ids;
    std::shared_ptr<const Recordings::VRecording> m_pRecording;
};

} // namespace

TEST_F(DerivedChannel, SameDerivationIsTheSameObjectWhileItLives)
{
    const Channel pFirst = Make("Position(#0)-Position(#1)", "M0 M1");
    const auto compare = [&](const Channel& i_rpOther)
    {
        return i_rpOther == pFirst                                                       ? "same object"
               : TQL::IsSameChannel(i_rpOther->GetInstanceId(), pFirst->GetInstanceId()) ? "same id"
                                                                                         : "other";
    };
    auto record = Algebra("Position(#0)-Position(#1)", "Offset");
    EXPECT_STREQ(compare(Make("Position(#0)-Position(#1)", "M0 M1")), "same object");
    EXPECT_STREQ(compare(Make(record, {Source("M0"), Source("M1")})), "same object") << "the hash alone counts";
    EXPECT_STREQ(compare(Make("Position(#0)-Position(#1)", "M1 M0")), "other");
    EXPECT_STREQ(compare(Make("Position(#1)-Position(#0)", "M0 M1")), "other");
    EXPECT_STREQ(compare(Make(Derivative(1), {Source("M0")}, "Derivative")), "other");
    EXPECT_EQ(Make("mag(#0)", "M0"), Make("mag(#0)", "M0"));
    EXPECT_NE(m_Service.CreateDerivedChannel("Cache", {}, {pFirst}),
              m_Service.CreateDerivedChannel("Cache", {}, {pFirst}));

    const TQL::IChannelInstanceId id = pFirst->GetInstanceId();
    EXPECT_EQ(id.DataContextName, "Walk");
    EXPECT_EQ(id.TypeName, "AlgebraicExpression");
    EXPECT_EQ(id.First, Algebra("Position(#0)-Position(#1)").Hash);
    EXPECT_EQ(id.Text, "Position");
    EXPECT_EQ(m_Service.GetChannel(id), pFirst);
    Open(); // the same file again: other inputs
    const Channel pAgain = Make("Position(#0)-Position(#1)", "M0 M1");
    EXPECT_STREQ(compare(pAgain), "same id");
    EXPECT_EQ(m_Service.GetChannel(id), pAgain) << "not what is left of the old one";
}

TEST_F(DerivedChannel, TextsAreSubstitutedAndInheritedAndFollowTheInputs)
{
    const auto pA = std::make_shared<EditedChannel>();
    const auto pB = std::make_shared<EditedChannel>();
    pA->Edit("InstanceDisplayName", "Ann");
    pB->Edit("InstanceDisplayName", "Bob");
    pA->Edit("TypeDisplayName", "Position");
    pA->Edit("CategoryDisplayName", "Labels");
    auto record = Algebra("#0", "%1% 1st Derivative of %1 %% %3% %2%");
    record.TypeParameters.emplace_back("ComponentDisplayNames", std::string());
    record.TypeParameters.emplace_back("SupportMagnitude", false);
    record.InstanceParameters.emplace_back("InstanceDisplayName", "%1% ➞ %2%");
    record.InstanceParameters.emplace_back("ErrorData", "%1% ➞ %2%");
    const Channel pChannel = Make(record, {pA, pB});
    const Channel pOuter = Make(Algebra("#0", "Speed of %1%"), {pChannel});
    const auto expectTexts = [&](const char* i_pWhen, const std::map<std::string, std::string>& i_rTexts)
    {
        for (const auto& [rName, rText] : i_rTexts)
            EXPECT_EQ(Text(*pChannel, rName), rText) << i_pWhen << ": " << rName;
    };
    expectTexts("at first", {{"TypeDisplayName", "Position 1st Derivative of %1 %% %3% "},
                             {"InstanceDisplayName", "Ann ➞ Bob"},
                             {"CategoryDisplayName", "Labels"},
                             {"ComponentDisplayNames", ""},
                             {"SupportMagnitude", "no"},
                             {"Selection", "absent"},
                             {"ErrorData", "\"Ann\" has no data."}});
    EXPECT_EQ(Text(*pOuter, "InstanceDisplayName"), "Ann ➞ Bob");
    EXPECT_EQ(Text(*pOuter, "TypeDisplayName"), "Speed of Position 1st Derivative of %1 %% %3% ");
    EXPECT_EQ(pChannel->GetRevision(), 1u);
    pB->Edit("InstanceDisplayName", "Bea");
    expectTexts("after an edit", {{"InstanceDisplayName", "Ann ➞ Bea"}});
    EXPECT_EQ(pChannel->GetRevision(), 2u);
    EXPECT_EQ(pOuter->GetRevision(), 2u);
    const auto pParameters = pChannel->GetParameters();
    EXPECT_EQ(pParameters->SetParameter("TypeDisplayName", std::string("x")), TQL::Result::NotPermitted);
    EXPECT_EQ(pParameters->SetParameter("NoSuchThing", std::string("x")), TQL::Result::NotFound);
}

TEST_F(DerivedChannel, WhatCannotBeComputedHasNoOutputAndAReason)
{
    struct Case
    {
        const char* pExpression;
        const char* pInputs;
        const char* pError; ///< part of what stands there
    };
    const std::vector<Case> cases{
        {"mag(Position(#0)", "M0", ")"},
        {"frobnicate(#0)", "M0", "frobnicate"},
        {"mag(#1)", "M0", "#1"},
        {"AngleAxis(#0)", "Fx", "AngleAxis"},
        {"AngleAxis(#0)", "M0", "AngleAxis"},
        {"Angle(#0)", "M0", "Angle"},
        {"degree(#0)", "Fx", "degree"},
        {"millimeter(#0)", "count", "millimeter"},
        {"Position(#0)-Position(#1)", "M0 Fx", "Position"},
        {"join(#0,#1)", "M0 Fx",
         "\"M0\" has 120 samples a second and \"Fx\" has 1200; only channels of the same rate can be computed with."},
        {"join(#0,#1)", "M0 Late",
         "The samples of \"M0\" and those of \"Late\" stand at different times, so that they cannot be computed with."},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(std::string(rCase.pExpression) + " of " + rCase.pInputs);
        const Channel pChannel = Make(rCase.pExpression, rCase.pInputs);
        ASSERT_NE(pChannel, nullptr);
        EXPECT_EQ(pChannel->GetOutput(), nullptr);
        const std::string error = Errors(*pChannel);
        EXPECT_NE(error.find(rCase.pError), std::string::npos) << error;
        EXPECT_EQ(std::ranges::count(error, '|'), 1) << error;
        EXPECT_EQ(Text(*pChannel, "ErrorData") + "|", error);
        const Channel pOuter = Make(Algebra("mag(#0)"), {pChannel});
        EXPECT_EQ(pOuter->GetOutput(), nullptr);
        EXPECT_NE(Errors(*pOuter).find(error), std::string::npos) << "told by what is derived from it as well";
    }
    EXPECT_EQ(Make(Derivative(3), {Source("M0")}, "Derivative")->GetOutput(), nullptr);
    EXPECT_EQ(Make(Derivative(1), {Source("M0"), Source("M1")}, "Derivative")->GetOutput(), nullptr);
    EXPECT_EQ(Make(Algebra("#0"), {}), nullptr);
    EXPECT_EQ(Make(Algebra("#0"), {nullptr}), nullptr);
    EXPECT_EQ(Make(Algebra("#0"), {Source("M0")}, "NoSuchOperation"), nullptr);
}

TEST_F(DerivedChannel, RowsStandWhereAllInputsHaveThem)
{
    const Channel pChannel = Make("mag(Position(#0)-Position(#1))", "M0 M2");
    const auto& rA = m_pRecording->Channels[0].Samples;
    const auto& rB = m_pRecording->Channels[2].Samples;
    std::vector<float> expected;
    for (std::size_t row = 0; row < 28; ++row)
    {
        double square = 0.0;
        for (std::size_t c = 0; c < 3; ++c)
            square += std::pow(static_cast<double>(rA[3 * (row + 2) + c]) - static_cast<double>(rB[3 * row + c]), 2.0);
        expected.push_back(static_cast<float>(std::sqrt(square)));
    }
    for (const Channel& rpChannel : {pChannel, MakeCache(pChannel), MakeCache(pChannel, true)})
    {
        TickRange range;
        const std::vector<float> values = ReadAll(*rpChannel, &range);
        EXPECT_EQ(range, (TickRange{2, 30}));
        ASSERT_EQ(values.size(), expected.size());
        for (std::size_t i = 0; i < values.size(); ++i)
            EXPECT_TRUE(std::isnan(expected[i]) ? std::isnan(values[i]) : std::abs(values[i] - expected[i]) < 1e-2f)
                << i << ": " << values[i] << " instead of " << expected[i];
        const auto pBlock = rpChannel->GetOutput()->GetBlock();
        LodRecord record;
        ASSERT_TRUE(pBlock->Summarise({2 * Period, 30 * Period}, std::span(&record, 1)).IsSuccess());
        EXPECT_TRUE(IsSame(record, SlowSummary(values)));
    }
}

TEST_F(DerivedChannel, NothingIsKeptTwice)
{
    const auto samplesOf = [](const Channel& i_rpChannel)
    {
        return std::dynamic_pointer_cast<Channels::VSampleBlock>(i_rpChannel->GetOutput()->GetBlock())->GetSamples();
    };
    const Channel pMarker = Source("M0");
    const Channel pIdentity = Make("Position(#0)", "M0");
    EXPECT_EQ(pIdentity->GetOutput()->GetBlock(), pMarker->GetOutput()->GetBlock());
    EXPECT_EQ(samplesOf(MakeCache(pIdentity)), samplesOf(pMarker));

    // Two plots of one derivation share what is kept; what only stands between is not kept at all.
    const Channel pInner = Make("Position(#0)-Position(#1)", "M0 M1");
    const Channel pOuter = Make(Algebra("mag(#0)"), {pInner});
    const Channel pPlotA = MakeCache(pOuter);
    const Channel pPlotB = MakeCache(pOuter);
    EXPECT_EQ(ReadAll(*pPlotA).size(), 29u);
    EXPECT_EQ(samplesOf(pPlotA), samplesOf(pPlotB));
    EXPECT_EQ(samplesOf(pInner)->ByteCount(), 0u);

    // Nor are rotations of a recording that were made continuous kept once a plot.
    const Channel pUnwrapped = MakeCache(Source("Pelvis"), true);
    EXPECT_EQ(samplesOf(pUnwrapped), samplesOf(MakeCache(Source("Pelvis"), true)));
    EXPECT_NE(samplesOf(pUnwrapped), samplesOf(MakeCache(Source("Pelvis"), false)));
}

TEST_F(DerivedChannel, NoPlotWaitsForALongRecording)
{
    constexpr std::int64_t rows = 100000;
    auto pRecording = std::make_shared<Recordings::VRecording>();
    Recordings::RecordedChannel channel;
    channel.Kind = EChannelKind::Marker;
    channel.Units = "mm";
    channel.ComponentNames.resize(3);
    channel.Samples = RandomSamples(3 * rows, 7);
    pRecording->Channels.push_back(channel);
    pRecording->Range = channel.GetTickRange();
    m_Service.AddContext(std::make_shared<Channels::VRecordedContext>("Day", m_Service.GetSubTypes(), pRecording));
    const Channel pMetres =
        Make(Algebra("meter(#0)"), {m_Service.GetChannel({"Day", "Labelled Reconstructions", 0, 0, ""})});
    const Channel pPlot = MakeCache(pMetres);
    const auto pOutput = pPlot->GetOutput();
    const std::uint64_t token = pOutput->GetBlock()->GetStore()->AcquireLease(0);
    TickRange range;
    TickRange before;
    int asked = 0;
    do
    {
        before = range;
        pOutput->GetBlock()->GetRange(range);
        ASSERT_LE(range.Last - before.Last, 20000 * Period) << "at once";
        ++asked;
    } while (range != before);
    EXPECT_EQ(range, (TickRange{0, rows * Period}));
    EXPECT_GT(asked, 5);
    EXPECT_FALSE(pOutput->IsStale());
    EXPECT_EQ(pOutput->GetBlock()->GetStore()->AcquireLease(0), token) << "more of the same series";
    const std::vector<float> values = ReadAll(*pPlot);
    for (float& rValue : channel.Samples)
        rValue = static_cast<float>(rValue * 0.001);
    ASSERT_EQ(values.size(), channel.Samples.size());
    for (std::size_t i = 0; i < values.size(); i += 3)
        ASSERT_TRUE(std::isnan(values[i]) || values[i] == channel.Samples[i]) << i;
    std::vector<LodRecord> records(3);
    ASSERT_TRUE(pOutput->GetBlock()->Summarise(range, records).IsSuccess());
    std::vector<float> first;
    for (std::size_t i = 0; i < values.size(); i += 3)
        first.push_back(values[i]);
    EXPECT_TRUE(IsSame(records[0], SlowSummary(first)));

    // Who reads a derived channel itself asks once.
    EXPECT_EQ(ReadAll(*Make(Algebra("centimeter(#0)"), {pMetres})).size(), channel.Samples.size());
}

TEST_F(DerivedChannel, OutputComesGoesAndTurnsStaleWithThoseOfTheInputs)
{
    const auto pLive = std::make_shared<VLiveContext>("Live", m_Service.GetSubTypes(), VLiveContext::Options{});
    m_Service.AddContext(pLive);
    std::uint32_t lane = 0;
    EXPECT_TRUE(pLive->AddChannel({"Labelled Reconstructions", 0, 0, "", "Head", "mm", {}}, 0, lane).IsSuccess());
    const auto addFrame = [&](std::int64_t i_Frame)
    {
        const std::array<float, 3> row{1.0f, 2.0f, static_cast<float>(i_Frame)};
        const std::array<Channels::ChannelRows, 1> rows{{{lane, row}}};
        EXPECT_TRUE(pLive->AppendFrames(i_Frame, 1, rows).IsSuccess());
    };
    const Channel pChannel =
        Make(Algebra("mag(#0)"),
             {Make(Algebra("centimeter(#0)"), {m_Service.GetChannel({"Live", "Labelled Reconstructions", 0, 0, ""})})});
    int notices = 0;
    const auto pSubscription =
        pChannel->GetParameters()->GetChangeNotifier()->AddOutputChangedCallback([&] { ++notices; }, nullptr);
    std::shared_ptr<TQL::IChannelOutput> pOutput;
    std::uint64_t token = 0;
    const auto expectState = [&](const char* i_pWhen, bool i_bHasOutput, bool i_bNew, int i_Notices)
    {
        SCOPED_TRACE(i_pWhen);
        const auto pBefore = std::exchange(pOutput, pChannel->GetOutput());
        EXPECT_EQ(pOutput != nullptr, i_bHasOutput);
        EXPECT_EQ(pOutput != pBefore, i_bNew);
        EXPECT_TRUE(!pBefore || pBefore->IsStale() == i_bNew);
        EXPECT_EQ(Errors(*pChannel).empty(), i_bHasOutput) << Errors(*pChannel);
        EXPECT_GE(notices, i_Notices);
        if (pOutput && i_bNew)
        {
            const std::uint64_t old = std::exchange(token, pOutput->GetBlock()->GetStore()->AcquireLease(0));
            EXPECT_NE(old, token);
        }
        EXPECT_EQ(pChannel->GetDescription().Groups.size(), 1u) << "known without data";
    };
    expectState("nothing captured", false, false, 0);
    addFrame(0);
    expectState("first frame", true, true, 1);
    addFrame(1);
    expectState("more frames", true, false, 1);
    pLive->Restart(100);
    expectState("restart", false, true, 2);
    addFrame(100);
    expectState("captured again", true, true, 3);
    EXPECT_TRUE(m_Service.RemoveContext("Live").IsSuccess());
    expectState("closed", false, true, 4);
    EXPECT_NE(Errors(*pChannel).find("\"Head\" has no data."), std::string::npos) << Errors(*pChannel);
}

TEST_F(DerivedChannel, LiveDerivativeWaitsForTheNextRowAndNeverRevises)
{
    VLiveContext::Options options;
    options.HistoryTicks = 5000 * Period;
    const auto pLive = std::make_shared<VLiveContext>("Live", m_Service.GetSubTypes(), options);
    m_Service.AddContext(pLive);
    std::uint32_t lane = 0;
    EXPECT_TRUE(pLive->AddChannel({"ModelSetSamplesOutput", 0, 0, "x", "x", "mm", {""}}, 0, lane).IsSuccess());
    const Channel pSource = m_Service.GetChannel({"Live", "ModelSetSamplesOutput", 0, 0, "x"});
    const Channel pVelocity = Make(Derivative(1), {pSource}, "Derivative");
    const Channel pPlot = MakeCache(pVelocity, false, 500);
    const Channel pSum = MakeCache(Make(Algebra("join(#0,#1)"), {pSource, pVelocity}), false, 500);
    std::int64_t frame = 0;
    for (int batch = 0; frame < 12000; ++batch)
    {
        const std::int64_t count = batch % 7 + 1;
        std::vector<float> values;
        for (std::int64_t i = 0; i < count; ++i, ++frame)
            values.push_back(static_cast<float>(frame % 100 < 3 ? std::nan("") : 0.5 * static_cast<double>(frame)));
        const std::array<Channels::ChannelRows, 1> rows{{{lane, values}}};
        ASSERT_TRUE(pLive->AppendFrames(frame - count, count, rows).IsSuccess());
        if (!pPlot->GetOutput() || frame < 3)
            continue;
        TickRange range;
        const std::vector<float> speeds = ReadAll(*pPlot, &range);
        ASSERT_EQ(range.Last, frame - 1) << "the newest row has no neighbour yet";
        ASSERT_EQ(range.First, std::max<std::int64_t>(1, frame - 1 - 500));
        for (std::size_t i = 0; i < speeds.size(); ++i)
        {
            const std::int64_t n = range.First + static_cast<std::int64_t>(i);
            ASSERT_EQ(std::isnan(speeds[i]), n % 100 < 3) << n;
            ASSERT_TRUE(n % 100 < 3 || std::abs(speeds[i] - 60.0f) < 0.5f) << n << ": " << speeds[i] << " mm a second";
        }
        const auto pBlock = pPlot->GetOutput()->GetBlock();
        LodRecord record;
        ASSERT_TRUE(pBlock->Summarise({range.First * Period, range.Last * Period}, std::span(&record, 1)).IsSuccess());
        ASSERT_TRUE(IsSame(record, SlowSummary(speeds)));
    }
    TickRange range;
    ReadAll(*pSum, &range);
    EXPECT_EQ(range, (TickRange{frame - 1 - 500, frame - 1})) << "as far as both have rows";
    const auto pKept = std::dynamic_pointer_cast<Channels::VSampleBlock>(pPlot->GetOutput()->GetBlock())->GetSamples();
    EXPECT_LT(pKept->ByteCount(), 4096u * 5) << "a live plot keeps its window, not the whole history";

    // Who reads a derived channel itself gets all the history, and no more than that.
    ReadAll(*pVelocity, &range);
    EXPECT_EQ(range.Last, frame - 1);
    EXPECT_GE(range.First, frame - 5000 - 256 - 1);
}

TEST_F(DerivedChannel, CacheKeepsRotationsOfEveryFormContinuous)
{
    auto pRecording = std::make_shared<Recordings::VRecording>();
    Recordings::RecordedChannel channel;
    channel.Kind = EChannelKind::SegmentPose;
    channel.Units = "mm";
    channel.ComponentNames.resize(6);
    for (int i = 0; i < 600; ++i)
    {
        const double angle = std::remainder(0.3 * i, 2.0 * std::acos(-1.0));
        channel.Samples.insert(channel.Samples.end(), {0.0f, 0.0f, static_cast<float>(angle), 1.0f, 2.0f, 3.0f});
    }
    pRecording->Channels.push_back(channel);
    pRecording->Range = channel.GetTickRange();
    m_Service.AddContext(std::make_shared<Channels::VRecordedContext>("Spin", m_Service.GetSubTypes(), pRecording));
    const Channel pPose = m_Service.GetChannel({"Spin", "SubjectSegmentPose", 0, 0, ""});
    // The component that goes on and on, and how far a frame.
    struct Case
    {
        const char* pExpression;
        std::size_t Component;
        double Step;
    };
    const double degrees = 180.0 / std::acos(-1.0);
    for (const Case& rCase : std::vector<Case>{{"AngleAxis(#0)", 2, 0.3},
                                               {"degree(AngleAxis(#0))", 2, 0.3 * degrees},
                                               {"EulerXYZ(#0)", 2, 0.3},
                                               {"degree(EulerZXY(#0))", 0, 0.3 * degrees},
                                               {"AxisAndAngle(#0)", 3, 0.3},
                                               {"join(AxisAndAngle(#0),Position(#0))", 3, 0.3},
                                               {"degree(join(AngleAxis(#0),Position(#0)))", 2, 0.3 * degrees}})
    {
        SCOPED_TRACE(rCase.pExpression);
        const Channel pCache = MakeCache(Make(Algebra(rCase.pExpression), {pPose}), true);
        ASSERT_NE(pCache->GetOutput(), nullptr) << Errors(*pCache);
        const std::vector<float> values = ReadAll(*pCache);
        const std::size_t width = values.size() / 600;
        for (std::size_t i = 1; i < 600; ++i)
            ASSERT_NEAR(values[i * width + rCase.Component] - values[(i - 1) * width + rCase.Component], rCase.Step,
                        2e-3 * std::abs(rCase.Step) + 2e-4)
                << i;
    }
    for (const char* pExpression : {"Quaternion(#0)", "join(Quaternion(#0),Position(#0))"})
    {
        const std::vector<float> values = ReadAll(*MakeCache(Make(Algebra(pExpression), {pPose}), true));
        const std::size_t width = values.size() / 600;
        for (std::size_t i = 1; i < 600; ++i)
            for (std::size_t c = 0; c < 4; ++c)
                ASSERT_LT(std::abs(values[i * width + c] - values[(i - 1) * width + c]), 0.2f) << pExpression << i;
    }
}

} // namespace ChannelsTest

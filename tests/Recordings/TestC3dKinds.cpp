#include "C3dBuilder.h"
#include "RecordingText.h"

#include "Recordings/C3d/C3dFrameCount.h"
#include "Recordings/C3d/C3dReader.h"

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <functional>
#include <string>
#include <utility>
#include <vector>

namespace TestRecordings
{

using Recordings::EProcessor;
using Recordings::VRecording;

namespace
{

VRecording Read(const C3dSpec& i_rSpec)
{
    VRecording recording;
    std::string error;
    EXPECT_TRUE(Recordings::ReadC3d(BuildC3d(i_rSpec).Bytes, {}, recording, error).IsSuccess()) << error;
    return recording;
}

// The parameter of that name, to be changed.
ParameterSpec& At(C3dSpec& i_rSpec, const std::string& i_rGroup, const std::string& i_rName)
{
    for (ParameterSpec& rParameter : i_rSpec.Parameters)
        if (rParameter.Group == i_rGroup && rParameter.Name == i_rName)
            return rParameter;
    return i_rSpec.Parameters.emplace_back(ParameterSpec{i_rGroup, i_rName, 2, {}, {}, {}});
}

void Remove(C3dSpec& i_rSpec, const std::string& i_rGroup, const std::string& i_rName)
{
    std::erase_if(i_rSpec.Parameters, [&](const ParameterSpec& i_rParameter)
                  { return i_rParameter.Group == i_rGroup && i_rParameter.Name == i_rName; });
}

const std::string SmallText = "C3D 27000000..35100000 by 2700000\n"
                              "marker Ann:Head of Ann [mm] 50 Hz, 27000000 by 2700000:"
                              " 250 -250 250.25 | 500 -500 500.25 | 750 -750 750.25\n"
                              "marker Toe [mm] 50 Hz, 27000000 by 2700000: 2 4 6 | - - - | 2 4 6\n"
                              "analog Fz [N] 100 Hz, 27000000 by 1350000: 0 | 0 | 1 | -1 | 2 | -2\n"
                              "analog EMG 1 [V] 100 Hz, 27000000 by 1350000: -20 | 20 | -40 | 40 | -60 | 60\n";

} // namespace

TEST(C3dKinds, EveryProcessorAndStorageGivesTheSame)
{
    for (const EProcessor processor : {EProcessor::Intel, EProcessor::Dec, EProcessor::Mips})
        for (const bool bReal : {true, false})
            EXPECT_EQ(TextOf(Read(SmallSpec(processor, bReal))), SmallText)
                << static_cast<int>(processor) << (bReal ? " real" : " integer");
}

TEST(C3dKinds, EveryShapeOfTheSectionsGivesTheSame)
{
    const std::pair<const char*, std::function<void(C3dSpec&)>> cases[] = {
        {"parameters further on",
         [](C3dSpec& i_r)
         {
             i_r.ParameterBlock = 4;
         }},
        {"room before the data",
         [](C3dSpec& i_r)
         {
             i_r.EmptyBlocksBeforeData = 3;
         }},
        {"no end mark",
         [](C3dSpec& i_r)
         {
             i_r.bEndMark = false;
         }},
        {"locked",
         [](C3dSpec& i_r)
         {
             i_r.bLocked = true;
         }},
        {"described",
         [](C3dSpec& i_r)
         {
             i_r.Description = "what it is for";
         }},
        {"parameters before groups",
         [](C3dSpec& i_r)
         {
             i_r.bGroupsLast = true;
         }},
        {"section without length",
         [](C3dSpec& i_r)
         {
             i_r.bSayParameterLength = false;
         }},
        {"small letters",
         [](C3dSpec& i_r)
         {
             At(i_r, "POINT", "LABELS").Name = "Labels";
         }},
        {"units end with a zero",
         [](C3dSpec& i_r)
         {
             At(i_r, "POINT", "UNITS").Characters.assign("mm\0?", 4);
         }},
        {"data by parameter",
         [](C3dSpec& i_r)
         {
             At(i_r, "POINT", "DATA_START").Numbers = {0};
             At(i_r, "POINT", "DATA_START").Numbers = {static_cast<double>(BuildC3d(i_r).DataOffset / 512 + 1)};
             i_r.bPointToData = false;
         }},
        {"rate by header",
         [](C3dSpec& i_r)
         {
             Remove(i_r, "POINT", "RATE");
         }},
        {"scale by header",
         [](C3dSpec& i_r)
         {
             Remove(i_r, "POINT", "SCALE");
         }},
        {"counts by header",
         [](C3dSpec& i_r)
         {
             Remove(i_r, "POINT", "USED");
             Remove(i_r, "ANALOG", "USED");
         }},
        {"more labels than points",
         [](C3dSpec& i_r)
         {
             At(i_r, "POINT", "LABELS") = Texts("POINT", "LABELS", {"Ann:Head", "Toe", "Heel", "Knee"});
         }},
    };
    for (const auto& [pName, change] : cases)
    {
        C3dSpec spec = SmallSpec(EProcessor::Mips, false);
        change(spec);
        EXPECT_EQ(TextOf(Read(spec)), SmallText) << pName;
    }
}

TEST(C3dKinds, WhereHeaderAndParametersDisagreeTheSizeDecides)
{
    for (const double used : {1.0, 200.0})
    {
        C3dSpec spec = SmallSpec(EProcessor::Intel, true);
        At(spec, "POINT", "USED").Numbers = {used};
        const VRecording recording = Read(spec);
        EXPECT_EQ(TextOf(recording), SmallText + "warning: Header and parameters disagree on the number of points or "
                                                 "analog channels; the header fit the file and are followed.\n");
    }
}

TEST(C3dKinds, VaxReals)
{
    const std::pair<std::array<int, 4>, double> cases[] = {
        {{0x80, 0x40, 0, 0}, 1.0},
        {{0x80, 0xC0, 0, 0}, -1.0},
        {{0, 0, 0x34, 0x12}, 0.0},                         // no exponent: zero, whatever follows
        {{0xFF, 0x7F, 0xFF, 0xFF}, 1.7014117331926443e38}, // the largest
        {{0x80, 0x00, 0, 0}, std::ldexp(1.0, -128)},       // the smallest
        {{0x80, 0x80, 0, 0}, -std::ldexp(1.0, -128)},
        {{0xC0, 0x00, 0, 0}, std::ldexp(1.5, -128)},
        {{0x49, 0x41, 0xDB, 0x0F}, 3.1415927410125732},
        {{0x00, 0x80, 0, 0}, NAN}, // reserved
    };
    for (const auto& [rBytes, expected] : cases)
    {
        std::array<std::byte, 4> bytes{};
        for (std::size_t i = 0; i < 4; ++i)
            bytes[i] = static_cast<std::byte>(rBytes[i]);
        const auto value = static_cast<double>(Recordings::VByteDecoder(EProcessor::Dec).Real(bytes));
        if (std::isnan(expected))
            EXPECT_TRUE(std::isnan(value));
        else
            EXPECT_EQ(value, expected);
    }
}

TEST(C3dKinds, FourthWordSaysWhetherAPointIsMissing)
{
    const std::pair<double, bool> cases[] = {{0.0, false},   {5.0, false},    {32767.0, false}, {-1.0, true},
                                             {-256.0, true}, {65535.0, true}, {32768.0, true}};
    for (const bool bReal : {true, false})
        for (const auto& [word, bMissing] : cases)
        {
            C3dSpec spec = SmallSpec(EProcessor::Dec, bReal);
            spec.Frames[0][3] = word;
            EXPECT_EQ(std::isnan(Read(spec).Channels[0].Samples[1]), bMissing) << word << bReal;
        }
}

TEST(C3dKinds, UnsignedAnalog)
{
    struct Case
    {
        const char* Name;
        std::string Format;
        double Bits;
        double Offset;
        double Raw;
        float Value;
    };
    const Case cases[] = {
        {"said", "UNSIGNED", 0, 0xFFF0, 0x0010, -65504.0f},
        {"said, offset 0", "unsigned", 0, 0, 0xFFFF, 65535.0f},
        {"said to be signed", "SIGNED", 16, 0, 0xFFFF, -1.0f},
        {"signed against its bits", "SIGNED", 16, 0x8000, 0x0001, 32769.0f},
        {"by bits and offset", "", 16, 0x8000, 0x7FFF, -1.0f},
        {"bits alone", "", 16, 0, 0xFFFF, -1.0f},
        {"nothing said", "", 0, 0, 0xFFFE, -2.0f},
        {"12 bits", "", 12, 2048, 4095, 2047.0f},
    };
    for (const Case& rCase : cases)
    {
        C3dSpec spec = SmallSpec(EProcessor::Mips, false);
        if (!rCase.Format.empty())
            spec.Parameters.push_back(Texts("ANALOG", "FORMAT", {rCase.Format}));
        if (rCase.Bits != 0)
            spec.Parameters.push_back(Integers("ANALOG", "BITS", {rCase.Bits}));
        At(spec, "ANALOG", "OFFSET").Numbers = {rCase.Offset, 0};
        spec.Frames[0][8] = rCase.Raw;
        EXPECT_EQ(ChannelNamed(Read(spec), "Fz").Samples.at(0), rCase.Value) << rCase.Name;
    }
}

TEST(C3dKinds, Labels)
{
    struct Case
    {
        std::vector<ParameterSpec> Labels;
        std::string Expected;
    };
    const Case cases[] = {
        {{}, "Point 1, Point 2, Point 3, Point 4, "},
        {{Texts("POINT", "LABELS", {"A", "", "C"})}, "A, Point 2, C, Point 4, "},
        {{Texts("POINT", "LABELS", {"A", "A", "B", "A"})}, "A, A#2, B, A#3, "},
        {{Texts("POINT", "LABELS", {"A", "A", "A#2", "A"})}, "A, A#3, A#2, A#4, "},
        {{Texts("POINT", "LABELS", {"A"}), Texts("POINT", "LABELS2", {"Bee", "C"}), Texts("POINT", "LABELS3", {"D"})},
         "A, Bee, C, D, "},
        {{Texts("POINT", "LABELS", {"A"}), Texts("POINT", "LABELS3", {"D"})}, "A, Point 2, Point 3, Point 4, "},
        {{Texts("POINT", "LABELS", {"F\xFC\xDF", "F\xC3\xBC", "a\tb", "*12"})},
         "F\xC3\xBC\xC3\x9F, F\xC3\xBC, a b, *12, "},
    };
    for (const Case& rCase : cases)
    {
        C3dSpec spec;
        spec.Points = 4;
        spec.Frames = {std::vector<double>(16, 1.0)};
        spec.Parameters = {Integers("POINT", "USED", {4}), Reals("POINT", "SCALE", {-1})};
        spec.Parameters.insert(spec.Parameters.end(), rCase.Labels.begin(), rCase.Labels.end());
        std::string names;
        for (const Recordings::RecordedChannel& rChannel : Read(spec).Channels)
            names += rChannel.Name + ", ";
        EXPECT_EQ(names, rCase.Expected);
    }
}

TEST(C3dKinds, PointsThatAModelComputed)
{
    struct Case
    {
        std::vector<ParameterSpec> Parameters;
        std::string Expected;
    };
    const std::vector<ParameterSpec> lists = {
        Texts("POINT", "LABELS", {"LKNE", "LKneeAngles", "F", "M", "P", "S", "R", "LKNE"}),
        Texts("POINT", "ANGLES", {"LKneeAngles", "gone", ""}),
        Texts("POINT", "FORCES", {"F", "LKneeAngles"}),
        Texts("POINT", "MOMENTS", {"M"}),
        Texts("POINT", "POWERS", {"P"}),
        Texts("POINT", "SCALARS", {"S"}),
        Texts("POINT", "REACTIONS", {"R"})};
    std::vector<ParameterSpec> units = lists;
    for (const auto& [pName, pUnit] :
         {std::pair("ANGLE_UNITS", "rad"), std::pair("FORCE_UNITS", "N/kg"), std::pair("MOMENT_UNITS", "Nm"),
          std::pair("POWER_UNITS", "W/kg"), std::pair("SCALAR_UNITS", "mm"), std::pair("REACTION_UNITS", "kN")})
        units.push_back(Texts("POINT", pName, {pUnit}));
    const Case cases[] = {{lists, "marker LKNE [mm]\noutput Angle LKneeAngles [deg]\noutput Force F [N]\n"
                                  "output Moment M [Nmm]\noutput Power P [W]\noutput Scalar S []\n"
                                  "output Reaction R []\nmarker LKNE#2 [mm]\n"},
                          {units, "marker LKNE [mm]\noutput Angle LKneeAngles [rad]\noutput Force F [N/kg]\n"
                                  "output Moment M [Nm]\noutput Power P [W/kg]\noutput Scalar S [mm]\n"
                                  "output Reaction R [kN]\nmarker LKNE#2 [mm]\n"}};
    for (const Case& rCase : cases)
    {
        C3dSpec spec;
        spec.Points = 8;
        spec.Frames = {std::vector<double>(32, 1.0)};
        spec.Parameters = {Integers("POINT", "USED", {8}), Reals("POINT", "SCALE", {-1}),
                           Texts("POINT", "UNITS", {"mm"})};
        spec.Parameters.insert(spec.Parameters.end(), rCase.Parameters.begin(), rCase.Parameters.end());
        std::string text = TextOf(Read(spec));
        text.erase(0, text.find('\n') + 1);
        for (std::size_t at = 0; (at = text.find("] 100 Hz", at)) != std::string::npos;)
            text.erase(at + 1, text.find('\n', at) - at - 1);
        EXPECT_EQ(text, rCase.Expected);
    }
}

TEST(C3dKinds, EventsOfGroupAndHeader)
{
    C3dSpec spec = SmallSpec(EProcessor::Dec, true);
    spec.Events = {{"Foot", 61.5}, {"Late", 2.25, false}};
    spec.Parameters.push_back(Integers("EVENT", "USED", {2}));
    spec.Parameters.push_back(Texts("EVENT", "CONTEXTS", {"Left", "Right", "Right"}));
    spec.Parameters.push_back(Texts("EVENT", "LABELS", {"Foot Strike", "Foot Off", "not used"}));
    spec.Parameters.push_back(Texts("EVENT", "SUBJECTS", {"Ann"}));
    ParameterSpec times = Reals("EVENT", "TIMES", {1, 1.5, 0, 30.125, 0, 99});
    times.Dimensions = {2, 3};
    spec.Parameters.push_back(times);
    EXPECT_EQ(TextOf(Read(spec)), SmallText + "event Ann/Left/Foot Strike at 61.5\n"
                                              "event /Right/Foot Off at 30.125\n"
                                              "event //Late at 2.25 off\n");
}

TEST(C3dKinds, FrameNumbersAndRates)
{
    struct Case
    {
        unsigned First;
        double Rate;
        unsigned SamplesPerFrame;
        std::int64_t FirstTick;
        std::int64_t Period;
        std::int64_t AnalogPeriod;
    };
    const Case cases[] = {
        {0, 120.0, 10, 0, 1125000, 112500}, // counts from 0: taken as the first frame
        {1, 120.0, 10, 0, 1125000, 112500}, {121, 100.0, 1, 162000000, 1350000, 1350000},
        {1, 59.94, 8, 0, 2252252, 281532}, // not 2252252 / 8, which is no whole number: nearest to the rate
        {1, 1e-9, 1, 0, 1350000, 1350000}, // no usable rate
    };
    for (const Case& rCase : cases)
    {
        C3dSpec spec;
        spec.AnalogChannels = 1;
        spec.AnalogSamplesPerFrame = rCase.SamplesPerFrame;
        spec.FirstFrame = rCase.First;
        spec.Rate = rCase.Rate;
        spec.Frames = {2, std::vector<double>(rCase.SamplesPerFrame, 1.0)};
        spec.Parameters = {Reals("ANALOG", "SCALE", {1})};
        const VRecording recording = Read(spec);
        EXPECT_EQ(recording.FramePeriod, rCase.Period);
        EXPECT_EQ(recording.Range, (TQL::TickRange{rCase.FirstTick, rCase.FirstTick + 2 * rCase.Period}));
        EXPECT_EQ(recording.Channels.at(0).FirstTick, rCase.FirstTick);
        EXPECT_EQ(recording.Channels.at(0).SamplePeriod, rCase.AnalogPeriod);
        EXPECT_EQ(recording.Warnings.size(), rCase.Rate < 1.0 ? 1u : 0u);
    }
}

TEST(C3dKinds, FramesAsEachPlaceTellsThem)
{
    struct Case
    {
        const char* pName;
        std::vector<double> Start; ///< the two words of TRIAL; none: the parameter is absent
        std::vector<double> End;
        double Frames;
        std::uint16_t First;
        std::uint16_t Last;
        const char* pSpans;
    };
    const Case cases[] = {
        {"all agree", {1, 0}, {10, 0}, 10, 1, 10, "1+10 1+10 1+10 "},
        {"a start without an end", {5, 0}, {}, 0, 1, 10, "1+10 "},
        {"an end without a start", {}, {50, 0}, 0, 1, 10, "1+10 "},
        {"an end before the start", {9, 0}, {5, 0}, 0, 1, 10, "1+10 "},
        {"fields of zero", {0, 0}, {0, 0}, 7, 0, 0, "1+7 "},
        {"a header that runs backwards", {}, {}, 3, 5, 3, "5+3 "},
        {"the largest header alone", {}, {}, 0, 1, 65535, "1+65535 "},
        {"a header that has no room", {1, 0}, {4464, 1}, 4464, 1, 65535, "1+70000 "},
    };
    for (const Case& rCase : cases)
    {
        C3dSpec spec;
        spec.Points = 1;
        spec.Frames = {std::vector<double>(4, 1.0)};
        for (const auto& [pField, rWords] :
             {std::pair("ACTUAL_START_FIELD", rCase.Start), std::pair("ACTUAL_END_FIELD", rCase.End)})
            if (!rWords.empty())
                spec.Parameters.push_back(Integers("TRIAL", pField, rWords));
        if (rCase.Frames > 0)
            spec.Parameters.push_back(Integers("POINT", "FRAMES", {rCase.Frames}));
        const BuiltC3d built = BuildC3d(spec);
        Recordings::C3dHeader header;
        Recordings::VC3dParameters parameters;
        std::string error;
        ASSERT_TRUE(Recordings::ReadC3dHeader(built.Bytes, header, error).IsSuccess()) << error;
        ASSERT_TRUE(Recordings::VC3dParameters::Read(built.Bytes, header, parameters, error).IsSuccess()) << error;
        header.FirstFrame = rCase.First;
        header.LastFrame = rCase.Last;
        std::string spans;
        for (const Recordings::C3dFrameSpan& rSpan : Recordings::C3dFrameSpans(header, parameters))
            spans += std::to_string(rSpan.First) + "+" + std::to_string(rSpan.Count) + " ";
        EXPECT_EQ(spans, rCase.pSpans) << rCase.pName;
    }
}

TEST(C3dKinds, MoreFramesThanTheHeaderCanSay)
{
    constexpr unsigned frames = 70000;
    struct Case
    {
        const char* Name;
        unsigned First;
        unsigned HeaderLast;
        std::vector<ParameterSpec> Parameters;
        std::size_t Expected;
    };
    const Case cases[] = {
        {"fields",
         1,
         65535,
         {Integers("TRIAL", "ACTUAL_START_FIELD", {1, 0}), Integers("TRIAL", "ACTUAL_END_FIELD", {4464, 1})},
         frames},
        {"fields, header wrapped",
         1,
         4464,
         {Integers("POINT", "FRAMES", {4464}), Integers("TRIAL", "ACTUAL_START_FIELD", {1, 0}),
          Integers("TRIAL", "ACTUAL_END_FIELD", {4464, 1})},
         frames},
        {"fields that start late",
         101,
         65535,
         {Integers("TRIAL", "ACTUAL_START_FIELD", {101, 0}), Integers("TRIAL", "ACTUAL_END_FIELD", {4564, 1})},
         frames},
        {"long frames",
         1,
         65535,
         {Integers("POINT", "FRAMES", {65535}), Reals("POINT", "LONG_FRAMES", {frames})},
         frames},
        {"frames as a real", 1, 65535, {Reals("POINT", "FRAMES", {frames})}, frames},
        {"nonsense in the fields",
         1,
         300,
         {Integers("TRIAL", "ACTUAL_START_FIELD", {9, 9}), Integers("TRIAL", "ACTUAL_END_FIELD", {1, 0})},
         300},
        {"fields that the size denies",
         1,
         300,
         {Integers("TRIAL", "ACTUAL_START_FIELD", {1, 0}), Integers("TRIAL", "ACTUAL_END_FIELD", {1, 90})},
         300},
    };
    C3dSpec spec;
    spec.bReal = false;
    spec.Points = 1;
    for (unsigned frame = 0; frame < frames; ++frame)
        spec.Frames.push_back({static_cast<double>(frame % 30000), 0.0, 0.0, 0.0});
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.Name);
        spec.FirstFrame = rCase.First;
        spec.LastFrame = rCase.HeaderLast;
        spec.Parameters = rCase.Parameters;
        const VRecording recording = Read(spec);
        ASSERT_EQ(recording.Channels.size(), 1u);
        ASSERT_EQ(recording.Channels[0].RowCount(), rCase.Expected);
        EXPECT_EQ(recording.Channels[0].FirstTick, (rCase.First - 1) * 1350000);
        EXPECT_EQ(recording.Channels[0].Samples[3 * (rCase.Expected - 1)],
                  static_cast<float>((rCase.Expected - 1) % 30000));
    }

    // Cut short, the full number is still what it is measured against, not the low word of it.
    spec.FirstFrame = 1;
    spec.LastFrame = 65535;
    spec.Parameters = cases[1].Parameters;
    BuiltC3d built = BuildC3d(spec);
    built.Bytes.resize(built.DataOffset + 50000 * 8 + 3);
    VRecording recording;
    std::string error;
    ASSERT_TRUE(Recordings::ReadC3d(built.Bytes, {}, recording, error).IsSuccess()) << error;
    EXPECT_EQ(recording.Channels[0].RowCount(), 50000u);
    ASSERT_EQ(recording.Warnings.size(), 1u);
    EXPECT_TRUE(recording.Warnings[0].starts_with("The file ends after frame 50000 of 70000;"))
        << recording.Warnings[0];
}

} // namespace TestRecordings

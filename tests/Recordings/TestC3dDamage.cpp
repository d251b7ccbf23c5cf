#include "C3dBuilder.h"
#include "RecordingText.h"

#include "Recordings/C3d/C3dReader.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <string>
#include <vector>

namespace TestRecordings
{

using Recordings::EProcessor;
using Recordings::VRecording;

namespace
{

C3dSpec DamageSpec()
{
    C3dSpec spec = SmallSpec(EProcessor::Intel, false);
    spec.Events = {{"RHS", 0.5}};
    spec.Parameters.push_back(Integers("TRIAL", "ACTUAL_START_FIELD", {11, 0}));
    spec.Parameters.push_back(Integers("TRIAL", "ACTUAL_END_FIELD", {13, 0}));
    spec.Parameters.push_back(Integers("EVENT", "USED", {1}));
    spec.Parameters.push_back(Texts("EVENT", "LABELS", {"Off"}));
    spec.Parameters.push_back(Reals("EVENT", "TIMES", {0, 1}));
    return spec;
}

// Where a name stands for the first time.
std::vector<std::byte>::iterator PlaceOf(const std::string& i_rName, std::vector<std::byte>& io_rBytes)
{
    return std::search(io_rBytes.begin(), io_rBytes.end(), i_rName.begin(), i_rName.end(),
                       [](std::byte i_Byte, char i_Character) { return static_cast<char>(i_Byte) == i_Character; });
}

// What must hold of any file: an error in one line, or samples that the file has room for.
void ReadAnything(const std::vector<std::byte>& i_rBytes, const std::string& i_rWhat)
{
    VRecording recording;
    recording.Name = "before";
    std::string error;
    if (Recordings::ReadC3d(i_rBytes, {}, recording, error).IsError())
    {
        ASSERT_EQ(recording.Name, "before") << i_rWhat;
        ASSERT_TRUE(error.ends_with(".") && error.find('\n') == std::string::npos) << i_rWhat << error;
        return;
    }
    std::size_t samples = 0;
    for (const Recordings::RecordedChannel& rChannel : recording.Channels)
    {
        ASSERT_GT(rChannel.SamplePeriod, 0) << i_rWhat;
        ASSERT_GE(rChannel.GetTickRange().Last, rChannel.FirstTick) << i_rWhat;
        samples += rChannel.Samples.capacity();
    }
    ASSERT_LE(samples * 2, i_rBytes.size()) << i_rWhat; // a sample is at least two bytes of the file
    ASSERT_LE(recording.Events.size(), i_rBytes.size()) << i_rWhat;
    ASSERT_FALSE(recording.Range.IsEmpty()) << i_rWhat;
}

} // namespace

TEST(C3dDamage, EveryByteOfHeaderAndParametersChanged)
{
    const BuiltC3d built = BuildC3d(DamageSpec());
    for (std::size_t place = 0; place < built.DataOffset; ++place)
        for (const int value : {0x00, 0x01, 0x7F, 0x80, 0xFF})
        {
            std::vector<std::byte> bytes = built.Bytes;
            bytes[place] = static_cast<std::byte>(value);
            ReadAnything(bytes, std::to_string(place) + " = " + std::to_string(value) + ": ");
            if (HasFatalFailure())
                return;
        }
}

TEST(C3dDamage, ManyBytesChangedAtOnce)
{
    const BuiltC3d built = BuildC3d(DamageSpec());
    std::mt19937 random(20);
    for (int round = 0; round < 20000; ++round)
    {
        std::vector<std::byte> bytes = built.Bytes;
        const auto changes = 1 + random() % 8;
        for (unsigned i = 0; i < changes; ++i)
            bytes[4 + random() % (built.DataOffset - 4)] = static_cast<std::byte>(random());
        ReadAnything(bytes, "round " + std::to_string(round) + ": ");
        if (HasFatalFailure())
            return;
    }
}

TEST(C3dDamage, EveryLength)
{
    const BuiltC3d built = BuildC3d(DamageSpec());
    for (std::size_t length = 0; length < built.Bytes.size(); ++length)
    {
        std::vector<std::byte> bytes(built.Bytes.begin(), built.Bytes.begin() + static_cast<std::ptrdiff_t>(length));
        bytes.shrink_to_fit();
        ReadAnything(bytes, std::to_string(length) + ": ");
        if (HasFatalFailure())
            return;
    }
}

TEST(C3dDamage, SaysWhatIsWrong)
{
    using Bytes = std::vector<std::byte>;
    struct Case
    {
        const char* Message; ///< its start
        void (*pChange)(const BuiltC3d& i_rBuilt, Bytes& io_rBytes);
    };
    const Case cases[] = {
        {"this is not a C3D file: its mark is missing. ",
         [](const BuiltC3d&, Bytes& io_r)
         {
             io_r[1] = std::byte{'Q'};
         }},
        {"the file ends inside its header. ",
         [](const BuiltC3d&, Bytes& io_r)
         {
             io_r.resize(511);
         }},
        {"the file ends before its parameters. ",
         [](const BuiltC3d&, Bytes& io_r)
         {
             io_r.resize(512);
         }},
        {"the header does not point to the parameters. ",
         [](const BuiltC3d&, Bytes& io_r)
         {
             io_r[0] = std::byte{1};
         }},
        {"the parameter section names an unknown processor (87). ",
         [](const BuiltC3d&, Bytes& io_r)
         {
             io_r[515] = std::byte{87};
         }},
        {"the file ends inside its parameter section. ",
         [](const BuiltC3d&, Bytes& io_r)
         {
             io_r.resize(700);
         }},
        {"the parameter section is damaged behind POINT. ", // the type of the first parameter
         [](const BuiltC3d&, Bytes& io_r)
         {
             *(PlaceOf("USED", io_r) + 6) = std::byte{9};
         }},
        {"the parameter section is damaged behind FRAMES. ", // a list longer than the section
         [](const BuiltC3d&, Bytes& io_r)
         {
             std::fill_n(PlaceOf("LABELS", io_r) + 10, 2, std::byte{255});
         }},
        {"the parameter section is damaged behind USED. ", // a record that points into itself
         [](const BuiltC3d&, Bytes& io_r)
         {
             *(PlaceOf("SCALE", io_r) + 5) = std::byte{3};
         }},
        {"the file ends before its first frame is complete. ",
         [](const BuiltC3d& i_rBuilt, Bytes& io_r)
         {
             io_r.resize(i_rBuilt.DataOffset + 23);
         }},
    };
    C3dSpec spec = SmallSpec(EProcessor::Intel, false);
    for (const Case& rCase : cases)
    {
        const BuiltC3d built = BuildC3d(spec);
        Bytes bytes = built.Bytes;
        rCase.pChange(built, bytes);
        VRecording recording;
        std::string error;
        EXPECT_TRUE(Recordings::ReadC3d(bytes, {}, recording, error).IsError());
        EXPECT_TRUE(error.starts_with(rCase.Message)) << error;
    }
}

TEST(C3dDamage, BehindWhatTheValuesNeedIsAWarning)
{
    C3dSpec spec = SmallSpec(EProcessor::Intel, false);
    ParameterSpec damaged = Integers("POINT", "ZZZ", {1});
    damaged.Type = 9;
    spec.Parameters.push_back(damaged);
    VRecording recording;
    std::string error;
    ASSERT_TRUE(Recordings::ReadC3d(BuildC3d(spec).Bytes, {}, recording, error).IsSuccess()) << error;
    ASSERT_EQ(recording.Warnings.size(), 1u);
    EXPECT_TRUE(recording.Warnings[0].starts_with("The parameter section is damaged behind UNITS;"))
        << recording.Warnings[0];
}

} // namespace TestRecordings

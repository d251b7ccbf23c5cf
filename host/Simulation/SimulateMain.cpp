// Writes a recording of the simulated capture: graphplots-simulate OUT.c3d [--seconds N] [--subjects N] [--seed N]

#include "Recordings/C3d/C3dWriter.h"
#include "Simulation/RecordWalk.h"
#include "Simulation/VWalkSimulator.h"

#include <charconv>
#include <cmath>
#include <cstdio>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace
{

struct Arguments
{
    std::string Path;
    double Seconds = 10.0;
    Simulation::VWalkSimulator::Options Options;
};

template <typename T>
bool ReadNumber(std::string_view i_Text, T i_Low, T i_High, T& o_rValue)
{
    T value{};
    const auto [pRest, error] = std::from_chars(i_Text.data(), i_Text.data() + i_Text.size(), value);
    if (error != std::errc() || pRest != i_Text.data() + i_Text.size() || !(value >= i_Low && value <= i_High))
        return false;
    o_rValue = value;
    return true;
}

bool ReadOption(std::string_view i_Name, std::string_view i_Text, Arguments& o_rArguments, std::string& o_rError)
{
    bool bFits = false;
    if (i_Name == "--seconds")
        bFits = ReadNumber(i_Text, 0.01, 36000.0, o_rArguments.Seconds);
    else if (i_Name == "--subjects")
        bFits = ReadNumber<std::uint32_t>(i_Text, 1, 16, o_rArguments.Options.Subjects);
    else if (i_Name == "--seed")
        bFits = ReadNumber<std::uint64_t>(i_Text, 0, ~std::uint64_t{0}, o_rArguments.Options.Seed);
    else
    {
        o_rError = "unknown option " + std::string(i_Name) + "; there are --seconds N, --subjects N and --seed N";
        return false;
    }
    if (!bFits)
        o_rError = std::string(i_Name) + " cannot be \"" + std::string(i_Text) +
                   "\"; seconds go from 0.01 to 36000, subjects from 1 to 16, a seed is a whole number";
    return bFits;
}

bool Parse(std::span<const std::string> i_Words, Arguments& o_rArguments, std::string& o_rError)
{
    for (std::size_t i = 0; i < i_Words.size(); ++i)
    {
        const std::string& rWord = i_Words[i];
        if (rWord.starts_with("--"))
        {
            const std::string text = i + 1 < i_Words.size() ? i_Words[i + 1] : "";
            if (!ReadOption(rWord, text, o_rArguments, o_rError))
                return false;
            ++i;
        }
        else if (o_rArguments.Path.empty())
            o_rArguments.Path = rWord;
        else
        {
            o_rError = "takes one path, not also \"" + rWord + "\"";
            return false;
        }
    }
    if (o_rArguments.Path.empty())
        o_rError = "needs the path of the C3D file to write";
    return !o_rArguments.Path.empty();
}

} // namespace

int main(int i_ArgumentCount, char** i_ppArguments)
{
    const std::vector<std::string> words(i_ppArguments + 1, i_ppArguments + i_ArgumentCount);
    Arguments arguments;
    std::string error;
    bool bDone = Parse(words, arguments, error);
    if (bDone)
    {
        const Simulation::VWalkSimulator simulator(arguments.Options);
        const auto frames = std::llround(arguments.Seconds * Simulation::VWalkSimulator::FrameRate);
        const Recordings::VRecording recording = Simulation::RecordWalk(simulator, 0, frames);
        bDone = Recordings::WriteC3d(recording, arguments.Path, error).IsSuccess();
    }
    if (bDone)
        return 0;
    std::fprintf(stderr, "graphplots-simulate: %s\n", error.c_str());
    return 2;
}

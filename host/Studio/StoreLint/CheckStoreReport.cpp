#include "Studio/StoreLint/CheckStoreReport.h"

#include "Services/VGlobalLogSink.h"
#include "Store/VStore.h"
#include "StoreIO/VStoreImporterJson.h"
#include "StoreInterface/ScopedAccess.h"
#include "Studio/StoreLint/StoreFileLint.h"
#include "Studio/StoreLint/StoreText.h"
#include "TQL/TextStream.h"

#include <algorithm>
#include <span>
#include <vector>

namespace Studio
{
namespace
{

constexpr std::size_t s_MostLines = 100;

/// What an application would get from the file: as a tree, and the errors that it would log.
std::string ReadAsApplication(std::string_view i_Text, std::vector<TextProblem>& o_rErrors)
{
    const Services::VGlobalLogSink sink(s_MostLines + 1, nullptr, nullptr);
    const auto pStore = TQL::MakeShared<Store::VStore>();
    StoreIO::VStoreImporterJson importer;
    TQL::VTextInput stream(i_Text);
    TQL::IResult result = importer.ReadStream(stream);
    if (result.IsSuccess())
    {
        const TQL::ScopedWrite writer(*pStore);
        result = importer.Import(*writer);
    }
    for (const auto& rLine : sink.Lines())
        o_rErrors.push_back({0, {}, rLine.Text});
    if (result.IsError() && o_rErrors.empty())
        o_rErrors.push_back({0, {}, std::string(result.Description())});
    const TQL::ScopedRead reader(*pStore);
    return FormatStoreTree(*reader);
}

std::string FormatProblem(const std::string& i_rName, std::string_view i_Text, const TextProblem& i_rProblem)
{
    const TextPosition position = FindPosition(i_Text, i_rProblem.Offset);
    return i_rName + ":" + std::to_string(position.Line) + ":" + std::to_string(position.Column) + ": " +
           i_rProblem.Path + (i_rProblem.Path.empty() ? "" : ": ") + i_rProblem.Text + "\n";
}

} // namespace

CheckStoreReport MakeCheckStoreReport(const std::string& i_rName, std::string_view i_Text)
{
    CheckStoreReport report;
    std::vector<TextProblem> problems;
    LocatedValue root;
    if (auto problem = ParseLocated(i_Text, root))
        problems.push_back(std::move(*problem));
    else
    {
        problems = FindStoreProblems(i_Text, root);
        std::vector<TextProblem> errors;
        report.Text = ReadAsApplication(i_Text, errors);
        if (problems.empty()) // else they say the same with its place
            problems = std::move(errors);
    }
    report.Problems = problems.size();
    report.Text += report.Text.empty() ? "" : "\n";
    for (const TextProblem& rProblem : std::span(problems).first(std::min(problems.size(), s_MostLines)))
        report.Text += FormatProblem(i_rName, i_Text, rProblem);
    if (problems.size() > s_MostLines)
        report.Text += "...\n";
    report.Text += i_rName + ": " + (problems.empty() ? "no" : std::to_string(problems.size())) +
                   (problems.size() == 1 ? " problem\n" : " problems\n");
    return report;
}

} // namespace Studio

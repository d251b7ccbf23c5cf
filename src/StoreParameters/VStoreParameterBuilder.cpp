#include "StoreParameters/VStoreParameterBuilder.h"

#include "StoreInterface/IStore.h"
#include "StoreParameters/CategoryOrder.h"
#include "StoreParameters/ParameterLog.h"

#include <boost/algorithm/string/join.hpp>
#include <boost/range/iterator_range.hpp>

#include <algorithm>
#include <cstddef>
#include <utility>

namespace Store
{
namespace
{

constexpr const char* s_pTaken =
    "Cannot make parameter tuple for '%1%', the parameter '%2%' already belongs to a tuple '%3%'.";

bool Contains(std::span<const EntryHandle> i_Handles, EntryHandle i_Handle)
{
    return std::ranges::find(i_Handles, i_Handle) != i_Handles.end();
}

} // namespace

VStoreParameterBuilder::VStoreParameterBuilder(TQL::IStoreWriter& io_rWriter, EntryPath i_Root)
    : m_rWriter(io_rWriter), m_Root(std::move(i_Root))
{
}

TQL::IResult VStoreParameterBuilder::AddParameter(const ParameterDefinition& i_rDefinition, EntryHandle& o_rParameter)
{
    o_rParameter = m_rWriter.GetStore().GetEntry(m_Root / i_rDefinition.Key);
    const TQL::IResult result = WriteParameter(m_rWriter, o_rParameter, i_rDefinition);
    if (result.IsError() && result != TQL::Result::InvalidValue)
        return result;
    if (m_CategoryOf.insert_or_assign(o_rParameter, CategoryOf(i_rDefinition)).second)
        m_Order.push_back(o_rParameter);
    return result;
}

TQL::IResult VStoreParameterBuilder::MakeTuple(EntryHandle i_Primary, std::span<const EntryHandle> i_Parameters)
{
    if (!MayMakeTuple(i_Primary, i_Parameters))
        return TQL::Result::InvalidArgument;
    std::erase_if(m_Order, [&](EntryHandle i_Parameter)
                  { return i_Parameter != i_Primary && Contains(i_Parameters, i_Parameter); });
    m_Tuples.push_back({i_Primary, {i_Parameters.begin(), i_Parameters.end()}, {}, {}});
    return TQL::Result::Ok;
}

bool VStoreParameterBuilder::MayMakeTuple(EntryHandle i_Primary, std::span<const EntryHandle> i_Parameters)
{
    const auto refuse = [&](const TQL::LogText& i_rText, const auto&... i_rMore)
    {
        LogParameter(TQL::ELogSeverity::Error, i_rText, Name(i_Primary), i_rMore...);
        return false;
    };
    if (i_Parameters.size() < 2)
        return refuse("Cannot make parameter tuple for '%1%' with fewer than two parameters.");
    for (const EntryHandle parameter : i_Parameters)
        if (!Owns(parameter))
            return refuse("Cannot make parameter tuple for '%1%', the parameter '%2%' does not belong to the "
                          "parameter builder.",
                          Name(parameter));
    for (std::size_t i = 0; i < i_Parameters.size(); ++i)
    {
        const TQL::ITuplePresentation* const pTuple = FindTuple(i_Parameters[i]);
        if (pTuple || Contains(i_Parameters.first(i), i_Parameters[i]))
            return refuse(s_pTaken, Name(i_Parameters[i]), Name(pTuple ? pTuple->Primary : i_Primary));
    }
    for (const EntryHandle parameter : i_Parameters)
        if (m_CategoryOf.at(parameter) != m_CategoryOf.at(i_Parameters.front()))
            return refuse("Cannot make parameter tuple for '%1%' with parameters with different categories.");
    if (!Contains(m_Order, i_Primary))
        return refuse("Cannot make parameter tuple for '%1%', the primary parameter was not found in the parameter "
                      "order list.");
    if (const TQL::ITuplePresentation* const pTuple = FindTuple(i_Primary))
        return refuse(s_pTaken, Name(i_Primary), Name(pTuple->Primary));
    return true;
}

TQL::IResult VStoreParameterBuilder::SetTupleDisplayName(EntryHandle i_Parameter, std::string i_Text)
{
    return SetTupleText(
        i_Parameter, &TQL::ITuplePresentation::DisplayName, std::move(i_Text),
        "Cannot set tuple display name for '%1%', the parameter does not belong to the parameter builder.");
}

TQL::IResult VStoreParameterBuilder::SetTupleDescription(EntryHandle i_Parameter, std::string i_Text)
{
    return SetTupleText(
        i_Parameter, &TQL::ITuplePresentation::Description, std::move(i_Text),
        "Cannot set tuple description for '%1%', the parameter does not belong to the parameter builder.");
}

TQL::IResult VStoreParameterBuilder::SetTupleText(EntryHandle i_Parameter,
                                                  std::string TQL::ITuplePresentation::*i_pField, std::string i_Text,
                                                  const char* i_pRefusal)
{
    if (!Owns(i_Parameter))
    {
        LogParameter(TQL::ELogSeverity::Error, i_pRefusal, Name(i_Parameter));
        return TQL::Result::InvalidArgument;
    }
    TQL::ITuplePresentation* const pTuple = FindTuple(i_Parameter);
    if (!pTuple)
        return TQL::Result::NotFound;
    pTuple->*i_pField = std::move(i_Text);
    return TQL::Result::Ok;
}

void VStoreParameterBuilder::SortCategories(std::span<const std::string> i_Order)
{
    const CategoryOrder sorted = OrderCategories(CategoriesInOrder(), i_Order);
    const auto unordered = boost::make_iterator_range(
        sorted.Categories.begin() + static_cast<std::ptrdiff_t>(sorted.OrderedCount), sorted.Categories.end());
    if (unordered.size() == 1)
        LogParameter(TQL::ELogSeverity::Warning,
                     "No ordering found for parameter category '%1%', the category will occur after the sorted "
                     "categories.",
                     unordered.front());
    else if (!unordered.empty())
        LogParameter(TQL::ELogSeverity::Warning,
                     "No ordering found for parameter categories '%1%', the categories will occur after the sorted "
                     "categories in alphabetical order.",
                     boost::algorithm::join(unordered, "' and '"));
    std::ranges::stable_sort(
        m_Order, {},
        [&](EntryHandle i_Parameter)
        { return std::ranges::find(sorted.Categories, m_CategoryOf.at(i_Parameter)) - sorted.Categories.begin(); });
}

ParameterPresentation VStoreParameterBuilder::GetPresentation() const
{
    return {m_Order, m_Tuples, CategoriesInOrder()};
}

const std::string& VStoreParameterBuilder::Name(EntryHandle i_Parameter) const
{
    return m_rWriter.GetStore().GetEntryPath(i_Parameter).Text();
}

TQL::ITuplePresentation* VStoreParameterBuilder::FindTuple(EntryHandle i_Parameter)
{
    const auto found =
        std::ranges::find_if(m_Tuples, [&](const TQL::ITuplePresentation& i_rTuple)
                             { return i_rTuple.Primary == i_Parameter || Contains(i_rTuple.Members, i_Parameter); });
    return found == m_Tuples.end() ? nullptr : &*found;
}

std::vector<std::string> VStoreParameterBuilder::CategoriesInOrder() const
{
    std::vector<std::string> categories;
    for (const EntryHandle parameter : m_Order)
        if (const std::string& rCategory = m_CategoryOf.at(parameter);
            std::ranges::find(categories, rCategory) == categories.end())
            categories.push_back(rCategory);
    return categories;
}

} // namespace Store

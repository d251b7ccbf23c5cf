#include "IOInterfaceQt/VResultNamespaceObjectQml.h"

#include "IOInterfaceQt/VEnumPropertyMap.h"

namespace TQL::IO
{
namespace
{

QString ToText(std::string_view i_Text)
{
    return QString::fromUtf8(i_Text.data(), static_cast<qsizetype>(i_Text.size()));
}

std::vector<VReadOnlyPropertyMap::Entry> MaskEntries()
{
    return {{"ErrorFlag", IResult::ErrorFlag}, {"ResultCategory", IResult::CategoryMask}};
}

std::vector<VReadOnlyPropertyMap::Entry> CategoryEntries()
{
    return {{"Generic", EResultCategory::Generic}, {"RPC", EResultCategory::RPC}, {"Quorl", EResultCategory::Quorl}};
}

std::vector<VReadOnlyPropertyMap::Entry> CodeEntries()
{
    std::vector<VReadOnlyPropertyMap::Entry> entries;
    for (const ResultRow& rRow : GetResultTable())
        entries.emplace_back(ToText(rRow.Name), rRow.Value.Value());
    return entries;
}

} // namespace

VResultNamespaceObjectQml::VResultNamespaceObjectQml(QObject* i_pParent) : VReadOnlyPropertyMap(this, i_pParent)
{
    const auto makeMap = [this](std::vector<Entry> i_Entries)
    {
        return QVariant::fromValue<QObject*>(new VEnumPropertyMap(std::move(i_Entries), this));
    };
    SetEntries(
        {{"Mask", makeMap(MaskEntries())}, {"Category", makeMap(CategoryEntries())}, {"Code", makeMap(CodeEntries())}});
}

QString VResultNamespaceObjectQml::description(TQL::IResult i_Result) const
{
    return ToText(i_Result.Description());
}

} // namespace TQL::IO

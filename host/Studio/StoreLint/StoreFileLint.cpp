#include "Studio/StoreLint/StoreFileLint.h"

#include "Store/ValueText.h"
#include "StoreIO/StoreFormat.h"
#include "Studio/StoreLint/StoreText.h"
#include "TQL/SchemaIntern.h"
#include "TQL/SchemaText.h"

#include <QtCore/QStringDecoder>

#include <algorithm>
#include <charconv>
#include <cstdint>
#include <limits>
#include <map>

namespace Studio
{
namespace
{

using EKind = LocatedValue::EKind;
using TQL::EType;

constexpr std::string_view s_SchemaMembers[] = {"Type",       "Role",       "Detail", "Count",  "TypeName",
                                                "EnumValues", "SubSchemas", "Docs",   "History"};

bool IsSchemaMember(std::string_view i_Name)
{
    return std::ranges::find(s_SchemaMembers, i_Name) != std::end(s_SchemaMembers);
}

const LocatedMember* Find(const LocatedValue& i_rObject, std::string_view i_Name)
{
    const auto found = std::ranges::find(i_rObject.Members, i_Name, &LocatedMember::Name);
    return found == i_rObject.Members.end() ? nullptr : &*found;
}

std::string Quoted(std::string_view i_Text)
{
    return "\"" + std::string(i_Text) + "\"";
}

std::string MemberText(const LocatedMember& i_rMember)
{
    return std::string(i_rMember.RawName) + ":" + std::string(i_rMember.Value.Raw);
}

/// The types of a kind follow one another, each of twice the size.
std::string WholeNumber(EType i_Type, EType i_Smallest)
{
    const int spare = 64 - (8 << (static_cast<int>(i_Type) - static_cast<int>(i_Smallest)));
    if (i_Smallest == EType::UInt8)
        return "a whole number from 0 to " + std::to_string(~std::uint64_t{0} >> spare);
    using Limits = std::numeric_limits<std::int64_t>;
    return "a whole number from " + std::to_string(Limits::min() >> spare) + " to " +
           std::to_string(Limits::max() >> spare);
}

std::string ExpectedEnum(const TQL::ISchema& i_rSchema)
{
    constexpr std::size_t mostNames = 12;
    std::string text = "one of";
    for (std::size_t i = 0; i < std::min(i_rSchema.EnumValues.size(), mostNames); ++i)
        text += (i == 0 ? " \"\\\"" : ", \"\\\"") + i_rSchema.EnumValues[i].Name + "\\\"\"";
    return text + (i_rSchema.EnumValues.size() > mostNames ? ", ..." : "");
}

std::string ExpectedValue(const TQL::ISchema& i_rSchema)
{
    switch (i_rSchema.Type)
    {
    case EType::Bool:
        return "true or false";
    case EType::Int8:
    case EType::Int16:
    case EType::Int32:
    case EType::Int64:
        return WholeNumber(i_rSchema.Type, EType::Int8);
    case EType::UInt8:
    case EType::UInt16:
    case EType::UInt32:
    case EType::UInt64:
        return WholeNumber(i_rSchema.Type, EType::UInt8);
    case EType::Float32:
        return "a number that a 32-bit float can hold";
    case EType::Float64:
        return "a number";
    case EType::String:
        return "a text in double quotes";
    case EType::Enum8:
    case EType::Enum16:
    case EType::Enum32:
        return ExpectedEnum(i_rSchema);
    case EType::Array:
    case EType::List:
    case EType::Tuple:
    case EType::NamedTuple:
        return "the text of a list, in double quotes, for the type " + TypeText(i_rSchema);
    case EType::Void:
    case EType::Ref:
        break;
    }
    return "no value: the type is " + TypeText(i_rSchema);
}

/// Bools and numbers stand as they are; all else is a string, and all but a String has its text form in it.
bool Fits(const TQL::ISchema& i_rSchema, const LocatedValue& i_rValue)
{
    if (i_rSchema.Type >= EType::Bool && i_rSchema.Type <= EType::Float64)
        return Store::ParseValueText(i_rSchema, i_rValue.Raw).has_value();
    return i_rValue.Kind == EKind::String &&
           (i_rSchema.Type == EType::String || Store::ParseValueText(i_rSchema, i_rValue.Text).has_value());
}

class VStoreFileLint
{
public:
    explicit VStoreFileLint(std::string_view i_Text) : m_Text(i_Text) {}

    std::vector<TextProblem> Run(const LocatedValue& i_rRoot)
    {
        CheckEncoding(i_rRoot);
        CheckRoot(i_rRoot);
        std::ranges::stable_sort(m_Problems, {}, &TextProblem::Offset);
        return std::move(m_Problems);
    }

private:
    void Add(std::string_view i_At, const std::string& i_rPath, std::string i_Text)
    {
        m_Problems.push_back({OffsetOf(i_At), i_rPath, std::move(i_Text)});
    }

    std::size_t OffsetOf(std::string_view i_Part) const
    {
        return static_cast<std::size_t>(i_Part.data() - m_Text.data());
    }

    void CheckEncoding(const LocatedValue& i_rValue)
    {
        for (const LocatedMember& rMember : i_rValue.Members)
        {
            CheckEncoding(rMember.RawName);
            CheckEncoding(rMember.Value);
        }
        if (i_rValue.Kind == EKind::String)
            CheckEncoding(i_rValue.Raw);
    }

    void CheckEncoding(std::string_view i_String)
    {
        QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless);
        (void)QString(decoder(QByteArrayView(i_String.data(), static_cast<qsizetype>(i_String.size()))));
        if (decoder.hasError())
            Add(i_String, {}, "this text is not UTF-8; save the file in that encoding");
    }

    void CheckRoot(const LocatedValue& i_rRoot)
    {
        if (i_rRoot.Kind != EKind::Object)
            return Add(i_rRoot.Raw, {}, "expected an object with \"Version\" and \"Children\"");
        CheckDuplicates(i_rRoot, {}, "the first counts");
        for (const LocatedMember& rMember : i_rRoot.Members)
            if (rMember.Name != StoreIO::VersionMember && rMember.Name != StoreIO::ChildrenMember)
                Add(rMember.RawName, {}, "unknown member " + Quoted(rMember.Name) + " is passed over");
        CheckVersion(i_rRoot);
        if (const LocatedMember* pChildren = Find(i_rRoot, StoreIO::ChildrenMember))
            CheckChildren(*pChildren, {});
        else
            Add(i_rRoot.Raw, {}, "expected a member \"Children\", an object that holds the entries");
    }

    void CheckVersion(const LocatedValue& i_rRoot)
    {
        const std::string current = Quoted(StoreIO::VersionText(StoreIO::CurrentFormat));
        const LocatedMember* pVersion = Find(i_rRoot, StoreIO::VersionMember);
        if (!pVersion)
            return Add(i_rRoot.Raw, {},
                       "expected a member \"Version\" with the value " + current + "; without it nothing is read");
        static_assert(StoreIO::LowestFormat == StoreIO::HighestFormat);
        const std::string& rText = pVersion->Value.Text;
        int major = 0, minor = 0;
        const char* pEnd = rText.data() + rText.size();
        const auto first = std::from_chars(rText.data(), pEnd, major);
        const bool bDot = first.ec == std::errc() && first.ptr != pEnd && *first.ptr == '.';
        const auto second = bDot ? std::from_chars(first.ptr + 1, pEnd, minor) : first;
        if (!bDot || second.ec != std::errc() || second.ptr != pEnd ||
            TQL::StoreVersion{major, minor} != StoreIO::CurrentFormat)
            Add(pVersion->Value.Raw, {},
                "the version is " + Shortened(pVersion->Value.Raw) + "; only " + current + " can be read");
    }

    void CheckDuplicates(const LocatedValue& i_rObject, const std::string& i_rPath, const char* i_pEffect)
    {
        std::map<std::string_view, std::string_view> first;
        for (const LocatedMember& rMember : i_rObject.Members)
            if (const auto [found, bNew] = first.emplace(rMember.Name, rMember.RawName); !bNew)
                Add(rMember.RawName, i_rPath,
                    "a second " + Quoted(rMember.Name) + " in one object, after that of line " +
                        std::to_string(FindPosition(m_Text, OffsetOf(found->second)).Line) + "; " + i_pEffect);
    }

    void CheckChildren(const LocatedMember& i_rMember, const std::string& i_rPath)
    {
        if (i_rMember.Value.Kind != EKind::Object)
            return Add(i_rMember.Value.Raw, i_rPath, "expected an object: \"Children\" holds entries by their names");
        CheckDuplicates(i_rMember.Value, i_rPath, "the last one counts");
        for (const LocatedMember& rChild : i_rMember.Value.Members)
        {
            const std::string path = i_rPath + (i_rPath.empty() ? "" : "/") + rChild.Name;
            CheckName(rChild, path);
            if (rChild.Value.Kind == EKind::Object)
                CheckEntry(rChild.Value, path);
            else
                Add(rChild.Value.Raw, path, "expected an object; the entries behind it on this level are not read");
        }
    }

    void CheckName(const LocatedMember& i_rChild, const std::string& i_rPath)
    {
        if (i_rChild.Name.empty())
            Add(i_rChild.RawName, i_rPath, "the entry's name is empty");
        else if (i_rChild.Name == "*")
            Add(i_rChild.RawName, i_rPath, "\"*\" stands for any name and is none");
        else if (i_rChild.Name.find('/') != std::string::npos)
            Add(i_rChild.RawName, i_rPath,
                "a name with '/' is taken for several entries, one inside the other: write them so");
    }

    void CheckEntry(const LocatedValue& i_rEntry, const std::string& i_rPath)
    {
        CheckDuplicates(i_rEntry, i_rPath, "the first counts");
        const LocatedMember* const values[] = {Find(i_rEntry, StoreIO::ProposedMember),
                                               Find(i_rEntry, StoreIO::ValueMember)};
        const bool bValue = values[0] || values[1];
        for (const LocatedMember& rMember : i_rEntry.Members)
        {
            if (rMember.Name == StoreIO::ChildrenMember)
                CheckChildren(rMember, i_rPath);
            else if (rMember.Name == StoreIO::ValueMember || rMember.Name == StoreIO::ProposedMember)
                continue;
            else if (!IsSchemaMember(rMember.Name))
                Add(rMember.RawName, i_rPath, "unknown member " + Quoted(rMember.Name) + " is passed over");
            else if (!bValue)
                Add(rMember.RawName, i_rPath, Quoted(rMember.Name) + " without a \"Value\" is passed over");
        }
        const TQL::ISchema* pSchema = bValue ? CheckSchema(i_rEntry, i_rPath) : nullptr;
        for (const LocatedMember* pValue : values)
            if (pValue && pSchema)
                CheckValue(*pValue, *pSchema, i_rPath);
    }

    /// Null when it cannot be read.
    const TQL::ISchema* CheckSchema(const LocatedValue& i_rEntry, const std::string& i_rPath)
    {
        if (!Find(i_rEntry, "Type"))
        {
            Add(i_rEntry.Raw, i_rPath, "expected a member \"Type\": without it the value cannot be read");
            return nullptr;
        }
        TQL::ISchema schema;
        std::string text;
        bool bGood = true;
        for (const LocatedMember& rMember : i_rEntry.Members)
        {
            if (!IsSchemaMember(rMember.Name))
                continue;
            const std::string member = MemberText(rMember);
            if (TQL::ReadSchema("{" + member + "}", schema).IsError())
            {
                Add(rMember.Value.Raw, i_rPath,
                    Quoted(rMember.Name) + " is " + Shortened(rMember.Value.Raw) +
                        (rMember.Name == "Type" ? "; no type has that name" : "; it cannot be read as such"));
                bGood = false;
            }
            text += (text.empty() ? "" : ",") + member;
        }
        if (!bGood || TQL::ReadSchema("{" + text + "}", schema).IsError())
            return nullptr;
        return &TQL::IO::GetUniqueSchema(schema);
    }

    void CheckValue(const LocatedMember& i_rMember, const TQL::ISchema& i_rSchema, const std::string& i_rPath)
    {
        const LocatedValue& rValue = i_rMember.Value;
        if (Fits(i_rSchema, rValue))
            return;
        std::string text = Quoted(i_rMember.Name) + " is " + Shortened(rValue.Raw) + "; expected ";
        // What a person forgets first: the value's own quotes inside the string's.
        if (TQL::IsEnum(i_rSchema.Type) && rValue.Kind == EKind::String && Store::EnumValue(i_rSchema, rValue.Text))
            text += "\"\\\"" + rValue.Text + "\\\"\", with the value's own quotes";
        else
            text += ExpectedValue(i_rSchema);
        Add(rValue.Raw, i_rPath, std::move(text));
    }

    const std::string_view m_Text;
    std::vector<TextProblem> m_Problems;
};

} // namespace

std::vector<TextProblem> FindStoreProblems(std::string_view i_Text, const LocatedValue& i_rRoot)
{
    return VStoreFileLint(i_Text).Run(i_rRoot);
}

} // namespace Studio

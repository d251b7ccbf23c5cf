#include "StoreIO/SchemaMembers.h"

#include "StoreIO/JsonMembers.h"
#include "StoreIO/StoreFormat.h"

#include <algorithm>
#include <string_view>

namespace StoreIO
{
namespace
{

using Json = rapidjson::Value;
using MemberIterator = Json::ConstMemberIterator;

/// What an entry object holds beside its type.
bool IsReserved(std::string_view i_Name)
{
    return i_Name == ValueMember || i_Name == ChildrenMember || i_Name == ProposedMember;
}

MemberIterator SkipReserved(MemberIterator i_Member, MemberIterator i_End)
{
    while (i_Member != i_End && IsReserved(TextOf(i_Member->name)))
        ++i_Member;
    return i_Member;
}

bool AreSame(const Json& i_rA, const Json& i_rB);

bool AreSameMembers(const Json::Member& i_rA, const Json::Member& i_rB)
{
    return TextOf(i_rA.name) == TextOf(i_rB.name) && AreSame(i_rA.value, i_rB.value);
}

/// 1 and 1.0 are different texts.
bool AreSameNumbers(const Json& i_rA, const Json& i_rB)
{
    if (i_rA.IsDouble() || i_rB.IsDouble())
        return i_rA.IsDouble() && i_rB.IsDouble() && i_rA.GetDouble() == i_rB.GetDouble();
    return i_rA == i_rB;
}

bool AreSame(const Json& i_rA, const Json& i_rB)
{
    if (i_rA.GetType() != i_rB.GetType())
        return false;
    if (i_rA.IsString())
        return TextOf(i_rA) == TextOf(i_rB);
    if (i_rA.IsNumber())
        return AreSameNumbers(i_rA, i_rB);
    if (i_rA.IsArray())
        return std::equal(i_rA.Begin(), i_rA.End(), i_rB.Begin(), i_rB.End(), AreSame);
    return !i_rA.IsObject() ||
           std::equal(i_rA.MemberBegin(), i_rA.MemberEnd(), i_rB.MemberBegin(), i_rB.MemberEnd(), AreSameMembers);
}

} // namespace

void WriteSchemaText(const Json& i_rEntry, rapidjson::StringBuffer& o_rText)
{
    o_rText.Clear();
    rapidjson::Writer<rapidjson::StringBuffer> writer(o_rText);
    writer.StartObject();
    for (const auto& rMember : i_rEntry.GetObject())
        if (!IsReserved(TextOf(rMember.name)))
        {
            writer.Key(rMember.name.GetString(), rMember.name.GetStringLength());
            rMember.value.Accept(writer);
        }
    writer.EndObject();
}

bool HaveSameSchemaText(const Json& i_rA, const Json& i_rB)
{
    MemberIterator a = SkipReserved(i_rA.MemberBegin(), i_rA.MemberEnd());
    MemberIterator b = SkipReserved(i_rB.MemberBegin(), i_rB.MemberEnd());
    while (a != i_rA.MemberEnd() && b != i_rB.MemberEnd() && AreSameMembers(*a, *b))
    {
        a = SkipReserved(++a, i_rA.MemberEnd());
        b = SkipReserved(++b, i_rB.MemberEnd());
    }
    return a == i_rA.MemberEnd() && b == i_rB.MemberEnd();
}

} // namespace StoreIO

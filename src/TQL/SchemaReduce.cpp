#include "TQL/SchemaReduce.h"

#include <algorithm>

namespace TQL
{
namespace
{

/// i_Open is how many Refs around this schema were expanded: more than there are types means that one holds itself.
IResult Expand(ISchema& io_rSchema, const SchemaTypeList& i_rTypes, std::size_t i_Open)
{
    if (io_rSchema.Type == EType::Ref)
    {
        const auto body = std::ranges::find(i_rTypes, io_rSchema.TypeName, &ISchema::TypeName);
        if (body == i_rTypes.end())
            return Result::NotFound;
        if (++i_Open > i_rTypes.size() || body->Type == EType::Ref)
            return Result::InvalidType;
        io_rSchema.Type = body->Type;
        io_rSchema.EnumValues = body->EnumValues;
        io_rSchema.SubSchemas = body->SubSchemas;
        io_rSchema.Docs = body->Docs;
    }
    for (SchemaMember& rMember : io_rSchema.SubSchemas)
    {
        const IResult result = Expand(rMember.Schema, i_rTypes, i_Open);
        if (result.IsError())
            return result;
    }
    return Result::Ok;
}

} // namespace

std::size_t ReduceSchema(ISchema& io_rSchema, SchemaTypeList& io_rTypes)
{
    std::size_t added = 0;
    for (SchemaMember& rMember : io_rSchema.SubSchemas)
        added += ReduceSchema(rMember.Schema, io_rTypes);
    if (io_rSchema.TypeName.empty() || io_rSchema.Type == EType::Ref)
        return added;
    if (std::ranges::find(io_rTypes, io_rSchema.TypeName, &ISchema::TypeName) == io_rTypes.end())
    {
        io_rTypes.push_back(io_rSchema);
        ++added;
    }
    io_rSchema.Type = EType::Ref;
    io_rSchema.EnumValues.clear();
    io_rSchema.SubSchemas.clear();
    io_rSchema.Docs.clear();
    return added;
}

IResult ExpandSchema(ISchema& io_rSchema, const SchemaTypeList& i_rTypes)
{
    ISchema expanded = io_rSchema;
    const IResult result = Expand(expanded, i_rTypes, 0);
    if (result.IsSuccess())
        io_rSchema = std::move(expanded);
    return result;
}

} // namespace TQL

#include "TQL/SchemaIntern.h"

#include <array>
#include <memory>
#include <mutex>
#include <shared_mutex>
#include <unordered_set>

namespace TQL::IO
{
namespace
{

struct ShapeHash
{
    using is_transparent = void;
    std::size_t operator()(const ISchema& i_rSchema) const noexcept { return HashShape(i_rSchema); }
    std::size_t operator()(const std::unique_ptr<const ISchema>& i_rpSchema) const noexcept
    {
        return HashShape(*i_rpSchema);
    }
};

struct ShapeEqual
{
    using is_transparent = void;
    static const ISchema& Get(const ISchema& i_rSchema) noexcept { return i_rSchema; }
    static const ISchema& Get(const std::unique_ptr<const ISchema>& i_rpSchema) noexcept { return *i_rpSchema; }

    bool operator()(const auto& i_rA, const auto& i_rB) const noexcept { return HaveSameShape(Get(i_rA), Get(i_rB)); }
};

struct Table
{
    std::shared_mutex Mutex;
    std::unordered_set<std::unique_ptr<const ISchema>, ShapeHash, ShapeEqual> Schemas; // guarded by Mutex
};

Table& GetTable()
{
    // Never destroyed: values that outlive the end of main still refer to their schemas.
    static Table& s_rTable = *new Table;
    return s_rTable;
}

} // namespace

const ISchema& GetUniqueSchema(const ISchema& i_rSchema)
{
    Table& rTable = GetTable();
    {
        const std::shared_lock lock(rTable.Mutex);
        if (const auto found = rTable.Schemas.find(i_rSchema); found != rTable.Schemas.end())
            return **found;
    }
    auto pNew = std::make_unique<const ISchema>(i_rSchema);
    const std::unique_lock lock(rTable.Mutex);
    return **rTable.Schemas.insert(std::move(pNew)).first;
}

const ISchema& GetUniquePodSchema(EType i_Type)
{
    static const auto s_Schemas = []
    {
        std::array<const ISchema*, TypeCount> schemas{};
        for (std::size_t i = 0; i < TypeCount; ++i)
            schemas[i] = &GetUniqueSchema(ISchema(static_cast<EType>(i)));
        return schemas;
    }();
    const auto index = static_cast<std::size_t>(i_Type);
    return *s_Schemas[index < TypeCount ? index : 0];
}

} // namespace TQL::IO

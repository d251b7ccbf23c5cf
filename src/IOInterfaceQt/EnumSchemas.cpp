#include "IOInterfaceQt/EnumSchemas.h"

#include "TQL/ISchema.h"

namespace TQL::IO
{

ISchema MakeEnumSchema(const QMetaEnum& i_rEnum)
{
    std::vector<SchemaEnumValue> values;
    for (int i = 0; i < i_rEnum.keyCount(); ++i)
        values.push_back({i_rEnum.key(i), i_rEnum.value(i)});
    return TQL::MakeEnumSchema(EType::Enum32, i_rEnum.enumName(), std::move(values));
}

std::vector<VEnumListModel::Row> EnumRows(const ISchema& i_rSchema)
{
    std::vector<VEnumListModel::Row> rows;
    if (!IsEnum(i_rSchema.Type))
        return rows;
    for (std::size_t i = 0; i < i_rSchema.EnumValues.size(); ++i)
    {
        const SchemaEnumValue& rValue = i_rSchema.EnumValues[i];
        const QString details =
            i + 1 < i_rSchema.Docs.size() ? QString::fromStdString(i_rSchema.Docs[i + 1]) : QString();
        rows.push_back({QString::fromStdString(rValue.Name), rValue.Value, details});
    }
    return rows;
}

} // namespace TQL::IO

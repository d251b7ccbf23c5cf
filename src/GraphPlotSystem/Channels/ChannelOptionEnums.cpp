#include "GraphPlotSystem/Channels/ChannelOptionEnums.h"

#include "IOInterfaceQt/EnumSchemas.h"
#include "TQL/ISchema.h"
#include "TQL/SchemaIntern.h"

namespace GraphPlotUI
{
namespace
{

/// Of the type, then of each value.
std::vector<std::string> RotationFormatDocs()
{
    return {
        "Supported rotation formats. See ChannelSystemUtils::VRotationTransformer for rotation representation docs.",
        "Default - axis of rotation scaled by the angle of rotation (3 components).",
        "Normalized axis of rotation and separate angle of rotation (4 components).",
        "Unit quaternion (4 components).",
        "3x3 rotation matrix",
        "Euler angle (3 components) in XYZ order.",
        "Euler angle (3 components) in XZY order.",
        "Euler angle (3 components) in YXZ order.",
        "Euler angle (3 components) in YZX order.",
        "Euler angle (3 components) in ZXY order.",
        "Euler angle (3 components) in ZYX order."};
}

template <typename T>
const TQL::ISchema* InternedSchema(std::vector<std::string> i_Docs)
{
    TQL::ISchema schema = TQL::IO::MakeEnumSchema(QMetaEnum::fromType<T>());
    schema.Docs = std::move(i_Docs);
    return &TQL::IO::GetUniqueSchema(schema);
}

} // namespace

const TQL::ISchema& RotationFormatSchema()
{
    static const TQL::ISchema* const s_pSchema =
        InternedSchema<TQL::RotationFormats::ERotationFormat>(RotationFormatDocs());
    return *s_pSchema;
}

const TQL::ISchema& RotationUnitsSchema()
{
    static const TQL::ISchema* const s_pSchema = InternedSchema<TQL::RotationUnits::ERotationUnits>({});
    return *s_pSchema;
}

const TQL::ISchema& LengthUnitsSchema()
{
    static const TQL::ISchema* const s_pSchema = InternedSchema<TQL::LengthUnits::ELengthUnits>({});
    return *s_pSchema;
}

} // namespace GraphPlotUI

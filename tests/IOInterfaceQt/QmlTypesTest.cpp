#include "QmlEvaluator.h"

#include "IOInterfaceQt/VEnumListModel.h"
#include "IOInterfaceQt/VEnumPropertyMap.h"
#include "TQL/IResult.h"
#include "TQL/ISchema.h"
#include "TQL/ITick.h"

#include <gtest/gtest.h>

namespace
{

const TQL::ISchema& FlagSchema()
{
    static const TQL::ISchema s_Schema = []
    {
        TQL::ISchema schema = TQL::MakeEnumSchema(TQL::EType::Enum32, "Flags",
                                                  {{"Nothing", 0},
                                                   {"One", 1},
                                                   {"Two", 2},
                                                   {"Both", 3},
                                                   {"Four", 4},
                                                   {"AlsoFour", 4},
                                                   {"Top", -2147483647 - 1}});
        schema.Docs = {"Flags for a test.", "No bit."};
        return schema;
    }();
    return s_Schema;
}

struct Case
{
    const char* pExpression;
    const char* pValue;
    const char* pWarning = "";
};

class QmlTypes : public ::testing::Test
{
protected:
    static void SetUpTestSuite()
    {
        for (int twice = 0; twice < 2; ++twice)
            TQL::IO::RegisterEnumMap("Test.Enums", "Flags", FlagSchema());
        TQL::IO::RegisterEnumMap("Test.Enums", "Roles", QMetaEnum::fromType<TQL::IO::VEnumListModel::EModelRoles>());
    }

    void Check(std::initializer_list<Case> i_Cases)
    {
        for (const Case& rCase : i_Cases)
        {
            SCOPED_TRACE(rCase.pExpression);
            EXPECT_EQ(m_Qml.Evaluate(rCase.pExpression), rCase.pValue);
            const std::string warnings = m_Qml.TakeWarnings();
            EXPECT_EQ(warnings, *rCase.pWarning ? std::string(rCase.pWarning) + "\n" : "");
        }
    }

    void SetContext(const char* i_pName, const QVariant& i_rValue)
    {
        m_Qml.Context().setContextProperty(QString::fromLatin1(i_pName), i_rValue);
    }

    QmlEvaluator m_Qml;
};

TEST_F(QmlTypes, EnumMapTranslatesNamesAndValues)
{
    Check({
        {"Flags.Two", "2"},
        {"[Roles.EKeyRole, Roles.EDetailsRole]", "[256,258]"},
        {"Flags.values()", "[0,1,2,3,4,4,-2147483648]"},
        {"Flags.keyToValue('Four')", "4"},
        {"Flags.keyToValue('Five')", "undefined"},
        {"Flags.keysToValue('')", "0"},
        {"Flags.keysToValue('One|Two')", "3"},
        {"Flags.keysToValue('|One||Four|')", "5"},
        {"Flags.keysToValue('Top|One')", "2147483649"},
        {"Flags.keysToValue('One|Six')", "undefined",
         "Cannot convert keys 'One|Six' to a single value, key 'Six' value is null."},
        {"Flags.valueToKey(4)", "\"Four\""},
        {"Flags.valueToKey(-2147483648)", "\"Top\""},
        {"Flags.valueToKey(9)", "undefined"},
        {"Flags.valueToKeys(0)", "\"Nothing\""},
        {"Flags.valueToKeys(3)", "\"One|Two|Both\""},
        {"Flags.valueToKeys(8)", "\"\""},
        {"Flags.valueToKeys(2147483649)", "\"One|Top\""},
        {"Flags.valueToKeys(0.5)", "undefined",
         "Cannot convert value '0.5' to a combined set of keys, value is not an integer."},
        {"Flags.valueToKeys('One')", "undefined",
         "Cannot convert value 'One' to a combined set of keys, value is not an integer."},
    });
}

TEST_F(QmlTypes, EnumMapCannotBeChangedFromQml)
{
    Check({
        {"(Flags.Two = 7, Flags.Two)", "2", "Modifying properties of a C++ singleton is not permitted."},
        {"(Flags.Eight = 8, Flags.Eight)", "undefined", "Adding properties to a C++ enum singleton is not permitted."},
        {"Flags.keyToValue('Eight')", "undefined"},
        {"(Result.Code = 1, Result.Code.Ok)", "0", "Modifying properties of a C++ singleton is not permitted."},
    });
}

TEST_F(QmlTypes, EnumMapOfOtherValues)
{
    const TQL::IO::VEnumPropertyMap map({{"Number", 1}, {"Text", QString("one")}});
    EXPECT_EQ(map.valueToKey(QString("one")), QVariant("Text"));
    EXPECT_TRUE(map.keysToValue("Number|Text").isNull());
    EXPECT_EQ(m_Qml.TakeWarnings(),
              "Cannot convert keys 'Number|Text' to a single value, key 'Text' value 'one' is not an integer.\n");
    EXPECT_TRUE(TQL::IO::VEnumPropertyMap(TQL::ISchema(TQL::EType::Int32)).values().isEmpty());
}

TEST_F(QmlTypes, Results)
{
    SetContext("partial", QVariant::fromValue(TQL::Result::OkButPartial));
    SetContext("present", QVariant::fromValue(TQL::Result::AlreadyPresent));
    SetContext("bundle", QVariant::fromValue(TQL::Result::HalBundleInUse));
    Check({
        {"[Result.isOk(partial), Result.isError(partial), Result.code(partial)]", "[true,false,2]"},
        {"[Result.isOk(present), Result.isError(present), Result.code(present)]", "[false,true,2147483660]"},
        {"Result.code(present) === Result.Code.AlreadyPresent", "true"},
        {"Result.description(present)", "\"AlreadyPresent: The data or item being set was already present\""},
        {"Result.category(present) === Result.Category.Generic", "true"},
        {"Result.category(bundle) === Result.Category.Quorl", "true"},
        {"Result.isError(Result.Code.RPCFailed)", "true"},
        {"Result.category(Result.Code.RPCFailed)", "65536"},
        {"Result.isOk(0)", "true"},
        {"Result.description(2147483904)", "\"Unknown result code\""},
        {"Result.Mask.ErrorFlag", "2147483648"},
        {"Result.Mask.ResultCategory", "2147418112"},
        {"Result.Code.values().length", "64"},
        {"Result.Code.valueToKey(2147483660)", "\"AlreadyPresent\""},
    });
}

TEST_F(QmlTypes, Schemas)
{
    SetContext("flags", QVariant::fromValue(FlagSchema()));
    const std::pair<const char*, TQL::EType> types[] = {
        {"bool", TQL::EType::Bool},       {"int8", TQL::EType::Int8},       {"uint64", TQL::EType::UInt64},
        {"float32", TQL::EType::Float32}, {"float64", TQL::EType::Float64}, {"string", TQL::EType::String},
        {"list", TQL::EType::List},       {"void", TQL::EType::Void}};
    for (const auto& [pName, type] : types)
        SetContext((std::string(pName) + "_").c_str(), QVariant::fromValue(TQL::ISchema(type)));
    Check({
        {"[bool_, int8_, uint64_, float32_, float64_, string_, list_, void_, flags].map(schema => "
         "['isBool', 'isInt', 'isFloat', 'isString', 'isEnum'].filter(name => ISchemaRegistry[name](schema)).join())",
         R"(["isBool","isInt","isInt","isFloat","isFloat","isString","","","isEnum"])"},
        {"ISchemaRegistry.enumValueToKey(flags, 4)", "\"Four\""},
        {"ISchemaRegistry.enumValueToKey(flags, 5)", "undefined"},
        {"ISchemaRegistry.enumKeyToValue(flags, 'Both')", "3"},
        {"ISchemaRegistry.enumKeyToValue(flags, 'both')", "undefined"},
        {"[ISchemaRegistry.enumKeyCount(flags), ISchemaRegistry.enumKeyCount(int8_)]", "[7,0]"},
        {"[ISchemaRegistry.enumKey(flags, 1), ISchemaRegistry.enumValue(flags, 3)]", "[\"One\",3]"},
        {"ISchemaRegistry.enumKey(flags, 7)", "undefined"},
        {"ISchemaRegistry.enumValue(flags, -1)", "undefined"},
        {"ISchemaRegistry.enumKey(string_, 0)", "undefined"},
        {"ISchemaRegistry.enumModel(flags).findFirstValueIndex(4)", "4"},
        {"ISchemaRegistry.enumModel(flags).data(ISchemaRegistry.enumModel(flags).index(0, 0), "
         "EnumListModel.EDetailsRole)",
         "\"No bit.\""},
        {"ISchemaRegistry.enumModel(int8_).rowCount()", "0"},
    });
    QQmlEngine engine;
    QQmlComponent component(&engine);
    component.setData("import Zarvo.Introspection\nEnumListModel {}", QUrl());
    EXPECT_EQ(component.errorString().toStdString(), ":2 EnumListModel can only be created from c++.\n");
}

TEST_F(QmlTypes, Ticks)
{
    SetContext("tick", QVariant::fromValue(TQL::ITick{202'500'000}));
    SetContext("period", QVariant::fromValue(TQL::ITick{TQL::DefaultFramePeriod}));
    Check({
        {"[tick.seconds, tick.milliseconds, tick.microseconds, tick.tickRateInHz]", "[1.5,1500,1500000,135000000]"},
        {"tick.advance(120, period).seconds", "1"},
        {"tick.advance(-1.5, period).milliseconds", "-12.5"},
        {"tick.advance(1e300 * 1e300, period).seconds", "0"},
        {"[['seconds', -2], ['milliseconds', 250], ['microseconds', 1e30], ['seconds', NaN]].map(([unit, number]) => "
         "{ const moved = tick.advance(60, period); moved[unit] = number; return moved.seconds })",
         "[-2,0.25,0.5,0.5]"},
    });
}

} // namespace

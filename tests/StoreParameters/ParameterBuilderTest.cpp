#include "ParameterFixture.h"
#include "StoreParameters/VStoreParameterBuilder.h"

#include <gtest/gtest.h>

#include <vector>

namespace
{

using namespace ParameterTest;

/// The order of the parameters with tuples in brackets behind their primary, then the categories.
std::string Describe(const TQL::IStore& i_rStore, const ParameterPresentation& i_rPresentation)
{
    const auto leaf = [&](EntryHandle i_Entry)
    {
        return std::string(i_rStore.GetEntryPath(i_Entry).Leaf());
    };
    std::string text;
    for (const EntryHandle parameter : i_rPresentation.Parameters)
    {
        text += leaf(parameter) + " ";
        for (const TQL::ITuplePresentation& rTuple : i_rPresentation.Tuples)
        {
            if (rTuple.Primary != parameter)
                continue;
            text += "[ ";
            for (const EntryHandle member : rTuple.Members)
                text += leaf(member) + " ";
            text += rTuple.DisplayName + rTuple.Description + "] ";
        }
    }
    for (const std::string& rCategory : i_rPresentation.Categories)
        text += "|" + rCategory;
    return text;
}

class ParameterBuilder : public testing::Test
{
protected:
    void TearDown() override { m_pStore->EndWrite(); }
    EntryHandle Add(const char* i_pKey, const char* i_pCategory)
    {
        EntryHandle entry;
        EXPECT_TRUE(m_Builder.AddParameter(Define(i_pKey, {{"<Category>", i_pCategory}}), entry).IsSuccess());
        return entry;
    }
    std::string Presented() const { return Describe(*m_pStore, m_Builder.GetPresentation()); }

    const std::shared_ptr<TQL::IStore> m_pStore = MakeStore();
    TestSupport::LogGuard m_Log;
    VStoreParameterBuilder m_Builder{*m_pStore->BeginWrite(), EntryPath("Root")};
};

TEST_F(ParameterBuilder, TuplesAreMadeOfFreeParametersOfOneCategory)
{
    const EntryHandle x = Add("X", "Place");
    const EntryHandle y = Add("Y", "Place");
    const EntryHandle z = Add("Z", "Place");
    const EntryHandle a = Add("A", "Place");
    const EntryHandle b = Add("B", "Other");
    const EntryHandle foreign = m_pStore->GetEntry(EntryPath("Elsewhere/F"));
    ASSERT_TRUE(m_Builder.MakeTuple(y, std::vector{x, y}).IsSuccess());
    ASSERT_EQ(Presented(), "Y [ X Y ] Z A B |Place|Other");

    const std::string start = "2 Cannot make parameter tuple for '";
    const struct
    {
        EntryHandle Primary;
        std::vector<EntryHandle> Parameters;
        std::string Message;
    } s_Refused[] = {
        {z, {z}, "Root/Z' with fewer than two parameters."},
        {z, {z, foreign}, "Root/Z', the parameter 'Elsewhere/F' does not belong to the parameter builder."},
        {z, {z, {}}, "Root/Z', the parameter '' does not belong to the parameter builder."},
        {z, {z, x}, "Root/Z', the parameter 'Root/X' already belongs to a tuple 'Root/Y'."},
        {z, {z, z}, "Root/Z', the parameter 'Root/Z' already belongs to a tuple 'Root/Z'."},
        {y, {z, a}, "Root/Y', the parameter 'Root/Y' already belongs to a tuple 'Root/Y'."},
        {z, {z, b}, "Root/Z' with parameters with different categories."},
        {foreign, {z, a}, "Elsewhere/F', the primary parameter was not found in the parameter order list."},
        {x, {z, a}, "Root/X', the primary parameter was not found in the parameter order list."},
    };
    for (const auto& rCase : s_Refused)
    {
        EXPECT_TRUE(m_Builder.MakeTuple(rCase.Primary, rCase.Parameters).IsError()) << rCase.Message;
        EXPECT_EQ(TakeLog(m_Log), start + rCase.Message + "\n");
    }

    EXPECT_TRUE(m_Builder.SetTupleDisplayName(y, "Position").IsSuccess());
    EXPECT_TRUE(m_Builder.SetTupleDescription(x, " in metres ").IsSuccess());
    EXPECT_EQ(m_Builder.SetTupleDisplayName(z, "None"), TQL::Result::NotFound);
    EXPECT_TRUE(m_Builder.SetTupleDisplayName(foreign, "None").IsError());
    EXPECT_TRUE(m_Builder.SetTupleDescription(foreign, "None").IsError());
    EXPECT_EQ(TakeLog(m_Log), "2 Cannot set tuple display name for 'Elsewhere/F', the parameter does not belong to the "
                              "parameter builder.\n2 Cannot set tuple description for 'Elsewhere/F', the parameter "
                              "does not belong to the parameter builder.\n");
    EXPECT_EQ(Presented(), "Y [ X Y Position in metres ] Z A B |Place|Other");
}

TEST_F(ParameterBuilder, CategoriesAreSortedAndParametersKeepTheirOrderInside)
{
    Add("C1", "C");
    Add("A1", "A");
    Add("B1", "B");
    Add("A2", "A");
    Add("C1", "C"); // again: no second place
    EXPECT_EQ(Presented(), "C1 A1 B1 A2 |C|A|B");
    m_Builder.SortCategories(std::vector<std::string>{"B", "Absent", "A"});
    EXPECT_EQ(Presented(), "B1 A1 A2 C1 |B|A|C");
    EXPECT_EQ(TakeLog(m_Log), "3 No ordering found for parameter category 'C', the category will occur after the "
                              "sorted categories.\n");
    m_Builder.SortCategories(std::vector<std::string>{"C"});
    EXPECT_EQ(Presented(), "C1 A1 A2 B1 |C|A|B");
    EXPECT_EQ(TakeLog(m_Log), "3 No ordering found for parameter categories 'A' and 'B', the categories will occur "
                              "after the sorted categories in alphabetical order.\n");
    m_Builder.SortCategories(std::vector<std::string>{"A", "B", "C"});
    EXPECT_EQ(TakeLog(m_Log), "");
}

TEST_F(ParameterBuilder, SortingKeepsTheOrderOfManyParametersOfACategory)
{
    std::string odd;
    std::string even;
    for (int i = 0; i < 60; ++i)
    {
        const std::string key = "P" + std::to_string(i);
        Add(key.c_str(), i % 2 ? "Odd" : "Even");
        (i % 2 ? odd : even) += key + " ";
    }
    m_Builder.SortCategories(std::vector<std::string>{"Odd", "Even"});
    EXPECT_EQ(Presented(), odd + even + "|Odd|Even");
}

TEST_F(ParameterBuilder, AnEntryOfAnotherTypeDoesNotBecomeAParameter)
{
    const EntryHandle first = Add("P", "Place");
    EntryHandle second;
    EXPECT_EQ(m_Builder.AddParameter(Define("Q", {{"<DefaultValue>", "x"}}), second), TQL::Result::InvalidValue);
    EXPECT_EQ(m_Builder.AddParameter(Define("P", {}, TQL::EType::Bool), second), TQL::Result::InvalidType);
    EXPECT_EQ(second, first);
    EXPECT_EQ(m_Builder.AddParameter(Define("*"), second), TQL::Result::NotFound);
    EXPECT_EQ(m_Log.Take().size(), 2u);
    EXPECT_EQ(Presented(), "P Q |Place|General");
}

} // namespace

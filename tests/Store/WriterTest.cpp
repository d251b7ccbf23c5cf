#include "StoreInterface/IEntryEditor.h"
#include "StoreScript.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

namespace
{

using Store::EntryHandle;
using Store::EntryPath;
using Store::MakeValue;
using StoreTest::StoreScript;
using TQL::ScopedRead;
using TQL::ScopedWrite;

std::string Leaves(const TQL::IStoreReader& i_rReader, const std::vector<EntryHandle>& i_rEntries)
{
    std::string text;
    for (const EntryHandle entry : i_rEntries)
        text += i_rReader.GetStore().GetEntryPath(entry).Text() + ' ';
    return text;
}

TEST(EntryPaths, KnowTheirParts)
{
    struct Row
    {
        const char* pText;
        const char* pParent;
        const char* pLeaf;
        std::size_t Wildcard;
    };
    constexpr std::size_t none = EntryPath::NoWildcard;
    const Row rows[] = {{"", "", "", none},     {"A", "", "A", none},      {"A/B", "A", "B", none},
                        {"/A", "", "A", none},  {"A//B", "A/", "B", none}, {"A/", "A", "", none},
                        {"*", "", "*", 0},      {"A/*/B", "A/*", "B", 2},  {"Speed*", "", "Speed*", none},
                        {"A*/*", "A*", "*", 3}, {"A/*/*", "A/*", "*", 2}};
    for (const Row& rRow : rows)
    {
        SCOPED_TRACE(rRow.pText);
        const EntryPath path(rRow.pText);
        EXPECT_EQ(path.ParentText(), rRow.pParent);
        EXPECT_EQ(path.Leaf(), rRow.pLeaf);
        EXPECT_EQ(path.WildcardPosition(), rRow.Wildcard);
        if (path.ParentText() == path.Parent().Text() && !path.IsRoot() && rRow.pText[0] != '/')
        {
            EXPECT_EQ(path.Parent() / path.Leaf(), path);
            EXPECT_EQ((path.Parent() / path.Leaf()).WildcardPosition(), rRow.Wildcard);
        }
    }
    EXPECT_EQ(EntryPath("").Hash(), 0u);
    EXPECT_EQ(EntryPath("\xFF").Hash(), TQL::HashMix(0, ~std::uint64_t{0})) << "bytes count as signed numbers";
    EXPECT_EQ(EntryPath("a/\xFF").Hash(), TQL::HashText("a/\xFF"));
}

TEST(StoreWriter, SeesWhatIsStaged)
{
    StoreScript script;
    script.Write("A/C=1 A/A=1 A/E/X=1");
    {
        ScopedWrite writer(script.Get());
        const EntryHandle a = script.Entry("A");
        EXPECT_TRUE(writer->SetValue(script.Entry("A/D"), MakeValue(4)).IsSuccess());
        EXPECT_TRUE(writer->SetValue(script.Entry("A/B"), MakeValue(2)).IsSuccess());
        EXPECT_TRUE(writer->RemoveEntry(script.Entry("A/B")).IsSuccess());
        EXPECT_TRUE(writer->SetValue(script.Entry("A/B"), MakeValue(3)).IsSuccess());
        EXPECT_TRUE(writer->RemoveEntry(script.Entry("A/C")).IsSuccess());
        EXPECT_EQ(writer->RemoveEntry(script.Entry("A/C")), TQL::Result::NotFound);
        EXPECT_EQ(writer->RemoveEntry(script.Entry("Nothing")), TQL::Result::NotFound);
        EXPECT_EQ(Leaves(*writer, writer->GetChildren(a)), "A/A A/B A/D A/E ");
        EXPECT_EQ(writer->GetChildCount(a), 4u);
        EXPECT_EQ(writer->FindChild(a, "B"), script.Entry("A/B"));
        EXPECT_FALSE(writer->FindChild(a, "C"));
        EXPECT_FALSE(writer->FindChild(a, "E/X"));
        EXPECT_EQ(Leaves(*writer, writer->FindEntries(EntryPath("*/*"))), "A/A A/B A/D A/E ");
        EXPECT_EQ(Leaves(*writer, writer->FindEntries(EntryPath("*/E/*"))), "A/E/X ");
        EXPECT_EQ(Leaves(*writer, writer->FindEntries(EntryPath("A/C"))), "");

        const ScopedRead reader(script.Get());
        EXPECT_EQ(&*reader, &*writer) << "a read inside a write sees the staged values";
        std::int32_t value = 0;
        EXPECT_TRUE(TQL::GetValue(*reader, script.Entry("A/B"), value));
        EXPECT_EQ(value, 3);
        EXPECT_FALSE(reader->HasValue(script.Entry("A/C")));
    }
    const ScopedRead reader(script.Get());
    EXPECT_EQ(script.Get().BeginWrite(), nullptr);
    EXPECT_EQ(Leaves(*reader, reader->FindEntries(EntryPath("*/*"))), "A/A A/B A/D A/E ");
    EXPECT_EQ(reader->FindChild(script.Entry("A"), "D"), script.Entry("A/D"));
    EXPECT_FALSE(reader->Exists(script.Entry("Asked/For"))) << "a handle does not make an entry";
    EXPECT_FALSE(script.Get().GetEntry(EntryPath("A/*"))) << "a pattern names no single entry";
    EXPECT_EQ(script.Get().GetPath(EntryPath("A/*")), EntryPath());
}

TEST(StoreWriter, TakesEmptyComponentsAsNames)
{
    StoreScript script;
    script.Write("/A=1 A=2 A//B=3 A/=4");
    const ScopedRead reader(script.Get());
    EXPECT_EQ(Leaves(*reader, reader->GetChildren(script.Entry(""))), "A /A ");
    EXPECT_EQ(Leaves(*reader, reader->FindEntries(EntryPath("A/*/*"))), "A//B ");
    EXPECT_EQ(script.State("/A") + ';' + script.State("A") + ';' + script.State("A/"), "1 - - 0;2 - - 0;4 - - 0");
    EXPECT_EQ(reader->FindChild(script.Entry("A"), ""), script.Entry("A/"));
}

TEST(StoreWriter, RefusesAnotherType)
{
    struct Row
    {
        const char* pMessage;
        std::function<TQL::IResult(TQL::IStoreWriter&, EntryHandle)> Set;
    };
    const auto text = []
    {
        return MakeValue("text");
    };
    const Row rows[] = {
        {"Failed to set 'A/B' verified value: the value type does not match the entry type.",
         [&](auto& w, EntryHandle e)
         {
             return w.SetVerifiedValue(e, text());
         }},
        {"Failed to set 'A/B' proposed value: the value type does not match the entry type.",
         [&](auto& w, EntryHandle e)
         {
             return w.SetProposedValue(e, text());
         }},
        {"Failed to set 'A/B' value: the value type does not match the entry type.",
         [&](auto& w, EntryHandle e)
         {
             return w.SetValue(e, text());
         }},
        {"Failed to set 'A/B' default value: the value type does not match the entry type.",
         [&](auto& w, EntryHandle e)
         {
             return w.SetDefaultValue(e, text());
         }},
        {"Failed to set 'A/B' minimum value: the value type does not match the entry type.",
         [&](auto& w, EntryHandle e)
         {
             return w.SetMinimum(e, text());
         }},
        {"Failed to set 'A/B' maximum value: the value type does not match the entry type.",
         [&](auto& w, EntryHandle e)
         {
             return w.SetMaximum(e, text());
         }},
        {"Failed to add 'A/B' value choice: the value type does not match the entry type.",
         [&](auto& w, EntryHandle e)
         {
             return w.AddChoice(e, text(), "n", "d");
         }},
        {"Failed to set 'A/B' value schema: the requested type does not match the entry type.",
         [&](auto& w, EntryHandle e)
         {
             return w.SetValueSchema(e, TQL::ISchema(TQL::EType::String));
         }},
    };
    for (const bool bStaged : {false, true})
    {
        StoreScript script;
        TestSupport::LogGuard guard;
        if (!bStaged)
            script.Write("A/B=1");
        ScopedWrite writer(script.Get());
        const EntryHandle entry = script.Entry("A/B");
        if (bStaged)
        {
            EXPECT_TRUE(writer->SetMinimum(entry, MakeValue(0)).IsSuccess());
        }
        for (const Row& rRow : rows)
        {
            EXPECT_EQ(rRow.Set(*writer, entry), TQL::Result::InvalidType);
            const auto lines = guard.Take();
            ASSERT_EQ(lines.size(), 1u);
            EXPECT_EQ(lines[0].Text, rRow.pMessage);
            EXPECT_EQ(rRow.Set(*writer, {}), TQL::Result::NotFound);
        }
        EXPECT_TRUE(writer->SetVerifiedValue(entry, {}).IsSuccess()) << "no type passes";
        EXPECT_TRUE(writer->RemoveEntry(entry).IsSuccess());
        EXPECT_TRUE(writer->SetValue(entry, text()).IsSuccess()) << "a removed entry has no type";
        EXPECT_EQ(&writer->GetValueSchema(entry), &Store::SchemaOf<std::string>());
    }
}

TEST(StoreWriter, TakesNullAndForeignHandles)
{
    StoreScript script;
    StoreScript other;
    other.Write("A=1 A@x A#1");
    script.Write("A=1");
    for (const EntryHandle entry : {EntryHandle(), other.Entry("A")})
    {
        ScopedWrite writer(script.Get());
        EXPECT_FALSE(writer->Exists(entry) || writer->HasValue(entry) || writer->HasChildren(entry) ||
                     writer->HasInfo(entry) || writer->HasConstraints(entry) || writer->FindChild(entry, "A"));
        EXPECT_TRUE(writer->GetVerifiedValue(entry).IsEmpty());
        EXPECT_EQ(writer->GetValueSchema(entry).Type, TQL::EType::Void);
        EXPECT_EQ(writer->GetFlags(entry) + writer->GetChoiceCount(entry) + writer->GetConstraintFlags(entry), 0u);
        EXPECT_EQ(script.Get().GetEntryPath(entry), EntryPath());
        for (const TQL::IResult result :
             {writer->SetCategory(entry, "c"), writer->EnableFlags(entry, 1), writer->RemoveEntry(entry),
              writer->TouchEntry(entry), writer->ClearValue(entry), writer->RemoveChoice(entry, 0),
              writer->ClearChoices(entry), writer->SetChoiceDescription(entry, 0, "")})
            EXPECT_EQ(result, TQL::Result::NotFound);
        writer->QueueNotice({{entry}, {}}, TQL::EChangeFlags::ForceReport);
        EXPECT_NE(script.Get().GetHandlerCallback({{entry}, {}}), nullptr);
    }
    EXPECT_EQ(other.State("A"), "1 - - 0");
}

TEST(StoreWriter, KeepsListsOfChoicesInStep)
{
    StoreScript script;
    TestSupport::LogGuard guard;
    const EntryHandle entry = script.Entry("A");
    const auto state = [&](const TQL::IStoreReader& i_rReader)
    {
        std::string text = std::to_string(i_rReader.GetChoiceCount(entry));
        for (const auto* const pList : {&i_rReader.GetChoiceNames(entry), &i_rReader.GetChoiceDescriptions(entry)})
        {
            text += " |";
            for (const std::string& rText : *pList)
                text += ' ' + (rText.empty() ? "-" : rText);
        }
        return text;
    };
    {
        ScopedWrite writer(script.Get());
        EXPECT_EQ(writer->ClearChoices(entry), TQL::Result::OkButNoEffect);
        EXPECT_TRUE(writer->AddChoice(entry, MakeValue(1), "", "").IsSuccess());
        EXPECT_EQ(state(*writer), "1 | |");
        EXPECT_TRUE(writer->AddChoice(entry, MakeValue(2), "two", "").IsSuccess());
        EXPECT_EQ(state(*writer), "2 | - two |");
    }
    {
        ScopedWrite writer(script.Get());
        EXPECT_TRUE(writer->AddChoice(entry, MakeValue(3), "", "third").IsSuccess());
        EXPECT_EQ(state(*writer), "3 | - two - | - - third");
        EXPECT_EQ(writer->RemoveChoice(entry, 3), TQL::Result::InvalidIndex);
        EXPECT_EQ(guard.Take().at(0).Text, "Failed to remove 'A' value choice: the choice index provided was invalid.");
        EXPECT_EQ(writer->SetChoiceDescription(entry, 3, "x"), TQL::Result::InvalidIndex);
        EXPECT_TRUE(writer->RemoveChoice(entry, 0).IsSuccess());
        EXPECT_TRUE(writer->SetChoiceDescription(entry, 1, "").IsSuccess());
        EXPECT_EQ(state(*writer), "2 | two - |");
    }
    ScopedWrite writer(script.Get());
    EXPECT_EQ(state(*writer), "2 | two - |");
    EXPECT_TRUE(writer->RemoveChoice(entry, 1).IsSuccess());
    EXPECT_EQ(state(*writer), "1 | two |");
    EXPECT_EQ(writer->GetConstraintFlags(entry), 1u);
    EXPECT_TRUE(writer->ClearChoices(entry).IsSuccess());
    EXPECT_FALSE(writer->HasConstraints(entry));
}

TEST(StoreWriter, HoldsVeryLongValuesAndLists)
{
    StoreScript script;
    const std::string longText(64u << 20, 'x');
    constexpr std::int32_t count = 1'000'000;
    {
        ScopedWrite writer(script.Get());
        EXPECT_TRUE(writer->SetValue(script.Entry("Text"), MakeValue(longText)).IsSuccess());
        for (std::int32_t i = 0; i < count; ++i)
            ASSERT_TRUE(writer->AddChoice(script.Entry("List"), MakeValue(i), "name", "").IsSuccess());
    }
    const ScopedRead reader(script.Get());
    std::string read;
    EXPECT_TRUE(TQL::GetValue(*reader, script.Entry("Text"), read));
    EXPECT_TRUE(read == longText);
    EXPECT_EQ(reader->GetChoiceValues(script.Entry("List")).back(), MakeValue(count - 1));
    EXPECT_EQ(reader->GetChoiceNames(script.Entry("List")).size(), static_cast<std::size_t>(count));
}

TEST(StoreWriter, CommitsVeryManyChildrenInOrder)
{
    StoreScript script;
    constexpr int count = 100'000;
    const EntryPath parent("P");
    const auto write = [&](int i_Remainder, bool i_bRemove)
    {
        ScopedWrite writer(script.Get());
        for (int i = i_Remainder; i < count; i += 2)
        {
            const EntryHandle entry = script.Get().GetEntry(parent / std::to_string(i));
            ASSERT_TRUE((i_bRemove ? writer->RemoveEntry(entry) : writer->SetValue(entry, MakeValue(i))).IsSuccess());
        }
    };
    write(1, false);
    write(0, false);
    write(1, true);
    const ScopedRead reader(script.Get());
    const std::vector<EntryHandle> children = reader->GetChildren(script.Entry("P"));
    ASSERT_EQ(children.size(), static_cast<std::size_t>(count / 2));
    for (std::size_t i = 1; i < children.size(); ++i)
        ASSERT_LT(script.Get().GetEntryPath(children[i - 1]).Leaf(), script.Get().GetEntryPath(children[i]).Leaf());
    EXPECT_EQ(reader->FindChild(script.Entry("P"), "4242"), script.Entry("P/4242"));
    EXPECT_FALSE(reader->FindChild(script.Entry("P"), "4243"));
}

TEST(StoreWriter, HoldsInfoAndProperties)
{
    StoreScript script;
    const EntryHandle entry = script.Entry("A");
    {
        ScopedWrite writer(script.Get());
        EXPECT_TRUE(writer->SetDisplayName(entry, "").IsSuccess());
        EXPECT_TRUE(writer->HasInfo(entry)) << "an empty name is a name";
        EXPECT_TRUE(writer->ClearDisplayName(entry).IsSuccess());
        EXPECT_FALSE(writer->HasInfo(entry));
        EXPECT_TRUE(writer->SetFileAccessMode(entry, 4).IsSuccess());
        EXPECT_TRUE(writer->SetPropertyMap(entry, {{"b=", "x=y\\"}, {"a", "1\n2"}}).IsSuccess());
    }
    const ScopedRead reader(script.Get());
    EXPECT_FALSE(reader->GetDisplayName(entry).has_value());
    EXPECT_EQ(reader->GetFileAccessMode(entry), 4u);
    EXPECT_EQ(reader->GetProperties(entry), "a=1\\n2\nb\\==x=y\\\\\n");
}

TEST(StoreWriter, WarnsOfWhatDoesNotGoTogether)
{
    StoreScript script;
    TestSupport::LogGuard guard;
    script.Write("A=1 B+64");
    script.Write("A+80");
    script.Write("B~2");
    std::string lines;
    for (const auto& rLine : guard.Take())
        lines += std::to_string(static_cast<int>(rLine.Severity)) + ' ' + rLine.Text + '\n';
    EXPECT_EQ(lines, "2 Setting both VerifyRequired and Readout is not supported A.\n"
                     "2 Setting both VerifyRequired and Readout is not supported A.\n"
                     "3 Set a default value on a Readout B.\n");
    EXPECT_EQ(script.State("B"), "2 - 2 576");
}

TEST(EntryEditor, GivesTheEntryItsType)
{
    StoreScript script;
    TestSupport::LogGuard guard;
    script.Write("A=1");
    ScopedWrite writer(script.Get());
    TQL::IEntryEditor<double> fresh(*writer, script.Entry("D"));
    EXPECT_TRUE(fresh.SetDefault(0.5).IsSuccess());
    EXPECT_EQ(&writer->GetValueSchema(script.Entry("D")), &Store::SchemaOf<double>());
    EXPECT_TRUE(guard.Take().empty());

    TQL::IEntryEditor<double> refused(*writer, script.Entry("A"));
    EXPECT_EQ(guard.Take().at(0).Text,
              "Error editing 'A': editor schema {\"Type\":\"Float64\"} does not match the entry "
              "schema {\"Type\":\"Int32\"}, all value changes will fail.");
    EXPECT_EQ(refused.SetValue(1.0), TQL::Result::InvalidType);
    guard.Take();

    TQL::IEntryEditor<double> replacing(*writer, script.Entry("A"), TQL::EOtherType::Replace);
    EXPECT_EQ(guard.Take().at(0).Text,
              "Error editing 'A': editor schema {\"Type\":\"Float64\"} does not match the entry schema "
              "{\"Type\":\"Int32\"}, the previous entry value will be removed.");
    EXPECT_TRUE(replacing.SetValue(1.5).IsSuccess());
    double value = 0.0;
    EXPECT_TRUE(TQL::GetValue(*writer, script.Entry("A"), value));
    EXPECT_EQ(value, 1.5);

    TQL::IEntryEditor<double> nowhere(*writer, {});
    EXPECT_EQ(guard.Take().at(0).Text, "Failed to set entry  schema {\"Type\":\"Float64\"}: NotFound: The requested "
                                       "information, instance or type was not found.");
}

} // namespace

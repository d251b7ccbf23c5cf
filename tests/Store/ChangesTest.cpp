#include "StoreScript.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

// What one commit tells at an entry, its parents and the root, as text.

namespace
{

using StoreTest::StoreScript;

struct ChangeRow
{
    const char* pName;
    std::vector<const char*> Before; ///< writes that nobody listens to
    const char* pWrite;
    const char* pTold;
    const char* pState = nullptr; ///< of A/B/C: verified, proposed, default, flags
};

const ChangeRow s_Rows[] = {
    {"FirstWrite",
     {},
     "A/B/C=1",
     "root: Verified Created ChildCreated DescendantCreated; A: Verified Created ChildCreated DescendantCreated; "
     "A/B: Verified Created ChildCreated; A/B/C: Verified Created"},
    {"SameValueAgain", {"A/B/C=1"}, "A/B/C=1", ""},
    {"EmptyWrite", {}, "", ""},
    {"OtherValue", {"A/B/C=1"}, "A/B/C=2", "root: Verified; A: Verified; A/B: Verified; A/B/C: Verified", "2 - - 0"},
    {"NewSibling",
     {"A/B/C=1"},
     "A/D=1",
     "root: Verified DescendantCreated; A: Verified ChildCreated; A/D: Verified Created"},
    {"RemoveWithChild",
     {"A/B/C=1"},
     "remove A/B",
     "root: DescendantRemoved; A: ChildRemoved DescendantRemoved; A/B: Removed ChildRemoved; A/B/C: Removed"},
    {"CreateAndRemove", {"K=1"}, "A/B=1 remove A/B", "root: ChildCreated; A: Created"},
    {"CreateAndRemoveAll", {"K=1"}, "A/B=1 remove A", ""},
    {"CreateUnderRemoved",
     {"A/B=1"},
     "remove A A/B/C=1",
     "root: Verified DescendantCreated; A: Verified DescendantCreated; A/B: Verified ChildCreated; "
     "A/B/C: Verified Created"},
    {"ReviveNextWrite",
     {"A/B=1", "remove A"},
     "A/B=1",
     "root: Verified ChildCreated DescendantCreated; A: Verified Created ChildCreated; A/B: Verified Created"},
    {"RecreateAttributesLost",
     {"A/B/C~1 A/B/C+1 A/B/C@x A/B/C!1"},
     "remove A/B/C A/B/C=1",
     "root: Persistable Default DisplayName; A: Persistable Default DisplayName; A/B: Persistable Default DisplayName; "
     "A/B/C: Persistable Default DisplayName",
     "1 - - 0"},
    {"RecreateChildGoes",
     {"A/B/C=1 A/B=1"},
     "remove A/B A/B=1",
     "root: DescendantRemoved; A: DescendantRemoved; A/B: ChildRemoved; A/B/C: Removed"},
    {"RecreateTouched",
     {"A/B/C=1 A/B/C@x"},
     "remove A/B/C A/B/C!1 touch A/B/C",
     "root: Verified DisplayName Recreated ForceReport DescendantCreated; "
     "A: Verified DisplayName Recreated ForceReport DescendantCreated; "
     "A/B: Verified DisplayName Recreated ForceReport ChildCreated; "
     "A/B/C: Verified DisplayName Recreated ForceReport Created"},
    {"Touch",
     {"A/B=1"},
     "touch A/B",
     "root: Recreated ForceReport; A: Recreated ForceReport; A/B: Recreated ForceReport"},
    {"TouchAndSameVerified",
     {"A=1"},
     "touch A A!1",
     "root: Verified Recreated ForceReport; A: Verified Recreated ForceReport"},
    {"DefaultOnFresh",
     {"A/B=1"},
     "A/B/C~5",
     "root: ValueIsDefault Verified Default DescendantCreated; A: ValueIsDefault Verified Default DescendantCreated; "
     "A/B: ValueIsDefault Verified Default ChildCreated; A/B/C: ValueIsDefault Verified Default Created",
     "5 - 5 512"},
    {"DefaultFollowedOnce",
     {"A/B/C~5"},
     "A/B/C~6",
     "root: ValueIsDefault Verified Default; A: ValueIsDefault Verified Default; A/B: ValueIsDefault Verified Default; "
     "A/B/C: ValueIsDefault Verified Default",
     "6 - 6 0"},
    {"DefaultNotFollowedTwice",
     {"A/B/C~5", "A/B/C~6"},
     "A/B/C~7",
     "root: Default; A: Default; A/B: Default; A/B/C: Default",
     "6 - 7 0"},
    {"DefaultOfVerifyRequired",
     {"A/B/C+16"},
     "A/B/C~5",
     "root: ValueIsDefault Proposed Default Unverified; A: ValueIsDefault Proposed Default Unverified; "
     "A/B: ValueIsDefault Proposed Default Unverified; A/B/C: ValueIsDefault Proposed Default Unverified",
     "- 5 5 528"},
    {"VerifyRequiredOn",
     {"A/B/C=1"},
     "A/B/C+16",
     "root: VerifyRequired Verified Proposed Unverified; A: VerifyRequired Verified Proposed Unverified; "
     "A/B: VerifyRequired Verified Proposed Unverified; A/B/C: VerifyRequired Verified Proposed Unverified",
     "- 1 - 16"},
    {"VerifyRequiredOnAndOff", {"A/B/C=1"}, "A/B/C+16 A/B/C-16", "", "1 - - 0"},
    {"Verified",
     {"A/B/C+16 A/B/C=1"},
     "A/B/C!1",
     "root: Verified; A: Verified; A/B: Verified; A/B/C: Verified",
     "1 1 - 16"},
    {"ReadoutAtDefault",
     {"A/B/C~5"},
     "A/B/C+64",
     "root: Readout ValueIsDefault Verified Default; A: Readout ValueIsDefault Verified Default; "
     "A/B: Readout ValueIsDefault Verified Default; A/B/C: Readout ValueIsDefault Verified Default",
     "- - - 64"},
    {"ReadoutKeepsStagedValue",
     {"A/B/C=1"},
     "A/B/C=7 A/B/C+64",
     "root: Readout Verified; A: Readout Verified; A/B: Readout Verified; A/B/C: Readout Verified",
     "7 - - 64"},
    {"ReadoutKeepsStagedDefault",
     {"A/B/C=1"},
     "A/B/C~4 A/B/C+64",
     "root: Readout ValueIsDefault Verified Default; A: Readout ValueIsDefault Verified Default; "
     "A/B: Readout ValueIsDefault Verified Default; A/B/C: Readout ValueIsDefault Verified Default",
     "4 - 4 576"},
    {"FlagsOutsideOfTheWord", {"A/B/C=1"}, "A/B/C+65536", "", "1 - - 0"},
    {"FlagWithoutMeaning",
     {"A/B/C=1"},
     "A/B/C+258",
     "root: others; A: others; A/B: others; A/B/C: others",
     "1 - - 258"},
    {"SchemaAlone", {"A=1", "A/B@x"}, "A/B:", ""},
    {"SchemaOfFresh", {"K=1"}, "A:", "root: ChildCreated; A: Created"},
    {"SchemaOfRemoved", {"A/B=1"}, "remove A/B A/B:", "root: DescendantRemoved; A: ChildRemoved; A/B: Removed"},
    {"SchemaUnderRemoved",
     {"A/B=1"},
     "remove A A/B/C:",
     "root: Verified DescendantCreated; A: Verified DescendantCreated; A/B: Verified ChildCreated; A/B/C: Created"},
    {"Choices", {"A=1"}, "A#1 A#2", "root: Choices ChoicesPresence; A: Choices ChoicesPresence"},
    {"MoreChoices", {"A#1"}, "A#2", "root: Choices; A: Choices"},
    {"Notice", {"A/B/C=1"}, "notice A/B notice A/D", "A/B: ForceReport; A/B/C: ForceReport"},
    {"NoticeForWhatComes",
     {"A/B=1"},
     "notice A/B A/B/C=1",
     "root: Verified DescendantCreated; A: Verified DescendantCreated; A/B: Verified ForceReport ChildCreated; "
     "A/B/C: Verified ForceReport Created"},
    {"VerifyNotice", {"A/B/C=1 A/B/C+16 A/D=1"}, "verify A", "A/B/C: Unverified"},
};

TEST(StoreChanges, AreToldAtEveryLevel)
{
    for (const ChangeRow& rRow : s_Rows)
    {
        SCOPED_TRACE(rRow.pName);
        TestSupport::LogGuard guard;
        StoreScript script;
        for (const char* const pWrite : rRow.Before)
            script.Write(pWrite);
        script.Watch({"", "A", "A/B", "A/B/C", "A/D"});
        EXPECT_EQ(script.Write(rRow.pWrite), rRow.pTold);
        if (rRow.pState)
        {
            EXPECT_EQ(script.State("A/B/C"), rRow.pState);
        }
        const bool bWarns = std::string_view(rRow.pName) == "ReadoutKeepsStagedDefault";
        EXPECT_EQ(guard.Take().size(), bWarns ? 1u : 0u);
    }
}

TEST(StoreChanges, MoveTheIdsOfWhatChanged)
{
    StoreScript script;
    const auto ids = [&](const char* i_pPath)
    {
        const TQL::ScopedRead reader(script.Get());
        const TQL::EntryChangeIds of = reader->GetEntryChangeIds(script.Entry(i_pPath));
        std::string text;
        for (const TQL::ChangeId id : {of.Verified, of.Proposed, of.Attribute, of.Child, of.Descendant})
            text += std::to_string(id.Value()) + ' ';
        return text + "at " + std::to_string(reader->GetChangeId().Value());
    };
    EXPECT_EQ(ids("A"), "0 0 0 0 0 at 0");
    script.Write("A/B/C=1");
    EXPECT_EQ(ids("A/B/C"), "1 0 1 0 0 at 1");
    EXPECT_EQ(ids("A"), "1 0 1 1 1 at 1");
    script.Write("A/B/C=1");
    EXPECT_EQ(ids("A/B/C"), "1 0 1 0 0 at 2") << "nothing changed, yet the commit has a number";
    script.Write("A/B/C?2");
    EXPECT_EQ(ids("A"), "1 3 1 1 1 at 3");
    script.Write("remove A/B/C");
    EXPECT_EQ(ids("A"), "1 3 4 1 4 at 4");
    EXPECT_EQ(ids("A/B"), "1 3 4 4 0 at 4") << "C is a child here, a descendant further up";
    {
        TQL::ScopedWrite writer(script.Get());
        EXPECT_EQ(writer->GetChangeId().Value(), 5u);
    }
}

} // namespace

#include "Services/Checking/VLifeCycleCheck.h"

#include <gtest/gtest.h>

#include <map>

namespace Services
{
namespace
{

using Call = ELifeCycleCall;

/// The calls by one letter each.
const std::map<char, Call>& Letters()
{
    static const std::map<char, Call> letters = {
        {'C', Call::CreatePlugin}, {'?', Call::CanLoad},         {'Q', Call::LoadQmlModules},
        {'I', Call::Initialise},   {'+', Call::CreateContent},   {'-', Call::CloseContent},
        {'S', Call::Shutdown},     {'R', Call::UnloadResources}, {'D', Call::DestroyPlugin},
        {'U', Call::UnloadModule},
    };
    return letters;
}

TEST(VLifeCycleCheck, KnowsWhichCallMayFollowWhich)
{
    struct Case
    {
        const char* pCalls;
        const char* pFault; ///< of the last call; all before it are in order
    };
    const Case cases[] = {
        {"C?QI++-+--SRDU", ""},
        {"C?DU", ""},
        {"C?QRDU", ""},
        {"CDU", ""},
        {"U", ""},
        {"?", "CanLoad is out of order before CreatePlugin"},
        {"CC", "CreatePlugin is out of order after CreatePlugin"},
        {"CQ", "LoadQmlModules is out of order after CreatePlugin"},
        {"C?I", "Initialise is out of order after CanLoad"},
        {"C?QQ", "LoadQmlModules is out of order after LoadQmlModules"},
        {"C?QII", "Initialise is out of order after Initialise"},
        {"C?Q+", "CreateContent is out of order after LoadQmlModules"},
        {"C?QI-", "CloseContent was called for a content that is not open"},
        {"C?QI++-S", "Shutdown was called while 1 content(s) are open"},
        {"C?QS", "Shutdown is out of order after LoadQmlModules"},
        {"C?QIR", "UnloadResources is out of order after Initialise"},
        {"C?QISS", "Shutdown is out of order after Shutdown"},
        {"C?QIS+", "CreateContent is out of order after Shutdown"},
        {"C?QISD", "DestroyPlugin is out of order after Shutdown"},
        {"C?QISRD?", "CanLoad is out of order after DestroyPlugin"},
        {"C?QISRU", "UnloadModule is out of order after UnloadResources"},
        {"C?QISRDUU", "UnloadModule is out of order after UnloadModule"},
    };
    for (const Case& rCase : cases)
    {
        VLifeCycleCheck check;
        std::string fault;
        for (const char* pLetter = rCase.pCalls; *pLetter; ++pLetter)
        {
            EXPECT_EQ(fault, "") << rCase.pCalls << ": only the last call may be out of order";
            fault = check.Note(Letters().at(*pLetter));
        }
        EXPECT_EQ(fault, rCase.pFault) << rCase.pCalls;
    }
}

TEST(VLifeCycleCheck, ACallOutOfOrderChangesNothing)
{
    VLifeCycleCheck check;
    EXPECT_NE(check.Note(Call::Initialise), "");
    for (const char letter : std::string("C?QI+"))
        EXPECT_EQ(check.Note(Letters().at(letter)), "") << letter;
    EXPECT_NE(check.Note(Call::Shutdown), "");
    EXPECT_EQ(check.OpenContents(), 1u);
    for (const char letter : std::string("-SRDU"))
        EXPECT_EQ(check.Note(Letters().at(letter)), "") << letter;
}

} // namespace
} // namespace Services

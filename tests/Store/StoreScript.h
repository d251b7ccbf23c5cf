#pragma once

#include "Store/VStore.h"
#include "StoreInterface/IHandlerCallback.h"
#include "StoreInterface/ScopedAccess.h"
#include "StoreInterface/TypedAccess.h"

#include <gtest/gtest.h>

#include <map>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

namespace StoreTest
{

/// The names of a mask's bits, lowest first.
inline std::string Names(TQL::ChangeFlags i_Flags)
{
    using enum TQL::EChangeFlags;
    static const std::pair<std::uint64_t, const char*> s_Names[] = {
        {1, "Persistable"},
        {16, "VerifyRequired"},
        {64, "Readout"},
        {512, "ValueIsDefault"},
        {static_cast<std::uint64_t>(VerifiedValue), "Verified"},
        {static_cast<std::uint64_t>(ProposedValue), "Proposed"},
        {static_cast<std::uint64_t>(DefaultValue), "Default"},
        {static_cast<std::uint64_t>(ChoiceValues), "Choices"},
        {static_cast<std::uint64_t>(ChoicesPresence), "ChoicesPresence"},
        {static_cast<std::uint64_t>(DisplayName), "DisplayName"},
        {static_cast<std::uint64_t>(Recreated), "Recreated"},
        {static_cast<std::uint64_t>(ForceReport), "ForceReport"},
        {static_cast<std::uint64_t>(Created), "Created"},
        {static_cast<std::uint64_t>(ChildCreated), "ChildCreated"},
        {static_cast<std::uint64_t>(DescendantCreated), "DescendantCreated"},
        {static_cast<std::uint64_t>(Removed), "Removed"},
        {static_cast<std::uint64_t>(ChildRemoved), "ChildRemoved"},
        {static_cast<std::uint64_t>(DescendantRemoved), "DescendantRemoved"},
        {static_cast<std::uint64_t>(Unverified), "Unverified"},
    };
    std::string text;
    for (const auto& [bit, pName] : s_Names)
        if (i_Flags.HasAny(TQL::ChangeFlags(bit)))
        {
            text += std::string(text.empty() ? "" : " ") + pName;
            i_Flags &= ~TQL::ChangeFlags(bit);
        }
    return i_Flags.IsEmpty() ? text : text + "others";
}

/// A store that is written by a small script, one command a word or three: "A/B=1" sets a value, "A/B!1" the verified
/// and "A/B?1" the proposed one, "A/B~1" the default; "A/B+16" and "A/B-16" turn flags on and off; "A/B#1" adds a
/// choice and "A/B@x" a display name; "A/B:" gives a type; "remove A/B", "touch A/B", "notice A/B", "verify A/B".
class StoreScript
{
public:
    /// Runs one write and gives what was told at each watched entry, "path: bits; ...", in the order of the paths.
    std::string Write(const std::string& i_rScript)
    {
        m_Told.clear();
        {
            TQL::ScopedWrite writer(*m_pStore);
            std::istringstream words(i_rScript);
            for (std::string word; words >> word;)
                Run(*writer, word, words);
        }
        std::string text;
        for (const auto& [path, what] : m_Told)
            text += (text.empty() ? "" : "; ") + (path.empty() ? "root" : path) + ": " + Names(what);
        return text;
    }

    /// From now on what is told at these entries is collected.
    void Watch(std::initializer_list<const char*> i_Paths)
    {
        for (const std::string path : i_Paths)
        {
            auto pHandler = m_pStore->GetHandlerCallback({{Entry(path)}, {}});
            TQL::IHandlerCallback::Token token = 0;
            EXPECT_TRUE(pHandler
                            ->SubscribeDirect(token, [this, path](TQL::ChangeFlags i_What, TQL::ChangeId)
                                              { m_Told[path] |= i_What; })
                            .IsSuccess());
            m_Kept.push_back(std::move(pHandler));
        }
    }

    /// The committed values of an entry.
    std::string State(const std::string& i_rPath)
    {
        const TQL::ScopedRead reader(*m_pStore);
        const Store::EntryHandle entry = Entry(i_rPath);
        const auto text = [](const Store::StoreValue& i_rValue)
        {
            std::int32_t number = 0;
            return Store::DecodeValue(i_rValue, number) == Store::EDecodeResult::Done && !i_rValue.IsEmpty()
                       ? std::to_string(number)
                       : std::string("-");
        };
        return text(reader->GetVerifiedValue(entry)) + ' ' + text(reader->GetProposedValue(entry)) + ' ' +
               text(reader->GetDefaultValue(entry)) + ' ' + std::to_string(reader->GetFlags(entry));
    }

    Store::EntryHandle Entry(const std::string& i_rPath) { return m_pStore->GetEntry(Store::EntryPath(i_rPath)); }
    Store::VStore& Get() { return *m_pStore; }
    std::shared_ptr<Store::VStore> GetShared() { return m_pStore; }

private:
    void Run(TQL::IStoreWriter& i_rWriter, const std::string& i_rWord, std::istream& io_rWords)
    {
        const auto argument = [&]
        {
            std::string path;
            io_rWords >> path;
            return Entry(path);
        };
        if (i_rWord == "remove")
            return (void)i_rWriter.RemoveEntry(argument());
        if (i_rWord == "touch")
            return (void)i_rWriter.TouchEntry(argument());
        if (i_rWord == "notice")
            return i_rWriter.QueueNotice({{argument()}, {}}, TQL::EChangeFlags::ForceReport);
        if (i_rWord == "verify")
            return i_rWriter.QueueVerifyNotice({{argument()}, {}});
        const std::size_t at = i_rWord.find_first_of("=!?~+-#@:");
        const Store::EntryHandle entry = Entry(i_rWord.substr(0, at));
        const std::string rest = i_rWord.substr(at + 1);
        const auto value = [&]
        {
            return Store::MakeValue<std::int32_t>(std::stoi(rest));
        };
        TQL::IResult result;
        switch (i_rWord[at])
        {
        case '=':
            result = i_rWriter.SetValue(entry, value());
            break;
        case '!':
            result = i_rWriter.SetVerifiedValue(entry, value());
            break;
        case '?':
            result = i_rWriter.SetProposedValue(entry, value());
            break;
        case '~':
            result = i_rWriter.SetDefaultValue(entry, value());
            break;
        case '+':
            result = i_rWriter.EnableFlags(entry, static_cast<std::uint32_t>(std::stoul(rest)));
            break;
        case '-':
            result = i_rWriter.DisableFlags(entry, static_cast<std::uint32_t>(std::stoul(rest)));
            break;
        case '#':
            result = i_rWriter.AddChoice(entry, value(), "", "");
            break;
        case '@':
            result = i_rWriter.SetDisplayName(entry, rest);
            break;
        case ':':
            result = i_rWriter.SetValueSchema(entry, Store::SchemaOf<std::int32_t>());
            break;
        default:
            break;
        }
        EXPECT_EQ(result, TQL::Result::Ok) << i_rWord;
    }

    std::map<std::string, TQL::ChangeFlags> m_Told;
    std::shared_ptr<Store::VStore> m_pStore = TQL::MakeShared<Store::VStore>(nullptr, 2);
    std::vector<std::shared_ptr<TQL::IHandlerCallback>> m_Kept;
};

} // namespace StoreTest

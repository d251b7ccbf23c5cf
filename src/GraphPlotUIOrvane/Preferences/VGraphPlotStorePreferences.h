#pragma once

#include "GraphPlotSystem/Common/IGraphPlotPreferences.h"
#include "StoreInterface/EntryHandle.h"
#include "TQL/ISchema.h"

#include <map>
#include <type_traits>

namespace TQL
{
class IHandlerCallback;
class IStore;
} // namespace TQL

namespace GraphPlotUI
{

/// The store form of a colour set: its enumerator's name.
TQL::ISchema DescribeSchema(std::type_identity<ETraceColourSet>);

/// The preferences in a store, below User/Preferences/Graph Plots, with the texts and choices that a preferences
/// dialogue shows. Made, it completes the entries that are there: a value that was set stays, and a second object over
/// the same store changes nothing. An entry of another type is replaced, with a line in the log. Any thread.
class VGraphPlotStorePreferences : public IGraphPlotPreferences
{
public:
    /// Writes to the store, so not on a thread that reads it.
    explicit VGraphPlotStorePreferences(std::shared_ptr<TQL::IStore> i_pStore);
    ~VGraphPlotStorePreferences() override;

    TQL::IResult GetValue(int i_Index, Value& o_rValue) const override;
    TQL::IResult SetValue(int i_Index, const Value& i_rValue) override;
    TQL::IResult AddCallback(Token& o_rToken, int i_Index, std::function<void()> i_Callback,
                             std::shared_ptr<TQL::IPostalService> i_pPostalService) override;
    TQL::IResult RemoveCallback(int i_Index, Token i_Token) override;

private:
    struct Preference
    {
        Store::EntryHandle Entry;
        std::shared_ptr<TQL::IHandlerCallback> pHandler;
    };

    const Preference* Find(int i_Index) const; ///< null for an index that is no preference

    const std::shared_ptr<TQL::IStore> m_pStore;
    std::map<int, Preference> m_Preferences; ///< constant once made
};

} // namespace GraphPlotUI

#pragma once

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelService.h"
#include "ChannelSystem/IChannelTypeRegistry.h"
#include "ChannelSystemUtils/VActiveChannelOptions.h"
#include "TQL/IPostalService.h"
#include "TQL/VShared.h"

#include <QtCore/QPointer>

#include <map>
#include <memory>
#include <set>
#include <string>
#include <unordered_set>
#include <vector>

namespace GraphPlotUI
{

class VActiveChannelModel;

/// Turns the host's selection and the operator's settings into the list of channels to plot: finds the selected
/// channels, creates those of a creatable type from them, applies the plot options and hands the result to the model.
/// Follows the outputs of the selected channels, so that a channel without data leaves and comes back. Made with
/// TQL::MakeShared and owned by the active channel manager. UI thread.
class VActiveChannelBuilder : public TQL::VShared
{
public:
    /// The type registry may be null: then no type can be created. The model is not owned.
    VActiveChannelBuilder(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                          std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                          std::shared_ptr<TQL::IChannelTypeRegistry> i_pTypeRegistry, VActiveChannelModel* i_pModel);
    ~VActiveChannelBuilder() override;

    // Each setter does nothing with an equal value. All but the options look at the selection again.
    void SetContextName(const std::string& i_rName);
    void SetLinked(bool i_bLinked); ///< whether the host's selection is plotted
    void SetSelectedChannelType(const std::string& i_rType);
    void SetGlobalChannelType(const std::string& i_rType); ///< the empty name for none
    void SetOptions(const ChannelSystemUtils::VActiveChannelOptions& i_rOptions);

    /// Looks at the selection again; builds the list anew when it changed or by force.
    void Refresh(bool i_bForce);

    /// Forgets the selected channels; the model keeps its rows.
    void Clear();

private:
    using ChannelList = std::vector<std::shared_ptr<TQL::IChannel>>;
    using IdSet = std::set<TQL::IChannelInstanceId>;

    /// A selected channel that is being followed.
    struct VSelectionEntry
    {
        std::shared_ptr<TQL::IChannel> pChannel;
        std::shared_ptr<TQL::IChannelOutput> pOutput;
        std::shared_ptr<void> pCallback;
    };

    /// What is plotted or made into what is plotted. The output alone may not keep its channel.
    struct Source
    {
        std::shared_ptr<TQL::IChannel> pChannel;
        std::shared_ptr<TQL::IChannelOutput> pOutput; ///< never null
    };
    using SourceList = std::vector<Source>;

    std::vector<TQL::IChannelInstanceId> FindSelectedIds() const;
    ChannelList FindChannels(const std::vector<TQL::IChannelInstanceId>& i_rIds, IdSet& o_rIds) const;
    bool DropEntriesBut(const IdSet& i_rIds);
    void Follow(const std::shared_ptr<TQL::IChannel>& i_rpChannel);
    void OnOutputChanged(const TQL::IChannelInstanceId& i_rId, const std::weak_ptr<TQL::IChannel>& i_rpChannel);
    void QueueRebuild();

    void Rebuild();
    bool IsGlobal(const TQL::IChannelOutput& i_rOutput) const;
    void Create(const std::string& i_rType, const SourceList& i_rInputs, SourceList& io_rBuilt) const;
    static void TakeCreated(const std::string& i_rType, TQL::IResult i_Result, const ChannelList& i_rCreated,
                            SourceList& io_rBuilt);
    std::shared_ptr<TQL::IChannel> ApplyOptions(const Source& i_rSource) const;

    const std::shared_ptr<TQL::IPostalService> m_pUiPostalService;
    const std::shared_ptr<ChannelSystem::IChannelService> m_pChannelService;
    const std::shared_ptr<TQL::IChannelTypeRegistry> m_pTypeRegistry;
    const QPointer<VActiveChannelModel> m_pModel;
    std::string m_ContextName;
    std::string m_SelectedType;
    std::unordered_set<std::string> m_SelectionTypes; // the types of selected channels that make the selected type
    bool m_bLinked = true;
    std::string m_GlobalType;
    ChannelSystemUtils::VActiveChannelOptions m_Options;
    ChannelList m_Tracked; // in the order of the selection
    std::map<TQL::IChannelInstanceId, VSelectionEntry> m_Entries;
    bool m_bRebuildQueued = false;
};

} // namespace GraphPlotUI

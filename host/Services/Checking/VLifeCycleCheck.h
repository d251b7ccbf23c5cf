#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace Services
{

/// A call in the life of a plug-in module.
enum class ELifeCycleCall : std::uint8_t
{
    CreatePlugin,
    CanLoad,
    LoadQmlModules,
    Initialise,
    CreateContent,
    CloseContent,
    Shutdown,
    UnloadResources,
    DestroyPlugin,
    UnloadModule
};

std::string_view ToText(ELifeCycleCall i_Call);

/// Knows which call may follow which: CreatePlugin, CanLoad, LoadQmlModules, Initialise, any number of contents, all of
/// them closed, Shutdown, UnloadResources, DestroyPlugin, UnloadModule. A life that ends early skips what undoes a call
/// that was never made. A pure state machine: it makes no calls. One for each loaded module.
class VLifeCycleCheck
{
public:
    /// Notes the call. Empty when it is in order, else one sentence with the name of the operation; such a call leaves
    /// the state as it was.
    std::string Note(ELifeCycleCall i_Call);

    std::size_t OpenContents() const { return m_OpenContents; }

private:
    enum class EState : std::uint8_t
    {
        Mapped,
        Created,
        Loadable,
        QmlLoaded,
        Initialised,
        ShutDown,
        ResourcesUnloaded,
        Destroyed,
        Unmapped
    };

    static std::string_view ToText(EState i_State);
    bool IsAllowed(ELifeCycleCall i_Call) const;
    void Advance(ELifeCycleCall i_Call);

    EState m_State = EState::Mapped;
    std::size_t m_OpenContents = 0;
};

} // namespace Services

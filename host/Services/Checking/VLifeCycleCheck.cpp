#include "Services/Checking/VLifeCycleCheck.h"

namespace Services
{

std::string_view ToText(ELifeCycleCall i_Call)
{
    switch (i_Call)
    {
    case ELifeCycleCall::CreatePlugin:
        return "CreatePlugin";
    case ELifeCycleCall::CanLoad:
        return "CanLoad";
    case ELifeCycleCall::LoadQmlModules:
        return "LoadQmlModules";
    case ELifeCycleCall::Initialise:
        return "Initialise";
    case ELifeCycleCall::CreateContent:
        return "CreateContent";
    case ELifeCycleCall::CloseContent:
        return "CloseContent";
    case ELifeCycleCall::Shutdown:
        return "Shutdown";
    case ELifeCycleCall::UnloadResources:
        return "UnloadResources";
    case ELifeCycleCall::DestroyPlugin:
        return "DestroyPlugin";
    case ELifeCycleCall::UnloadModule:
        return "UnloadModule";
    }
    return "";
}

std::string_view VLifeCycleCheck::ToText(EState i_State)
{
    switch (i_State)
    {
    case EState::Mapped:
        return "before CreatePlugin";
    case EState::Created:
        return "after CreatePlugin";
    case EState::Loadable:
        return "after CanLoad";
    case EState::QmlLoaded:
        return "after LoadQmlModules";
    case EState::Initialised:
        return "after Initialise";
    case EState::ShutDown:
        return "after Shutdown";
    case EState::ResourcesUnloaded:
        return "after UnloadResources";
    case EState::Destroyed:
        return "after DestroyPlugin";
    case EState::Unmapped:
        return "after UnloadModule";
    }
    return "";
}

std::string VLifeCycleCheck::Note(ELifeCycleCall i_Call)
{
    if (!IsAllowed(i_Call))
        return std::string(Services::ToText(i_Call)) + " is out of order " + std::string(ToText(m_State));
    if (i_Call == ELifeCycleCall::CloseContent && m_OpenContents == 0)
        return "CloseContent was called for a content that is not open";
    if (i_Call == ELifeCycleCall::Shutdown && m_OpenContents != 0)
        return "Shutdown was called while " + std::to_string(m_OpenContents) + " content(s) are open";
    Advance(i_Call);
    return {};
}

bool VLifeCycleCheck::IsAllowed(ELifeCycleCall i_Call) const
{
    switch (i_Call)
    {
    case ELifeCycleCall::CreatePlugin:
        return m_State == EState::Mapped;
    case ELifeCycleCall::CanLoad:
        return m_State == EState::Created;
    case ELifeCycleCall::LoadQmlModules:
        return m_State == EState::Loadable;
    case ELifeCycleCall::Initialise:
        return m_State == EState::QmlLoaded;
    case ELifeCycleCall::CreateContent:
    case ELifeCycleCall::CloseContent:
    case ELifeCycleCall::Shutdown:
        return m_State == EState::Initialised;
    case ELifeCycleCall::UnloadResources:
        return m_State == EState::ShutDown || m_State == EState::QmlLoaded;
    case ELifeCycleCall::DestroyPlugin:
        return m_State == EState::ResourcesUnloaded || m_State == EState::Created || m_State == EState::Loadable;
    case ELifeCycleCall::UnloadModule:
        return m_State == EState::Destroyed || m_State == EState::Mapped;
    }
    return false;
}

void VLifeCycleCheck::Advance(ELifeCycleCall i_Call)
{
    switch (i_Call)
    {
    case ELifeCycleCall::CreatePlugin:
        m_State = EState::Created;
        break;
    case ELifeCycleCall::CanLoad:
        m_State = EState::Loadable;
        break;
    case ELifeCycleCall::LoadQmlModules:
        m_State = EState::QmlLoaded;
        break;
    case ELifeCycleCall::Initialise:
        m_State = EState::Initialised;
        break;
    case ELifeCycleCall::CreateContent:
        ++m_OpenContents;
        break;
    case ELifeCycleCall::CloseContent:
        --m_OpenContents;
        break;
    case ELifeCycleCall::Shutdown:
        m_State = EState::ShutDown;
        break;
    case ELifeCycleCall::UnloadResources:
        m_State = EState::ResourcesUnloaded;
        break;
    case ELifeCycleCall::DestroyPlugin:
        m_State = EState::Destroyed;
        break;
    case ELifeCycleCall::UnloadModule:
        m_State = EState::Unmapped;
        break;
    }
}

} // namespace Services

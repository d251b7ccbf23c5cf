#pragma once

#include "TQL/IMultiCallback.h"

#include <functional>
#include <memory>
#include <utility>

namespace NotificationSystem
{

/// Wraps a member function so that it is called only while its object lives: each call locks the weak pointer, and a
/// failed lock throws VDeregisterWeakCallbackException, which ends the subscription.
template <typename T, typename TBase, typename... Args>
auto MakeWeakCallback(std::weak_ptr<T> i_pTarget, void (TBase::*i_pMember)(Args...))
{
    return [pTarget = std::move(i_pTarget), i_pMember](Args... i_Args)
    {
        const std::shared_ptr<T> pStrong = pTarget.lock();
        if (!pStrong)
            throw TQL::VDeregisterWeakCallbackException();
        (pStrong.get()->*i_pMember)(std::forward<Args>(i_Args)...);
    };
}

/// The same for a function object that takes the object first.
template <typename T, typename TFunction>
auto MakeWeakFunction(std::weak_ptr<T> i_pTarget, TFunction i_Function)
{
    return [pTarget = std::move(i_pTarget), function = std::move(i_Function)](const auto&... i_rArgs)
    {
        const std::shared_ptr<T> pStrong = pTarget.lock();
        if (!pStrong)
            throw TQL::VDeregisterWeakCallbackException();
        std::invoke(function, *pStrong, i_rArgs...);
    };
}

} // namespace NotificationSystem

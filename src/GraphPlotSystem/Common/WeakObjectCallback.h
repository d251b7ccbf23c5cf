#pragma once

#include "TQL/IMultiCallback.h"

#include <QtCore/QPointer>

#include <functional>
#include <utility>

namespace GraphPlotUI
{

/// Wraps a function object so that it runs only while a QObject lives: a call after its death throws
/// VDeregisterWeakCallbackException, which ends the subscription. For callbacks that are delivered on the object's own
/// thread.
template <typename T, typename TFunction>
auto MakeWeakObjectCallback(T* i_pObject, TFunction i_Function)
{
    return [pTarget = QPointer<T>(i_pObject), function = std::move(i_Function)](const auto&... i_rArgs)
    {
        if (!pTarget)
            throw TQL::VDeregisterWeakCallbackException();
        std::invoke(function, *pTarget, i_rArgs...);
    };
}

} // namespace GraphPlotUI

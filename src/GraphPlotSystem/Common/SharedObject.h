#pragma once

#include "TQL/VShared.h"

#include <QtCore/QObject>
#include <QtCore/QThread>

#include <concepts>
#include <memory>
#include <utility>

namespace GraphPlotUI
{

/// Deletes a QObject where it lives: at once on its own thread, otherwise by an event that its thread's loop handles.
/// A worker that locks a weak pointer can end up with the last reference; children and timers must not die there.
struct ObjectDeleter
{
    void operator()(QObject* i_pObject) const
    {
        if (!i_pObject)
            return;
        if (i_pObject->thread() == nullptr || i_pObject->thread() == QThread::currentThread())
            delete i_pObject;
        else
            i_pObject->deleteLater();
    }
};

/// Makes a shared QObject that lives on the calling thread and is deleted there, whoever lets go of it last. Runs the
/// post-creation hook of a VShared.
template <std::derived_from<QObject> T, typename... Args>
std::shared_ptr<T> MakeSharedObject(Args&&... i_Args)
{
    std::shared_ptr<T> pObject(new T(std::forward<Args>(i_Args)...), ObjectDeleter());
    if constexpr (std::derived_from<T, TQL::VShared>)
        pObject->RunPostCreation();
    return pObject;
}

} // namespace GraphPlotUI

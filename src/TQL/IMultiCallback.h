#pragma once

#include <cstddef>
#include <cstdint>
#include <exception>
#include <functional>
#include <memory>

namespace TQL
{

class IPostalService;

/// Thrown by a callback whose target has died: the multi-callback drops the subscription. Control flow, never logged.
class VDeregisterWeakCallbackException : public std::exception
{
public:
    const char* what() const noexcept override { return "the target of a weak callback has died"; }
};

template <typename Signature>
class IMultiCallback;

/// A signal: a thread-safe list of subscribers. Any thread may add and remove, also from inside a callback.
template <typename... Args>
class IMultiCallback<void(Args...)>
{
public:
    using Callback = std::function<void(Args...)>;
    using Handle = std::uint64_t; ///< unique while its subscriber lives; never 0

    virtual Handle Add(Callback i_Callback) = 0;
    virtual std::size_t Remove(Handle i_Handle) = 0; ///< 1 if one was removed, else 0
    virtual std::size_t RemoveAll() = 0;             ///< how many were removed
    virtual std::size_t Count() const = 0;
    virtual ~IMultiCallback() = default;
};

template <typename Signature>
class IMultiCallbackPostal;

/// A signal that calls each subscriber through the postal service that it named. `Add` without a service uses the
/// default one of the signal. Held by std::shared_ptr, so that a subscription can keep it.
template <typename... Args>
class IMultiCallbackPostal<void(Args...)> : public IMultiCallback<void(Args...)>
{
public:
    using typename IMultiCallback<void(Args...)>::Callback;
    using typename IMultiCallback<void(Args...)>::Handle;
    using IMultiCallback<void(Args...)>::Add;

    virtual Handle Add(Callback i_Callback, std::shared_ptr<IPostalService> i_pPostalService) = 0;
    /// Calls on the thread that invokes, with no postal service.
    virtual Handle AddDirect(Callback i_Callback) = 0;
};

/// The common signal: something changed, look.
using IChangeSignal = IMultiCallbackPostal<void()>;

} // namespace TQL

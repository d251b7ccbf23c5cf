#pragma once

#include <memory>
#include <utility>

namespace TQL
{

/// Base of objects that are held by shared pointer and subscribe to signals. Such an object is made by MakeShared,
/// which runs the post-creation hook once a shared pointer owns it: only there, never in the constructor, may the
/// object hand out weak pointers to itself.
class VShared : public std::enable_shared_from_this<VShared>
{
public:
    virtual ~VShared() = default;

    /// Runs the post-creation hook. Called once, by whoever made the shared pointer.
    void RunPostCreation() { OnPostCreation(); }

protected:
    /// The place to subscribe. The object is owned by a shared pointer here.
    virtual void OnPostCreation() {}

    /// A weak pointer to this object as its own class: `WeakSelf(this)`.
    template <typename T>
    std::weak_ptr<T> WeakSelf(T* i_pThis)
    {
        return std::shared_ptr<T>(shared_from_this(), i_pThis);
    }
};

/// Makes a shared object and runs its post-creation hook.
template <typename T, typename... Args>
std::shared_ptr<T> MakeShared(Args&&... i_Args)
{
    auto pObject = std::make_shared<T>(std::forward<Args>(i_Args)...);
    pObject->RunPostCreation();
    return pObject;
}

} // namespace TQL

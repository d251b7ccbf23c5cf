#pragma once

#include <memory>

namespace TQL
{
class IStore;
}

namespace Store
{

class EntryPath;

/// Counts one more active handler of that path for as long as the token lives; o_rbAnother tells whether there was one
/// already. The count is kept for the whole process, since a handler knows nothing but its store. Any thread; the
/// token must not outlive the store.
[[nodiscard]] std::shared_ptr<void> BecomeActiveHandler(const TQL::IStore& i_rStore, const EntryPath& i_rPath,
                                                        bool& o_rbAnother);

} // namespace Store

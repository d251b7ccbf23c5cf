#pragma once

#include <QtCore/QPointer>

#include <array>
#include <cstddef>
#include <memory>
#include <set>
#include <string>
#include <vector>

class QOffscreenSurface;
class QOpenGLContext;
class QOpenGLContextGroup;

namespace Services
{

/// Looks for OpenGL objects that a plug-in left in the contexts that all windows share. When it is made it notes which
/// objects there are; Leftovers names those that came since. It asks OpenGL itself, name by name, so it finds the
/// objects of anybody: Qt's own are gone only when the windows that show OpenGL are. Objects that contexts do not share
/// (framebuffers, vertex arrays) end with their window and are not looked for. One life of a plug-in; UI thread.
class VGraphicsAudit
{
public:
    VGraphicsAudit();
    ~VGraphicsAudit();
    VGraphicsAudit(const VGraphicsAudit&) = delete;
    VGraphicsAudit& operator=(const VGraphicsAudit&) = delete;

    /// False without OpenGL or without a context that all windows share.
    bool CanCount() const { return m_pContext != nullptr; }

    /// Whether a widget is there whose window showed OpenGL, and so holds objects of Qt's until it is destroyed.
    static bool IsAWindowOpen();

    /// One sentence for each kind of object of which there are new ones.
    std::vector<std::string> Leftovers() const;

private:
    using Names = std::set<unsigned>;
    static constexpr std::size_t KindCount = 5;
    using Inventory = std::array<Names, KindCount>;

    Inventory Count() const;

    std::unique_ptr<QOffscreenSurface> m_pSurface;
    std::unique_ptr<QOpenGLContext> m_pContext; ///< of its own, sharing with all others; null where that cannot be
    Inventory m_Before;
};

} // namespace Services

#include "Services/Checking/VGraphicsAudit.h"

#include <QtGui/QOffscreenSurface>
#include <QtGui/QOpenGLContext>
#include <QtGui/QOpenGLFunctions>
#include <QtGui/QWindow>
#include <QtWidgets/QApplication>
#include <QtWidgets/QWidget>

#include <algorithm>

namespace Services
{
namespace
{

/// Names are given out from 1 upwards and used again, so those of a program's few thousand objects lie below this.
constexpr GLuint c_NameLimit = 1 << 16;

struct Kind
{
    const char* pText;
    GLboolean (QOpenGLFunctions::*pIs)(GLuint);
};

/// What sharing contexts have in common.
constexpr Kind c_Kinds[] = {{"texture(s)", &QOpenGLFunctions::glIsTexture},
                            {"buffer(s)", &QOpenGLFunctions::glIsBuffer},
                            {"renderbuffer(s)", &QOpenGLFunctions::glIsRenderbuffer},
                            {"program(s)", &QOpenGLFunctions::glIsProgram},
                            {"shader(s)", &QOpenGLFunctions::glIsShader}};

/// Makes a context current and puts back what was.
class CurrentContext
{
public:
    CurrentContext(QOpenGLContext& i_rContext, QSurface& i_rSurface)
        : m_pBefore(QOpenGLContext::currentContext())
        , m_pSurfaceBefore(m_pBefore ? m_pBefore->surface() : nullptr)
        , m_rContext(i_rContext)
    {
        m_rContext.makeCurrent(&i_rSurface);
    }
    ~CurrentContext()
    {
        m_rContext.doneCurrent();
        if (m_pBefore && m_pSurfaceBefore)
            m_pBefore->makeCurrent(m_pSurfaceBefore);
    }
    CurrentContext(const CurrentContext&) = delete;
    CurrentContext& operator=(const CurrentContext&) = delete;

private:
    QOpenGLContext* const m_pBefore;
    QSurface* const m_pSurfaceBefore;
    QOpenGLContext& m_rContext;
};

} // namespace

VGraphicsAudit::VGraphicsAudit()
{
    static_assert(std::size(c_Kinds) == KindCount);
    QOpenGLContext* pShared = QOpenGLContext::globalShareContext();
    if (!pShared)
        return;
    m_pSurface = std::make_unique<QOffscreenSurface>();
    m_pSurface->setFormat(pShared->format());
    m_pSurface->create();
    m_pContext = std::make_unique<QOpenGLContext>();
    m_pContext->setFormat(pShared->format());
    m_pContext->setShareContext(pShared);
    if (!m_pSurface->isValid() || !m_pContext->create() || m_pContext->shareGroup() != pShared->shareGroup())
        m_pContext.reset();
    else
        m_Before = Count();
}

VGraphicsAudit::~VGraphicsAudit() = default;

bool VGraphicsAudit::IsAWindowOpen()
{
    const QWidgetList widgets = QApplication::topLevelWidgets();
    const auto showsOpenGL = [](const QWidget* i_pWidget)
    {
        return i_pWidget->windowHandle() && i_pWidget->windowHandle()->surfaceType() == QSurface::OpenGLSurface;
    };
    return std::ranges::any_of(widgets, showsOpenGL);
}

VGraphicsAudit::Inventory VGraphicsAudit::Count() const
{
    const CurrentContext current(*m_pContext, *m_pSurface);
    QOpenGLFunctions* pFunctions = m_pContext->functions();
    Inventory inventory;
    for (std::size_t kind = 0; kind < KindCount; ++kind)
        for (GLuint name = 1; name < c_NameLimit; ++name)
            if ((pFunctions->*c_Kinds[kind].pIs)(name))
                inventory[kind].insert(name);
    return inventory;
}

std::vector<std::string> VGraphicsAudit::Leftovers() const
{
    std::vector<std::string> leftovers;
    if (!CanCount())
        return leftovers;
    const Inventory now = Count();
    for (std::size_t kind = 0; kind < KindCount; ++kind)
    {
        const auto isNew = [&](GLuint i_Name)
        {
            return !m_Before[kind].contains(i_Name);
        };
        if (const auto count = std::ranges::count_if(now[kind], isNew); count != 0)
            leftovers.push_back("OpenGL still has " + std::to_string(count) + " " + c_Kinds[kind].pText +
                                " of the plug-in");
    }
    return leftovers;
}

} // namespace Services

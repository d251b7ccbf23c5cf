#include "Studio/Commands/OpenGLCheck.h"

#include <QtGui/QOffscreenSurface>
#include <QtGui/QOpenGLContext>

namespace Studio
{

std::string FindOpenGLProblem()
{
    QOffscreenSurface surface;
    surface.create();
    QOpenGLContext context;
    if (context.create() && context.makeCurrent(&surface))
        return {};
    return "no OpenGL: this display offers none, and nothing can be drawn without; run it on a desktop or under "
           "xvfb-run, "
           "and install the Mesa drivers if there is no graphics card";
}

} // namespace Studio

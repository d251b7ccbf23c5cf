#pragma once

#include <string>

namespace Studio
{

/// Why nothing can be drawn here, in one line; empty when OpenGL works. After the application object is made.
std::string FindOpenGLProblem();

} // namespace Studio

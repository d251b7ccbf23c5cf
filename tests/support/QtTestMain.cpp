#include <gtest/gtest.h>

#include <QtQuick/QQuickWindow>
#include <QtWidgets/QApplication>

// The same preparation as in any host program: shared OpenGL contexts and OpenGL as the API of Qt Quick.
int main(int i_ArgumentCount, char** i_ppArguments)
{
    QCoreApplication::setAttribute(Qt::AA_ShareOpenGLContexts);
    QQuickWindow::setGraphicsApi(QSGRendererInterface::OpenGL);
    if (qEnvironmentVariableIsEmpty("DISPLAY") && qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
        qputenv("QT_QPA_PLATFORM", "offscreen");
    const QApplication application(i_ArgumentCount, i_ppArguments);
    ::testing::InitGoogleTest(&i_ArgumentCount, i_ppArguments);
    return RUN_ALL_TESTS();
}

#pragma once

#include <QtCore/QObject>
#include <QtCore/QString>

namespace Studio
{

/// A text that is shown on a button or in a menu with all its characters: an ampersand would underline the next one.
QString WithoutMnemonics(QString i_Text);

/// Shows the texts of all labels of the application as they are: those of message boxes and tool tips too, which are
/// labels inside. Names, units and messages come from files and from the network; a label that guesses whether a text
/// is markup would obey theirs. A label that is to show markup sets its format itself. Owned by the window; UI thread.
class VPlainLabels : public QObject
{
    Q_OBJECT

public:
    explicit VPlainLabels(QObject* i_pParent = nullptr);

protected:
    bool eventFilter(QObject* i_pObject, QEvent* i_pEvent) override;
};

} // namespace Studio

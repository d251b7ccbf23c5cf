#pragma once

#include <QtCore/QString>
#include <QtWidgets/QWidget>

#include <map>

namespace Studio
{

class VOpenFiles;

/// Offers to read files again that were changed by others: a row for each context, with a button that reads it again
/// and one that leaves it as it is. Hidden while there is nothing to offer. Owned by the main window. UI thread.
class VChangedFilesBar : public QWidget
{
    Q_OBJECT

public:
    explicit VChangedFilesBar(VOpenFiles& i_rFiles, QWidget* i_pParent = nullptr);

private:
    void AddRow(VOpenFiles& i_rFiles, const QString& i_rContextName, const QString& i_rFileName);
    void RemoveRow(const QString& i_rContextName);

    std::map<QString, QWidget*> m_Rows; ///< by context name
};

} // namespace Studio

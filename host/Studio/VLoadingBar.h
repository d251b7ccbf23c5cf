#pragma once

#include <QtWidgets/QWidget>

#include <map>

class QProgressBar;

namespace Studio
{

class VRecordingLoader;

/// What is being read: a row for each file with its name, a progress bar and a button that cancels. Hidden while there
/// is nothing. The loader outlives it or dies with the same window. UI thread.
class VLoadingBar : public QWidget
{
    Q_OBJECT

public:
    explicit VLoadingBar(VRecordingLoader& i_rLoader, QWidget* i_pParent = nullptr);

private:
    void AddRow(VRecordingLoader& i_rLoader, int i_Number, const QString& i_rFileName);
    void RemoveRow(int i_Number);

    struct Row
    {
        QWidget* pWidget;
        QProgressBar* pBar;
    };
    std::map<int, Row> m_Rows; ///< by the loader's numbers
};

} // namespace Studio

#pragma once

#include <QtCore/QString>
#include <QtWidgets/QWidget>

#include <cstddef>
#include <map>

class QLabel;
class QProgressBar;

namespace Studio
{

class VRecordingLoader;

/// What is being read: a row with its name, a progress bar and a button that cancels for each of the next few files,
/// and one for all that wait behind them. Hidden while there is nothing. The loader outlives it or dies with the same
/// window. UI thread.
class VLoadingBar : public QWidget
{
    Q_OBJECT

public:
    static constexpr std::size_t Most = 3; ///< files with a row of their own

    explicit VLoadingBar(VRecordingLoader& i_rLoader, QWidget* i_pParent = nullptr);

private:
    void BuildRest();
    void Add(int i_Number, const QString& i_rFileName);
    void AddRow(int i_Number, const QString& i_rFileName);
    void Remove(int i_Number);
    void ShowRest();

    struct Row
    {
        QWidget* pWidget;
        QProgressBar* pBar;
    };
    VRecordingLoader& m_rLoader;
    std::map<int, Row> m_Rows;        ///< by the loader's numbers
    std::map<int, QString> m_Waiting; ///< the names of the files without a row, likewise
    QWidget* m_pRest = nullptr;       ///< the row of those
    QLabel* m_pRestText = nullptr;
};

} // namespace Studio

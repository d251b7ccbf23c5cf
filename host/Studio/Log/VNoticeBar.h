#pragma once

#include <QtWidgets/QWidget>

#include <functional>
#include <utility>
#include <vector>

namespace Studio
{

/// Lines above the plots that tell the operator of something and stay until they are closed, each with one thing to do
/// about it if there is any. The newest few. UI thread.
class VNoticeBar : public QWidget
{
    Q_OBJECT

public:
    static constexpr std::size_t Most = 4;

    explicit VNoticeBar(QWidget* i_pParent = nullptr);

    void Add(const QString& i_rText);
    /// The button closes the line, too.
    void Add(const QString& i_rText, const QString& i_rButton, std::function<void()> i_Do)
    {
        Set({}, i_rText, i_rButton, std::move(i_Do));
    }

    /// The one line about a topic: in the place of the former one about it, if that is there still.
    void Set(const QString& i_rTopic, const QString& i_rText, const QString& i_rButton, std::function<void()> i_Do);
    void Clear(const QString& i_rTopic);

private:
    void Remove(QWidget* i_pRow);

    std::vector<QWidget*> m_Rows; ///< oldest first; the name of each is its topic
};

} // namespace Studio

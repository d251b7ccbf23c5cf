#pragma once

#include "TQL/IResult.h"

#include <QtCore/QPointer>
#include <QtWidgets/QWidget>

#include <string>

namespace Studio
{

class VStudioSession;

/// The host's side of one Graph Plots window: a frame that the content fills. Deleting it closes the content. UI
/// thread.
class VPlotFrame : public QWidget
{
    Q_OBJECT

public:
    explicit VPlotFrame(QWidget* i_pParent = nullptr);
    ~VPlotFrame() override;

    /// Makes the content; once. The frame must already be where it will be shown: in its window.
    [[nodiscard]] TQL::IResult Open(VStudioSession& i_rSession, std::string& o_rError);

    QWidget* Content() const { return m_pContent; } ///< null before Open and after the module closed it

private:
    QPointer<QWidget> m_pContent;
};

} // namespace Studio

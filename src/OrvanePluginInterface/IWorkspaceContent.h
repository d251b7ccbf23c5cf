#pragma once

#include "TQL/IResult.h"

#include <QtCore/QPointer>

#include <memory>

class QWidget;

namespace TQL
{
class IStoreReader;
class IStoreWriter;
} // namespace TQL

namespace Store
{
class EntryPath;
}

namespace OrvanePluginInterface
{

class ITimeController;

/// Makes the content of one kind of window. UI thread. The widget's parent becomes i_pFrame; deleting the widget closes
/// the window's content.
class IWorkspaceContentFactory
{
public:
    virtual ~IWorkspaceContentFactory() = default;
    virtual void CreateContent(QPointer<QWidget>& o_rpWidget, std::shared_ptr<ITimeController> i_pWindowContext,
                               QPointer<QWidget> i_pFrame) = 0;
};

/// A content whose state the workspace keeps; the host reaches it by dynamic_cast from the widget. UI thread.
class IOrvaneWindowPersist
{
public:
    virtual TQL::IResult SaveWindowState(TQL::IStoreWriter& i_rWriter, const Store::EntryPath& i_rPath) = 0;
    virtual bool LoadWindowState(TQL::IStoreReader& i_rReader, const Store::EntryPath& i_rPath) = 0;
    virtual ~IOrvaneWindowPersist() = default;
};

} // namespace OrvanePluginInterface

#pragma once

#include "OrvanePluginInterface/IHostUiServices.h"
#include "Services/Common/VThreadCheck.h"

#include <QtCore/QVariant>

#include <optional>
#include <string>

namespace Services
{

/// The text of one property value: JSON, so that numbers, bools, texts, lists and maps come back as what they were. No
/// value for one that JSON cannot hold.
std::optional<std::string> PersistentText(const QVariant& i_rValue);

/// The value of such a text; a text that is not JSON stands for itself.
QVariant PersistentValue(const std::string& i_rText);

/// Moves the persistent properties of a scene between its widget and a list of entries, ordered by key. No state.
/// Owned by the host services. UI thread.
class VQuickWidgetPersistence : public OrvanePluginInterface::IQuickWidgetPersistence
{
public:
    explicit VQuickWidgetPersistence(ThreadCheckPointer i_pCheck = nullptr);

    void ReadProperties(TQL::IQuickWidget* i_pWidget, Entries& o_rEntries) override;
    void WriteProperties(const Entries& i_rEntries, TQL::IQuickWidget* i_pWidget) override;

private:
    const ThreadCheckPointer m_pCheck;
};

} // namespace Services

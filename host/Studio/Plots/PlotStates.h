#pragma once

#include <filesystem>
#include <memory>
#include <vector>

class QWidget;

namespace TQL
{
class IStore;
}

namespace Studio
{

/// Saves the states that the contents of windows offer, in their order, so that a failure leaves the file as it was;
/// null stands for a window without a content. Nothing is written when none of them offers a state. What fails is in
/// the log. UI thread.
void SavePlotStates(const std::filesystem::path& i_rFile, const std::vector<QWidget*>& i_rContents);

/// Reads what SavePlotStates has written. Null when there is no such file, or when it is no store file.
std::shared_ptr<TQL::IStore> ReadPlotStates(const std::filesystem::path& i_rFile);

/// Gives a content the state that was saved for the window of that number. False when there is none for it or the
/// content takes none.
bool LoadPlotState(TQL::IStore& i_rStates, std::size_t i_Number, QWidget& o_rContent);

} // namespace Studio

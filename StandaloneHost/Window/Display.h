#pragma once

#include <QCoreApplication>

#include <memory>

namespace Window
{

/// Whether a window could be shown: the environment names a display, or a platform of Qt's.
[[nodiscard]] bool HasDisplay();

/// Makes the program's event loop, which belongs to the calling thread. With `window` it can show windows; a display
/// that cannot be used ends the program with one line on standard error and status 2, because Qt offers no way back.
/// Qt's own messages go to the log from then on. [host]
[[nodiscard]] std::unique_ptr<QCoreApplication> MakeEventLoop(bool window);

}

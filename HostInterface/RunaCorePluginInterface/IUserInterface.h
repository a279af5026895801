#pragma once

#include "HostInterface/NMX/IResult.h"

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

namespace RunaCorePluginInterface
{

/// A command of the host's menus. The functions are called on the GUI thread, for as long as the plugin exists.
struct MenuCommand
{
  std::string menu; ///< such as "&Edit"; "&" comes before the letter that opens it
  std::string text;
  std::string shortcut; ///< such as "Ctrl+Shift+P"; empty for none
  std::string toolTip;
  std::uint32_t colour = 0; ///< of its icon, 0xAARRGGBB

  /// Whether it can be triggered now; if not, `reason` is a sentence for people.
  std::function<bool(std::string& reason)> possible;

  /// Does it. When it fails, `reason` is a sentence for people.
  std::function<NMX::IResult(std::string& reason)> trigger;
};

/// The host's user interface, as far as plugins add to it. [gui]
class IUserInterface
{
public:
  IUserInterface() = default;
  IUserInterface(const IUserInterface&) = delete;
  IUserInterface& operator=(const IUserInterface&) = delete;
  virtual ~IUserInterface() = default;

  /// A colour of the theme as 0xAARRGGBB; opaque grey for a name that the theme does not have.
  [[nodiscard]] virtual std::uint32_t ThemeColour(std::string_view name) const = 0;

  /// Adds a command to a menu, which is made if it does not exist.
  virtual void AddCommand(MenuCommand command) = 0;
};

}

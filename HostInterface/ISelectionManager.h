#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/SelectionItem.h"

#include <functional>
#include <vector>

/// What is selected in the host's user interface, in the order in which it was selected. Subjects that leave the store
/// may stay selected: whoever reads asks the store. [gui]
class ISelectionManager
{
public:
  ISelectionManager() = default;
  ISelectionManager(const ISelectionManager&) = delete;
  ISelectionManager& operator=(const ISelectionManager&) = delete;
  virtual ~ISelectionManager() = default;

  [[nodiscard]] virtual std::vector<SelectionItem> Selection() const = 0;

  /// Selects these and nothing else. What comes twice counts once.
  virtual void Select(std::vector<SelectionItem> items) = 0;

  /// Calls `handler` after each change of the selection, within Select, for as long as the returned subscription lives.
  [[nodiscard]] virtual NMX::Subscription OnChange(std::function<void()> handler) = 0;
};

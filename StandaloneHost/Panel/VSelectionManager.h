#pragma once

#include "HostInterface/ISelectionManager.h"

#include <memory>

namespace Panel
{

/// The selection of the standalone host's window. A handler may select, subscribe, or end subscriptions. [gui]
class VSelectionManager final : public ISelectionManager
{
public:
  [[nodiscard]] std::vector<SelectionItem> Selection() const override { return m_selection; }
  void Select(std::vector<SelectionItem> items) override;
  [[nodiscard]] NMX::Subscription OnChange(std::function<void()> handler) override;

private:
  using Handler = std::function<void()>;

  std::vector<SelectionItem> m_selection;
  std::vector<std::weak_ptr<const Handler>> m_handlers;
};

}

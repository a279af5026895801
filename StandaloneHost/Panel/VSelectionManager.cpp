#include "StandaloneHost/Panel/VSelectionManager.h"

#include <algorithm>
#include <utility>

namespace Panel
{

void VSelectionManager::Select(std::vector<SelectionItem> items)
{
  std::vector<SelectionItem> selection;
  for (SelectionItem& item : items)
    if (std::ranges::find(selection, item) == selection.end())
      selection.push_back(std::move(item));
  if (selection == m_selection)
    return;
  m_selection = std::move(selection);
  std::erase_if(m_handlers, [](const auto& known) { return known.expired(); });
  // A handler may subscribe or end subscriptions: one that has been ended by then is not called any more.
  const auto handlers = m_handlers;
  for (const auto& known : handlers)
    if (const auto handler = known.lock())
      (*handler)();
}

NMX::Subscription VSelectionManager::OnChange(std::function<void()> handler)
{
  auto subscription = std::make_shared<const Handler>(std::move(handler));
  m_handlers.emplace_back(subscription);
  return subscription;
}

}

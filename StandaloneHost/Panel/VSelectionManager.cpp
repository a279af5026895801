#include "StandaloneHost/Panel/VSelectionManager.h"

#include <cstdint>
#include <set>
#include <string>
#include <tuple>
#include <utility>

namespace Panel
{

void VSelectionManager::Select(std::vector<SelectionItem> items)
{
  std::vector<SelectionItem> selection;
  std::set<std::tuple<NMX::TSubjectStoreId, std::int32_t, std::string>> known;
  for (SelectionItem& item : items)
    if (known.emplace(item.subject, item.slot, item.device).second)
      selection.push_back(std::move(item));
  if (selection == m_selection)
    return;
  m_selection = std::move(selection);
  std::erase_if(m_handlers, [](const auto& handler) { return handler.expired(); });
  // A handler may subscribe or end subscriptions: one that has been ended by then is not called any more.
  const auto handlers = m_handlers;
  for (const auto& subscribed : handlers)
    if (const auto handler = subscribed.lock())
      (*handler)();
}

NMX::Subscription VSelectionManager::OnChange(std::function<void()> handler)
{
  auto subscription = std::make_shared<const Handler>(std::move(handler));
  m_handlers.emplace_back(subscription);
  return subscription;
}

}

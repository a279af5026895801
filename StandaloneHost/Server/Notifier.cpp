#include "StandaloneHost/Server/Notifier.h"

#include "StandaloneHost/Server/JsonText.h"

#include <algorithm>
#include <memory>

namespace Server
{

using NMX::EResult;
using NMX::IResult;

std::vector<Notifier::Channel*> Notifier::Find(std::string_view name)
{
  if (m_channels.empty())
    for (const CallbackEntry& callback : m_registry.Callbacks())
      m_channels.push_back({&callback, {}, {}});

  const bool group = name.ends_with(".*");
  if (group)
    name.remove_suffix(1);
  std::vector<Channel*> found;
  for (Channel& channel : m_channels)
  {
    const std::string_view full = channel.callback->callback->Record().name;
    if (group ? full.starts_with(name) : full == name)
      found.push_back(&channel);
  }
  return found;
}

IResult Notifier::Subscribe(std::string_view name, IListener& listener, TerminalServer2::Level grantedLevel)
{
  const auto listens = [&](const Channel& channel)
  { return std::find(channel.listeners.begin(), channel.listeners.end(), &listener) != channel.listeners.end(); };

  auto channels = Find(name);
  if (channels.empty())
    return EResult::NotFound;
  // A group's name stands for what the client may hear of it.
  std::erase_if(channels, [&](const Channel* channel) { return channel->callback->level < grantedLevel; });
  if (channels.empty())
    return EResult::NotPermitted;
  std::erase_if(channels, [&](const Channel* channel) { return listens(*channel); });
  if (channels.empty())
    return EResult::OkButNoEffect;
  const auto already = static_cast<std::size_t>(std::count_if(m_channels.begin(), m_channels.end(), listens));
  if (already + channels.size() > m_limits.subscriptions)
    return EResult::AllocationFailure;

  for (Channel* channel : channels)
  {
    channel->listeners.push_back(&listener);
    if (!channel->subscription)
      channel->subscription = channel->callback->callback->Subscribe(
          [this, channel](const NMX::IServerNotification& notification) { Deliver(*channel, notification); });
  }
  return EResult::Ok;
}

IResult Notifier::Unsubscribe(std::string_view name, IListener& listener)
{
  const auto channels = Find(name);
  if (channels.empty())
    return EResult::NotFound;
  bool ended = false;
  for (Channel* channel : channels)
  {
    ended = std::erase(channel->listeners, &listener) != 0 || ended;
    if (channel->listeners.empty())
      channel->subscription.reset();
  }
  return ended ? EResult::Ok : EResult::OkButNoEffect;
}

void Notifier::Forget(IListener& listener)
{
  for (Channel& channel : m_channels)
  {
    std::erase(channel.listeners, &listener);
    if (channel.listeners.empty())
      channel.subscription.reset();
  }
}

void Notifier::Close()
{
  m_channels.clear();
}

void Notifier::Deliver(Channel& channel, const NMX::IServerNotification& notification)
{
  const CallbackEntry& callback = *channel.callback;
  std::string text = "{\"jsonrpc\":\"2.0\",\"method\":";
  AppendString(text, callback.callback->Record().name);
  text += ",\"params\":{";
  MemberWriter writer(text, callback.arguments);
  notification.WriteArguments(writer);
  text += callback.arguments.empty() ? "\"sequence\":" : ",\"sequence\":";
  AppendNumber(text, ++m_sequence);
  text += "}}";

  const auto message = std::make_shared<const ResponseText>(std::move(text));
  const EPolicy policy = callback.arguments.empty() ? EPolicy::Change : EPolicy::Sequence;
  // A listener that is too slow may leave while it is told.
  const std::vector<IListener*> listeners = channel.listeners;
  for (IListener* listener : listeners)
    listener->Notify(message, policy, &callback);
}

}

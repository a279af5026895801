#pragma once

#include "StandaloneHost/Server/Limits.h"

#include <cstddef>
#include <memory>
#include <utility>

namespace Server
{

/// What waits to be read by all clients together, in bytes of memory. [server]
class OutgoingBytes
{
public:
  explicit OutgoingBytes(const Limits& limits)
      : m_each(limits.outgoingBytes), m_overall(limits.outgoingBytesOverall),
        m_share(limits.outgoingBytesOverall / limits.connections)
  {
  }

  /// Whether a client for whom `waiting` bytes wait may have `more`. When too much waits for all clients together, each
  /// has its share only.
  [[nodiscard]] bool MayAdd(std::size_t waiting, std::size_t more) const
  {
    return waiting + more <= m_each && (m_total + more <= m_overall || waiting + more <= m_share);
  }

  /// How long a response to one message may be.
  [[nodiscard]] std::size_t Longest() const { return m_each; }

  void Add(std::size_t bytes) { m_total += bytes; }
  void Remove(std::size_t bytes) { m_total -= bytes; }
  [[nodiscard]] std::size_t Total() const { return m_total; }

private:
  const std::size_t m_each;
  const std::size_t m_overall;
  const std::size_t m_share;
  std::size_t m_total = 0;
};

/// The part of OutgoingBytes that one text or queue takes, given back when it ends. [server]
class HeldBytes
{
public:
  explicit HeldBytes(std::shared_ptr<OutgoingBytes> outgoing) : m_outgoing(std::move(outgoing)) {}
  HeldBytes(const HeldBytes&) = delete;
  HeldBytes& operator=(const HeldBytes&) = delete;
  ~HeldBytes() { Set(0); }

  [[nodiscard]] bool MayAdd(std::size_t more) const { return m_outgoing->MayAdd(m_bytes, more); }
  [[nodiscard]] std::size_t Longest() const { return m_outgoing->Longest(); }
  [[nodiscard]] std::size_t Bytes() const { return m_bytes; }

  void Add(std::size_t bytes)
  {
    m_bytes += bytes;
    m_outgoing->Add(bytes);
  }

  void Remove(std::size_t bytes)
  {
    m_bytes -= bytes;
    m_outgoing->Remove(bytes);
  }

  void Set(std::size_t bytes)
  {
    m_outgoing->Add(bytes);
    m_outgoing->Remove(std::exchange(m_bytes, bytes));
  }

private:
  const std::shared_ptr<OutgoingBytes> m_outgoing;
  std::size_t m_bytes = 0;
};

}

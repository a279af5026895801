#pragma once

#include "HostInterface/TerminalServer2/IServer.h"

#include <boost/unordered/unordered_flat_map.hpp>

#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Server
{

/// The meanings that a function's documentation gives to result codes.
using ResultTexts = std::vector<std::pair<NMX::IResult, std::string_view>>;

/// Reads lines "Code - Meaning". Lines that are not of that form, or whose code has no number, are passed over.
[[nodiscard]] ResultTexts ReadResultTexts(std::string_view documentation);

/// A registered function and what is worked out from it once.
struct FunctionEntry
{
  TerminalServer2::Level level;
  std::shared_ptr<NMX::IServerFunction> function;
  std::vector<std::string_view> inputs;  ///< names in the order of the record
  std::vector<std::string_view> outputs; ///< likewise
  ResultTexts results;

  /// The documented meaning of a result, or an empty text.
  [[nodiscard]] std::string_view Meaning(NMX::IResult result) const;
};

struct CallbackEntry
{
  TerminalServer2::Level level;
  std::shared_ptr<NMX::IServerCallback> callback;
  std::vector<std::string_view> arguments;
};

struct TypeEntry
{
  TerminalServer2::Level level;
  TerminalServer2::TypeRecord record;
};

/// Everything that has been registered, in the order of registration. Filled before the server opens, emptied after it
/// has closed.
class Registry
{
public:
  NMX::IResult Add(TerminalServer2::Level level, const TerminalServer2::TypeRecord& record);
  NMX::IResult Add(TerminalServer2::Level level, std::shared_ptr<NMX::IServerCallback> callback);
  NMX::IResult Add(TerminalServer2::Level level, std::shared_ptr<NMX::IServerFunction> function);
  void Clear();

  [[nodiscard]] const FunctionEntry* FindFunction(std::string_view name) const;

  [[nodiscard]] const std::deque<TypeEntry>& Types() const { return m_types; }
  [[nodiscard]] const std::deque<FunctionEntry>& Functions() const { return m_functions; }
  [[nodiscard]] const std::deque<CallbackEntry>& Callbacks() const { return m_callbacks; }

private:
  std::deque<TypeEntry> m_types;
  std::deque<FunctionEntry> m_functions;
  std::deque<CallbackEntry> m_callbacks;
  boost::unordered_flat_map<std::string_view, const FunctionEntry*> m_functionsByName; // keys look into the records
};

}

// The arguments of a call: reading them must never crash, and must finish every call once.

#include "RunaCorePluginSubjectStore/TerminalServer2/VServerFunction.h"

#include <cstdlib>

using namespace TerminalServer2;

extern "C" int LLVMFuzzerTestOneInput(const unsigned char* data, std::size_t size)
{
  using Signature = NMX::IResult(const std::string&, bool, std::uint32_t, std::uint64_t, double, std::string&);
  static constexpr ArgumentText texts[] = {{"A", ""}, {"B", ""}, {"C", ""}, {"D", ""}, {"E", ""}, {"F", ""}};
  static const auto function = NMX::MakeShared<VServerFunction<Signature>>(
      FunctionRecord{"Group.Function", "", texts, ""},
      [](const std::string&, bool, std::uint32_t, std::uint64_t, double, std::string&) -> NMX::IResult
      { return NMX::EResult::Ok; }, nullptr);
  std::string_view text(reinterpret_cast<const char*>(data), size);
  const std::size_t before = text.size();
  int finished = 0;
  function->Invoke(text, NMX::Caller{},
                   [&](const NMX::IServerReply& reply)
                   {
                     ++finished;
                     // A refusal says what was expected; success does not.
                     if (reply.Result().Failed() == reply.Text().empty())
                       std::abort();
                   });
  if (finished != 1 || text.size() > before)
    std::abort();
  return 0;
}

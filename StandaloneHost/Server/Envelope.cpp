#include "StandaloneHost/Server/Envelope.h"

#include <boost/container/static_vector.hpp>
#include <boost/json/monotonic_resource.hpp>
#include <boost/json/parse.hpp>
#include <boost/json/stream_parser.hpp>

#include <algorithm>
#include <new>
#include <utility>

namespace Server
{

namespace json = boost::json;

namespace
{

/// Text that is not JSON: ends the reading of a message.
struct NotJson
{
  std::string text;
};

/// Steps through JSON text value by value, so that each value's raw text is known.
class Scanner
{
public:
  Scanner(std::string_view text, std::size_t nesting) : m_rest(text), m_nesting(nesting) {}

  [[nodiscard]] char Peek()
  {
    while (!m_rest.empty() && IsWhiteSpace(m_rest.front()))
      m_rest.remove_prefix(1);
    if (m_rest.empty())
      throw NotJson{"the message ends too early"};
    return m_rest.front();
  }

  [[nodiscard]] bool AtEnd() const { return std::all_of(m_rest.begin(), m_rest.end(), IsWhiteSpace); }

  void Expect(char c)
  {
    if (Peek() != c)
      throw NotJson{std::string("expected '") + c + '\''};
    m_rest.remove_prefix(1);
  }

  /// Steps over a comma and answers true, or over `end` and answers false.
  [[nodiscard]] bool More(char end)
  {
    const char c = Peek();
    m_rest.remove_prefix(1);
    if (c != ',' && c != end)
      throw NotJson{std::string("expected ',' or '") + end + '\''};
    return c == ',';
  }

  /// The next string's text.
  [[nodiscard]] std::string String()
  {
    if (Peek() != '"')
      throw NotJson{"expected a string"};
    if (const std::size_t size = PlainString(); size != 0)
    {
      std::string plain(m_rest.substr(1, size - 2));
      m_rest.remove_prefix(size);
      return plain;
    }
    return std::string(Parse().as_string());
  }

  /// Steps over the next value and answers its raw text. `depth`: how deep the value itself lies.
  [[nodiscard]] std::string_view Raw(std::size_t depth)
  {
    const char c = Peek();
    const std::string_view before = m_rest;
    if (const std::size_t size = c == '"' ? PlainString() : PlainNumber(); size != 0)
    {
      m_rest.remove_prefix(size);
      return before.substr(0, size);
    }
    m_depth = depth;
    (void)Parse();
    std::string_view raw = before.substr(0, before.size() - m_rest.size());
    // The parser takes trailing white space with it.
    raw.remove_suffix(raw.size() - 1 - raw.find_last_not_of("\t\n\r "));
    return raw;
  }

private:
  static bool IsWhiteSpace(char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\r'; }

  // Nearly all strings and numbers of a request are plain; the others go through the parser.

  /// Length of the string ahead with its quotes; 0 when it has escapes, is not ASCII, or does not end.
  [[nodiscard]] std::size_t PlainString() const
  {
    for (std::size_t end = 1; end < m_rest.size(); ++end)
    {
      const auto c = static_cast<unsigned char>(m_rest[end]);
      if (c == '"')
        return end + 1;
      if (c < 0x20 || c > 0x7E || c == '\\')
        break;
    }
    return 0;
  }

  /// Length of the number ahead; 0 when it is more than a few digits without a leading zero.
  [[nodiscard]] std::size_t PlainNumber() const
  {
    std::size_t end = 0;
    while (end < m_rest.size() && m_rest[end] >= '0' && m_rest[end] <= '9')
      ++end;
    if (end == 0 || end > 18 || (end > 1 && m_rest[0] == '0') || end == m_rest.size())
      return 0;
    const char next = m_rest[end];
    return next == ',' || next == '}' || next == ']' || IsWhiteSpace(next) ? end : 0;
  }

  /// The value lives until the next one is parsed.
  const json::value& Parse()
  {
    json::parse_options options;
    options.max_depth = m_nesting - std::min(m_depth, m_nesting - 1);
    unsigned char parserBuffer[512];
    json::stream_parser parser(json::storage_ptr{}, options, parserBuffer);
    m_value = nullptr;
    m_memory.release();
    parser.reset(&m_memory);

    json::error_code error;
    const std::size_t read = parser.write_some(m_rest.data(), m_rest.size(), error);
    if (!error && !parser.done())
      parser.finish(error);
    if (error == json::error::too_deep)
      throw NotJson{"nested deeper than " + std::to_string(m_nesting)};
    if (error)
      throw NotJson{error.message()};
    m_rest.remove_prefix(read);
    return *(m_value =
                 new (m_memory.allocate(sizeof(json::value), alignof(json::value))) json::value(parser.release()));
  }

  std::string_view m_rest;
  const std::size_t m_nesting;
  std::size_t m_depth = 0;
  unsigned char m_buffer[4096];
  json::monotonic_resource m_memory{m_buffer, sizeof m_buffer};
  const json::value* m_value = nullptr;
};

/// Far more than a request has; comparing the names of more than that with each other would take long.
constexpr std::size_t maximumMembers = 16;

/// A request's id is a string, a number or null.
bool IsId(std::string_view raw)
{
  const char c = raw.front();
  return c == '"' || c == '-' || (c >= '0' && c <= '9') || raw == "null";
}

Complaint Invalid(std::string text)
{
  return {RpcError::invalidRequest, std::move(text)};
}

/// Takes in one member of a request; notes the first thing that is wrong.
void TakeMember(Request& request, const std::string& name, std::string_view raw)
{
  const auto complain = [&](std::string text)
  {
    if (!request.complaint)
      request.complaint = Invalid(std::move(text));
  };
  if (name == "jsonrpc")
  {
    if (raw.front() != '"' || Scanner(raw, 1).String() != "2.0")
      complain("\"jsonrpc\" must be \"2.0\"");
  }
  else if (name == "method")
  {
    if (raw.front() != '"')
      complain("\"method\" must be a string");
    else
      request.method = Scanner(raw, 1).String();
  }
  else if (name == "params")
  {
    if (raw.front() != '[' && raw.front() != '{')
      complain("\"params\" must be an array or an object");
    else
      request.params = raw;
  }
  else if (name == "id")
  {
    if (IsId(raw))
      request.id = raw;
    else
      complain("\"id\" must be a string, a number or null");
  }
}

Request ReadRequest(Scanner& scanner, std::size_t depth)
{
  Request request;
  if (scanner.Peek() != '{')
  {
    (void)scanner.Raw(depth);
    request.id = "null";
    request.complaint = Invalid("a request must be an object");
    return request;
  }
  scanner.Expect('{');
  boost::container::static_vector<std::string, maximumMembers> names;
  std::optional<Complaint> excess;
  for (bool more = scanner.Peek() != '}' || scanner.More('}'); more; more = scanner.More('}'))
  {
    std::string name = scanner.String();
    scanner.Expect(':');
    const std::string_view raw = scanner.Raw(depth + 1);
    if (names.size() == maximumMembers)
    {
      excess = Invalid("a request of more than " + std::to_string(maximumMembers) + " members");
      continue;
    }
    if (std::find(names.begin(), names.end(), name) != names.end())
      excess = Invalid("\"" + name + "\" is given twice");
    TakeMember(request, name, raw);
    names.push_back(std::move(name));
  }
  const auto has = [&](std::string_view name) { return std::find(names.begin(), names.end(), name) != names.end(); };
  if (excess)
    request.complaint = std::move(excess);
  if (!request.complaint && !has("jsonrpc"))
    request.complaint = Invalid("\"jsonrpc\" is missing");
  if (!request.complaint && !has("method"))
    request.complaint = Invalid("\"method\" is missing");
  // What is not a request cannot be a notification either, so it is answered.
  if (request.complaint && request.id.empty())
    request.id = "null";
  return request;
}

Message Read(std::string_view text, const Limits& limits)
{
  Message message;
  Scanner scanner(text, limits.nesting);
  message.batch = scanner.Peek() == '[';
  if (!message.batch)
    message.requests.push_back(ReadRequest(scanner, 0));
  else
  {
    scanner.Expect('[');
    if (scanner.Peek() == ']')
    {
      scanner.Expect(']');
      message.complaint = Invalid("an empty batch");
    }
    else
      do
      {
        if (message.requests.size() == limits.batchCalls)
        {
          message.complaint = Invalid("a batch of more than " + std::to_string(limits.batchCalls) + " calls");
          return message;
        }
        message.requests.push_back(ReadRequest(scanner, 1));
      } while (scanner.More(']'));
  }
  if (!scanner.AtEnd())
    throw NotJson{"text after the end of the message"};
  return message;
}

}

Message ReadMessage(std::string_view text, const Limits& limits)
{
  try
  {
    return Read(text, limits);
  }
  catch (const NotJson& failure)
  {
    Message message;
    message.complaint = Complaint{RpcError::parse, "Parse error: " + failure.text};
    return message;
  }
}

Members ReadMembers(std::string_view object, const Limits& limits)
{
  Members members;
  Scanner scanner(object, limits.nesting);
  scanner.Expect('{');
  for (bool more = scanner.Peek() != '}' || scanner.More('}'); more; more = scanner.More('}'))
  {
    std::string name = scanner.String();
    scanner.Expect(':');
    members.emplace_back(std::move(name), scanner.Raw(1));
  }
  return members;
}

std::optional<std::vector<std::string>> ReadTexts(std::string_view array)
{
  json::error_code error;
  const json::value value = json::parse(json::string_view(array.data(), array.size()), error);
  if (error || !value.is_array())
    return std::nullopt;
  std::vector<std::string> texts;
  for (const json::value& element : value.get_array())
  {
    if (!element.is_string())
      return std::nullopt;
    texts.emplace_back(element.get_string());
  }
  return texts;
}

}

#include "StandaloneHost/CommandLine/Answers.h"

#include "StandaloneHost/CommandLine/Layout.h"

#include <boost/json.hpp>

#include <algorithm>

namespace CommandLine
{

namespace json = boost::json;

namespace
{

using Rows = std::vector<std::vector<std::string>>;

const Argument* FindArgument(const std::vector<Argument>& arguments, std::string_view name)
{
  const auto found = std::find_if(arguments.begin(), arguments.end(),
                                  [name](const Argument& argument) { return argument.name == name; });
  return found == arguments.end() ? nullptr : &*found;
}

/// A value in a line. `raw`: valid JSON; a number is shown digit for digit.
std::string ValueText(const std::string& raw, const Argument* argument, const Description& description)
{
  if (raw.starts_with('"'))
    return Visible(TextOf(raw));
  if (argument != nullptr && argument->type == EType::Enumeration)
    if (const std::string name = ValueName(description, argument->enumeration, raw); !name.empty())
      return Visible(name) + " (" + raw + ')';
  return Visible(raw);
}

json::array ReadArray(const std::string& raw)
{
  json::error_code error;
  json::value value = json::parse(raw, error);
  return error || !value.is_array() ? json::array{} : std::move(value.as_array());
}

/// The lines of a list: its texts, or the number, name and text of each warning.
Rows ListRows(const std::string& raw, const Argument* argument, const Description& description)
{
  Rows rows;
  for (const json::value& element : ReadArray(raw))
  {
    const json::array* warning = element.if_array();
    if (const json::string* single = element.if_string())
      rows.push_back({Visible(std::string_view(single->data(), single->size()))});
    else if (warning == nullptr || warning->size() != 2 || !(*warning)[1].is_string() || argument == nullptr)
      rows.push_back({Visible(json::serialize(element))});
    else
    {
      const std::string number = json::serialize((*warning)[0]);
      const json::string& text = (*warning)[1].get_string();
      rows.push_back({number, Visible(ValueName(description, argument->enumeration, number)),
                      Visible(std::string_view(text.data(), text.size()))});
    }
  }
  return rows;
}

}

std::string ResultText(const Function* function, const std::string& text, const Description& description,
                       std::size_t width)
{
  const RawMembers result = ReadObject(text);
  const std::string outputsText = Member(result, "outputs");
  if (outputsText.empty())
    return Visible(text) + '\n';
  const RawMembers outputs = ReadObject(outputsText);
  const std::string returned = Member(result, "returned");
  const auto argument = [&](const std::string& name)
  { return function == nullptr ? nullptr : FindArgument(function->outputs, name); };

  if (outputs.size() == 1 && returned.empty())
  {
    const auto& [name, raw] = outputs.front();
    if (raw.starts_with('['))
      return Table(ListRows(raw, argument(name), description), width);
    return ValueText(raw, argument(name), description) + '\n';
  }
  Rows rows;
  if (!returned.empty())
    rows.push_back({"returned", Visible(returned)});
  for (const auto& [name, raw] : outputs)
  {
    if (!raw.starts_with('['))
    {
      rows.push_back({Visible(name), ValueText(raw, argument(name), description)});
      continue;
    }
    std::string label = Visible(name);
    for (auto& row : ListRows(raw, argument(name), description))
    {
      std::string line;
      for (const std::string& cell : row)
        line += (line.empty() ? "" : "  ") + cell;
      rows.push_back({std::exchange(label, ""), line});
    }
    if (!label.empty())
      rows.push_back({label, ""});
  }
  if (rows.empty())
    return Visible(TextOf(Member(result, "name"))) + '\n';
  return Table(rows, width);
}

std::string ErrorText(const std::string& text)
{
  const RawMembers error = ReadObject(text);
  std::string line = Visible(TextOf(Member(error, "message")));
  const std::string dataText = Member(error, "data");
  if (!dataText.starts_with('{'))
    return line;
  const RawMembers data = ReadObject(dataText);
  for (const char* part : {"text", "detail"})
    if (const std::string more = TextOf(Member(data, part)); !more.empty())
      line += ": " + Visible(more);
  return line;
}

std::string NotificationText(const Notification& notification, const Description& description)
{
  const Function* callback = description.FindCallback(notification.name);
  std::string line;
  for (const auto& [name, raw] : ReadObject(notification.params))
  {
    if (name == "sequence")
      continue;
    const Argument* argument = callback == nullptr ? nullptr : FindArgument(callback->inputs, name);
    line += (line.empty() ? "" : " ") + Visible(name) + '=' + ValueText(raw, argument, description);
  }
  return line;
}

}

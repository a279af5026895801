#include "StandaloneHost/CommandLine/Arguments.h"
#include "StandaloneHost/CommandLine/Client.h"
#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Description.h"
#include "StandaloneHost/CommandLine/Invocation.h"
#include "StandaloneHost/CommandLine/Layout.h"
#include "StandaloneHost/CommandLine/Names.h"
#include "StandaloneHost/CommandLine/Output.h"

#include <algorithm>
#include <unistd.h>

namespace CommandLine
{

namespace
{

using Rows = std::vector<std::vector<std::string>>;

std::vector<std::string> Lines(const std::string& text)
{
  std::vector<std::string> lines;
  for (std::size_t start = 0; start < text.size();)
  {
    const std::size_t end = std::min(text.find('\n', start), text.size());
    if (end != start)
      lines.push_back(Visible(text.substr(start, end - start)));
    start = end + 1;
  }
  return lines;
}

/// The text's lines, wrapped.
std::string Paragraph(const std::string& text, std::size_t width, std::size_t indent = 0)
{
  Rows rows;
  for (std::string& line : Lines(text))
    rows.push_back({std::move(line)});
  return Table(rows, width, indent);
}

std::string FirstSentence(const std::string& text)
{
  const std::string line = text.substr(0, text.find('\n'));
  const std::size_t end = line.find(". ");
  return Visible(end == std::string::npos ? line : line.substr(0, end + 1));
}

/// A line for each row, cut off at the terminal's edge.
std::string OneLineTable(const Rows& rows, std::size_t width, std::size_t indent)
{
  std::string text;
  for (const std::string& line : Lines(Table(rows, 0, indent)))
    if (width == 0 || Columns(line) <= width)
      text += line + '\n';
    else
      text += Wrap(line, width - std::min<std::size_t>(width, 2)).front() + " …\n";
  return text;
}

template <class Entry>
Rows OverviewRows(const std::vector<Entry>& entries, const std::string& group)
{
  Rows rows;
  for (const Entry& entry : entries)
  {
    if (entry.group != group)
      continue;
    std::string mark;
    if constexpr (requires { entry.preview; })
      mark = entry.preview ? "[preview] " : "";
    rows.push_back({Visible(WithoutGroup(entry.name)), mark + FirstSentence(entry.text)});
  }
  return rows;
}

std::string GroupText(const Group& group, const Description& description, std::size_t width)
{
  std::string text = Visible(group.name) + '\n' + Paragraph(group.text, width, 2);
  const std::pair<const char*, Rows> parts[]{{"functions", OverviewRows(description.functions, group.name)},
                                             {"callbacks", OverviewRows(description.callbacks, group.name)},
                                             {"enumerations", OverviewRows(description.enumerations, group.name)}};
  for (const auto& [name, rows] : parts)
    if (!rows.empty())
      text += std::string("  ") + name + '\n' + OneLineTable(rows, width, 4);
  return text;
}

std::string ArgumentsText(const char* heading, const std::vector<Argument>& arguments, std::size_t width)
{
  if (arguments.empty())
    return {};
  Rows rows;
  for (const Argument& argument : arguments)
  {
    auto lines = Lines(argument.text);
    lines.resize(std::max<std::size_t>(lines.size(), 1));
    rows.push_back({Visible(argument.name), Visible(TypeName(argument)), lines.front()});
    for (std::size_t i = 1; i < lines.size(); ++i)
      rows.push_back({"", "", lines[i]});
  }
  return std::string(heading) + '\n' + Table(rows, width, 2);
}

/// Lines such as "NotFound - If there is none.", in columns.
std::string ResultsText(const std::string& documentation, std::size_t width)
{
  Rows rows;
  for (const std::string& line : Lines(documentation))
    if (const auto dash = line.find(" - "); dash != std::string::npos)
      rows.push_back({line.substr(0, dash), line.substr(dash + 3)});
    else
      rows.push_back({line});
  return rows.empty() ? std::string{} : "results\n" + Table(rows, width, 2);
}

std::string FunctionText(const Function& function, bool callback, std::size_t width)
{
  std::string text =
      Visible(function.name) + (function.preview ? "  [preview]" : "") + '\n' + Paragraph(function.text, width) + '\n';
  if (callback)
    return text + ArgumentsText("arguments", function.inputs, width);
  text += CallText(function) + '\n';
  text += ArgumentsText("inputs", function.inputs, width);
  std::vector<Argument> outputs = function.outputs;
  if (function.returnsTruth)
    outputs.insert(outputs.begin(), Argument{"returned", "What the query answers.", EType::Truth, ""});
  return text + ArgumentsText("outputs", outputs, width) + ResultsText(function.results, width);
}

std::string EnumerationText(const Enumeration& enumeration, std::size_t width)
{
  Rows rows;
  for (const EnumerationValue& value : enumeration.values)
  {
    std::string text;
    for (const std::string& line : Lines(value.text))
      text += (text.empty() ? "" : " ") + line;
    rows.push_back({Visible(value.number), Visible(value.name), text});
  }
  return Visible(enumeration.name) + '\n' + Paragraph(enumeration.text, width) + '\n' + Table(rows, width, 2);
}

template <class Entry>
std::string JsonList(const std::vector<Entry>& entries, const std::string& group)
{
  std::string list;
  for (const Entry& entry : entries)
    if (entry.group == group)
      list += (list.empty() ? "" : ",") + entry.json;
  return '[' + list + ']';
}

std::string GroupJson(const Group& group, const Description& description)
{
  return R"({"name":)" + JsonString(group.name) + R"(,"description":)" + JsonString(group.text) + R"(,"methods":)" +
         JsonList(description.functions, group.name) + R"(,"x-callbacks":)" +
         JsonList(description.callbacks, group.name) + R"(,"x-types":)" +
         JsonList(description.enumerations, group.name) + '}';
}

std::string Overview(const Description& description, std::size_t width)
{
  std::string text;
  for (const Group& group : description.groups)
    text += (text.empty() ? "" : "\n") + GroupText(group, description, width);
  return text;
}

std::vector<std::string> AllNames(const Description& description)
{
  std::vector<std::string> names;
  const auto add = [&names](const auto& entries)
  {
    for (const auto& entry : entries)
      names.push_back(entry.name);
  };
  add(description.groups);
  add(description.functions);
  add(description.callbacks);
  add(description.enumerations);
  return names;
}

/// The part with this name, which is known.
std::string Part(const Description& description, const std::string& name, bool json, std::size_t width)
{
  if (const Function* function = description.FindFunction(name))
    return json ? function->json + '\n' : FunctionText(*function, false, width);
  if (const Function* callback = description.FindCallback(name))
    return json ? callback->json + '\n' : FunctionText(*callback, true, width);
  if (const Enumeration* enumeration = description.FindEnumeration(name))
    return json ? enumeration->json + '\n' : EnumerationText(*enumeration, width);
  const auto group = std::find_if(description.groups.begin(), description.groups.end(),
                                  [&](const Group& each) { return each.name == name; });
  return json ? GroupJson(*group, description) + '\n' : GroupText(*group, description, width);
}

}

int RunDescribe(const Invocation& invocation)
{
  if (invocation.words.size() > 1)
    throw UsageError("describe: one name at a time");
  const bool json = invocation.Has("json");
  const std::size_t width = TerminalWidth(STDOUT_FILENO);
  Loop loop;
  Client client(invocation.Host(), loop);
  const Description description = FetchDescription(client);
  if (!invocation.words.empty())
    Print(Part(description, ResolveName(invocation.words.front(), AllNames(description), "part of the API"), json,
               width));
  else
    Print(json ? description.json + '\n' : Overview(description, width));
  return static_cast<int>(EStatus::Success);
}

}

#include "StandaloneHost/CommandLine/Names.h"

#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Layout.h"

#include <algorithm>
#include <numeric>
#include <utility>

namespace CommandLine
{

namespace
{

constexpr std::size_t longestName = 200; // of those that are compared with all others
constexpr std::size_t mostSuggestions = 3;

/// How many characters have to be put in, taken out or exchanged to make one of the other.
std::size_t Distance(std::string_view one, std::string_view other)
{
  std::vector<std::size_t> row(other.size() + 1);
  std::iota(row.begin(), row.end(), std::size_t{0});
  for (std::size_t i = 0; i < one.size(); ++i)
  {
    std::size_t diagonal = std::exchange(row[0], i + 1);
    for (std::size_t j = 0; j < other.size(); ++j)
    {
      const std::size_t exchanged = diagonal + (one[i] == other[j] ? 0 : 1);
      diagonal = row[j + 1];
      row[j + 1] = std::min({exchanged, row[j] + 1, row[j + 1] + 1});
    }
  }
  return row.back();
}

/// The names that are nearest, if any is near.
std::vector<std::string> Nearest(std::string_view given, const std::vector<std::string>& names)
{
  if (given.size() > longestName)
    return {};
  const std::string wanted = LowerCase(given);
  const std::size_t reach = 1 + wanted.size() / 4;
  std::vector<std::pair<std::size_t, std::string>> near;
  for (const std::string& name : names)
  {
    const std::string known = LowerCase(name);
    const std::string_view last = WithoutGroup(known);
    const bool part = wanted.size() >= 4 && known.find(wanted) != std::string::npos;
    const std::size_t distance =
        part ? 1 : std::min({Distance(wanted, known), Distance(wanted, last), Distance(WithoutGroup(wanted), last)});
    if (distance <= reach)
      near.emplace_back(distance, name);
  }
  std::sort(near.begin(), near.end());
  near.resize(std::min(near.size(), mostSuggestions));
  std::vector<std::string> nearest;
  for (auto& [distance, name] : near)
    nearest.push_back(std::move(name));
  return nearest;
}

std::string Join(const std::vector<std::string>& names)
{
  std::string text;
  for (const std::string& name : names)
    text += (text.empty() ? "" : ", ") + Visible(name);
  return text;
}

template <class Matches>
std::vector<std::string> Select(const std::vector<std::string>& names, Matches matches)
{
  std::vector<std::string> selected;
  std::copy_if(names.begin(), names.end(), std::back_inserter(selected), matches);
  return selected;
}

}

std::string_view WithoutGroup(std::string_view name)
{
  const auto dot = name.find('.');
  return dot == std::string_view::npos ? name : name.substr(dot + 1);
}

std::string LowerCase(std::string_view text)
{
  std::string lower(text);
  for (char& c : lower)
    if (c >= 'A' && c <= 'Z')
      c = static_cast<char>(c - 'A' + 'a');
  return lower;
}

std::string ResolveName(std::string_view given, const std::vector<std::string>& names, std::string_view what)
{
  const std::string lower = LowerCase(given);
  const std::vector<std::string> stages[]{
      Select(names, [&](const std::string& name) { return name == given; }),
      Select(names, [&](const std::string& name) { return LowerCase(name) == lower; }),
      Select(names, [&](const std::string& name) { return WithoutGroup(name) == given; }),
      Select(names, [&](const std::string& name) { return LowerCase(WithoutGroup(name)) == lower; })};
  for (const auto& found : stages)
  {
    if (found.size() == 1)
      return found.front();
    if (found.size() > 1)
      throw UsageError(Quoted(given) + " could be " + Join(found));
  }
  std::string text = "there is no " + std::string(what) + ' ' + Quoted(given);
  const auto nearest = Nearest(given, names);
  throw UsageError(nearest.empty() ? text + "; describe lists what there is"
                                   : text + "; did you mean " + Join(nearest) + '?');
}

}

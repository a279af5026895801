#include "StoreInterface/ValueLimits.h"

#include "StoreInterface/WideText.h"

#include <boost/locale/utf.hpp>

#include <algorithm>
#include <optional>
#include <set>

namespace NMX::ValueLimits
{

namespace
{

/// The texts of a value, each as UTF-8 with the most bytes that it may have: `visit(text, mostBytes)`.
template <class Visit>
struct EachText
{
  template <class Other>
  void operator()(const Other& /*noText*/) const
  {
  }
  void operator()(const std::string& text) const { visit(text, textBytes); }
  // A wide text that is no Unicode comes as one that is no UTF-8.
  void operator()(const std::wstring& text) const { visit(ToUtf8(text).value_or("\xFF"), pathBytes); }
  void operator()(const std::vector<SmartCluster>& clusters) const
  {
    for (const SmartCluster& cluster : clusters)
      for (const std::string* text : {&cluster.label, &cluster.deviceUrn, &cluster.type})
        (*this)(*text);
  }
  void operator()(const std::vector<Slot>& slots) const
  {
    for (const Slot& slot : slots)
      (*this)(slot.name);
  }
  void operator()(const Option& option) const
  {
    (*this)(option.chosen);
    for (const Choice& choice : option.choices)
    {
      (*this)(choice.name);
      (*this)(choice.path);
    }
  }
  void operator()(const Action& action) const { (*this)(action.text); }

  Visit visit;
};

template <class Visit>
void ForEachText(const Value& value, Visit visit)
{
  std::visit(EachText<Visit>{std::move(visit)}, value);
}

struct ListSize
{
  std::size_t size = 0;
  std::size_t most = 0;
};

ListSize SizeOf(const Value& value)
{
  if (const auto* list = std::get_if<std::vector<SmartCluster>>(&value))
    return {list->size(), elements};
  if (const auto* list = std::get_if<std::vector<Slot>>(&value))
    return {list->size(), elements};
  if (const auto* list = std::get_if<std::vector<Position>>(&value))
    return {list->size(), positions};
  if (const auto* option = std::get_if<Option>(&value))
    return {option->choices.size(), choices};
  return {};
}

std::set<std::string> UnfitTexts(const Value& value)
{
  std::set<std::string> unfit;
  ForEachText(value,
              [&](const std::string& text, std::size_t most)
              {
                if (!TextProblem(text, most).empty())
                  unfit.insert(text);
              });
  return unfit;
}

}

bool IsUtf8(std::string_view text)
{
  using Utf8 = boost::locale::utf::utf_traits<char>;
  const char* const end = text.data() + text.size();
  for (const char* next = text.data(); next != end;)
    if (static_cast<unsigned char>(*next) < 0x80)
      ++next;
    else if (const auto character = Utf8::decode(next, end);
             character == boost::locale::utf::illegal || character == boost::locale::utf::incomplete)
      return false;
  return true;
}

std::string TextProblem(std::string_view text, std::size_t mostBytes)
{
  if (text.size() > mostBytes)
    return "is a text of " + std::to_string(text.size()) + " bytes, expected at most " + std::to_string(mostBytes);
  return IsUtf8(text) ? "" : "is not UTF-8, expected a text in UTF-8";
}

std::string Problem(const Value& value)
{
  if (const ListSize list = SizeOf(value); list.size > list.most)
    return "has " + std::to_string(list.size) + " elements, expected at most " + std::to_string(list.most);
  std::string problem;
  ForEachText(value,
              [&](const std::string& text, std::size_t most)
              {
                if (problem.empty())
                  problem = TextProblem(text, most);
              });
  return problem;
}

bool Admits(const Value& value, const Value& current)
{
  if (Problem(value).empty())
    return true;
  const ListSize list = SizeOf(value);
  if (list.size > std::max(list.most, SizeOf(current).size))
    return false;
  const std::set<std::string> wrong = UnfitTexts(value);
  const std::set<std::string> present = UnfitTexts(current);
  return std::ranges::includes(present, wrong);
}

}

#include "StandaloneHost/CommandLine/Arguments.h"

#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Layout.h"
#include "StandaloneHost/CommandLine/Names.h"

#include <boost/json.hpp>

#include <algorithm>
#include <optional>

namespace CommandLine
{

namespace json = boost::json;

namespace
{

CommandError Expected(const Argument& argument, std::string_view expected, std::string_view word)
{
  return UsageError('"' + Visible(argument.name) + "\": expected " + std::string(expected) + ", got " + Quoted(word));
}

std::string TruthJson(const Argument& argument, std::string_view word)
{
  if (word != "true" && word != "false")
    throw Expected(argument, "true or false", word);
  return std::string(word);
}

bool IsWhole(std::string_view word)
{
  const std::string_view digits = word.substr(word.starts_with('-') ? 1 : 0);
  return !digits.empty() && std::all_of(digits.begin(), digits.end(), [](char c) { return c >= '0' && c <= '9'; });
}

/// The digits go to the host as they stand, so that none is lost; whether the number fits is for the host to say.
std::string WholeJson(const Argument& argument, std::string_view word)
{
  if (!IsWhole(word))
    throw Expected(argument, "a whole number", word);
  const bool negative = word.starts_with('-');
  const std::string_view digits = word.substr(negative ? 1 : 0);
  const std::string_view plain = digits.substr(std::min(digits.find_first_not_of('0'), digits.size() - 1));
  return (negative ? "-" : "") + std::string(plain);
}

std::string NumberJson(const Argument& argument, std::string_view word)
{
  if (IsWhole(word))
    return WholeJson(argument, word);
  json::error_code error;
  const json::value value = json::parse(json::string_view(word.data(), word.size()), error);
  if (error || !value.is_number())
    throw Expected(argument, "a number", word);
  return std::string(word);
}

std::string TextJson(const Argument& argument, std::string_view word)
{
  if (!IsUtf8(word))
    throw Expected(argument, "text in UTF-8", word);
  return JsonString(word);
}

/// A JSON array of texts, or texts with commas between them; the empty word is no text at all.
std::string TextsJson(const Argument& argument, std::string_view word)
{
  if (word.starts_with('['))
  {
    json::error_code error;
    const json::value value = json::parse(json::string_view(word.data(), word.size()), error);
    const json::array* array = error ? nullptr : value.if_array();
    if (array == nullptr ||
        !std::all_of(array->begin(), array->end(), [](const json::value& element) { return element.is_string(); }))
      throw Expected(argument, R"(a JSON array of texts, such as ["a", "b"])", word);
    return json::serialize(value);
  }
  std::string list;
  for (std::string_view rest = word; !rest.empty();)
  {
    const std::size_t comma = std::min(rest.find(','), rest.size());
    list += (list.empty() ? "" : ",") + TextJson(argument, rest.substr(0, comma));
    // A comma at the end has an empty text behind it.
    if (comma + 1 == rest.size())
      list += ",\"\"";
    rest.remove_prefix(std::min(comma + 1, rest.size()));
  }
  return '[' + list + ']';
}

std::string EnumerationJson(const Argument& argument, std::string_view word, const Description& description)
{
  if (IsWhole(word))
    return WholeJson(argument, word);
  std::string names;
  if (const Enumeration* enumeration = description.FindEnumeration(argument.enumeration))
    for (const EnumerationValue& value : enumeration->values)
    {
      if (LowerCase(value.name) == LowerCase(word))
        return value.number;
      names += (names.empty() ? "" : ", ") + Visible(value.name);
    }
  throw Expected(argument, "one of " + names + ", or a number", word);
}

std::string RawJson(const Argument& argument, std::string_view word)
{
  json::error_code error;
  const json::value value = json::parse(json::string_view(word.data(), word.size()), error);
  if (error)
    throw Expected(argument, "JSON", word);
  return json::serialize(value);
}

/// The input that a word names before its "="; none when it is a word by position.
std::optional<std::size_t> NamedInput(const Function& function, std::string_view word)
{
  const auto equals = word.find('=');
  if (equals == std::string_view::npos)
    return std::nullopt;
  for (std::size_t i = 0; i < function.inputs.size(); ++i)
    if (function.inputs[i].name == word.substr(0, equals))
      return i;
  return std::nullopt;
}

}

std::string ArgumentJson(const Argument& argument, std::string_view word, const Description& description)
{
  switch (argument.type)
  {
  case EType::Truth:
    return TruthJson(argument, word);
  case EType::WholeNumber:
    return WholeJson(argument, word);
  case EType::Number:
    return NumberJson(argument, word);
  case EType::Text:
    return TextJson(argument, word);
  case EType::TextSet:
  case EType::TextList:
    return TextsJson(argument, word);
  case EType::Enumeration:
    return EnumerationJson(argument, word, description);
  case EType::Warnings:
  case EType::Other:
    break;
  }
  return RawJson(argument, word);
}

std::vector<std::string> ReadInputs(const Function& function, std::span<const std::string> words,
                                    const Description& description)
{
  std::vector<std::string> inputs(function.inputs.size());
  std::size_t position = 0;
  for (const std::string_view word : words)
  {
    const auto named = NamedInput(function, word);
    const std::size_t index = named ? *named : position++;
    if (index >= inputs.size())
      throw UsageError("too many arguments: " + CallText(function));
    if (!inputs[index].empty())
      throw UsageError('"' + Visible(function.inputs[index].name) + "\" is given twice: " + CallText(function));
    const std::string_view value = named ? word.substr(word.find('=') + 1) : word;
    inputs[index] = ArgumentJson(function.inputs[index], value, description);
  }
  for (std::size_t i = 0; i < inputs.size(); ++i)
    if (inputs[i].empty())
      throw UsageError('"' + Visible(function.inputs[i].name) + "\" is missing: " + CallText(function));
  return inputs;
}

std::string CallText(const Function& function)
{
  std::string text = "call " + Visible(function.name);
  for (const Argument& input : function.inputs)
    text += ' ' + Visible(input.name);
  return text;
}

}

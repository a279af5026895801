#pragma once

#include "StandaloneHost/CommandLine/Client.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace CommandLine
{

/// The types that arguments have.
enum class EType
{
  Truth,
  WholeNumber,
  Number,
  Text,
  TextSet,
  TextList,
  Enumeration,
  Warnings,
  Other
};

struct Argument
{
  std::string name;
  std::string text;
  EType type = EType::Other;
  std::string enumeration; ///< the name, of an enumeration or of warnings
};

struct Group
{
  std::string name;
  std::string text;
};

/// A function, or a callback, whose arguments are its inputs.
struct Function
{
  std::string name;
  std::string text;
  std::string group;
  bool preview = false;
  std::vector<Argument> inputs;
  std::vector<Argument> outputs;
  bool returnsTruth = false;
  std::string results; ///< the documentation of the result codes, one a line
  std::string json;    ///< as the host has it
};

struct EnumerationValue
{
  std::string number;
  std::string name;
  std::string text;
};

struct Enumeration
{
  std::string name;
  std::string text;
  std::string group;
  std::vector<EnumerationValue> values;
  std::string json;
};

/// What a host says that it offers.
struct Description
{
  std::vector<Group> groups;
  std::vector<Function> functions;
  std::vector<Function> callbacks;
  std::vector<Enumeration> enumerations;
  std::string json;

  /// Null when there is none.
  [[nodiscard]] const Function* FindFunction(std::string_view name) const;
  [[nodiscard]] const Function* FindCallback(std::string_view name) const;
  [[nodiscard]] const Enumeration* FindEnumeration(std::string_view name) const;
};

/// The name of a value of an enumeration; empty when it is not known. `number`: as JSON has it.
[[nodiscard]] std::string ValueName(const Description& description, std::string_view enumeration,
                                    std::string_view number);

/// What an argument's type is called.
[[nodiscard]] std::string TypeName(const Argument& argument);

/// Reads an OpenRPC document. Throws HostError when it is none.
[[nodiscard]] Description ReadDescription(const std::string& json);

/// Asks the host. Throws HostError.
[[nodiscard]] Description FetchDescription(Client& client);

}

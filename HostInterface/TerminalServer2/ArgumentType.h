#pragma once

#include "HostInterface/TerminalServer2/Records.h"

namespace TerminalServer2
{

/// What an argument of the API can be.
enum class EArgumentType
{
  Bool,
  UInt32,
  UInt64,
  Double,
  Text,        ///< UTF-8
  TextSet,     ///< sorted, without repeats
  TextList,    ///< in an order that means something
  WarningMap,  ///< values of an enumeration, each with a text, in ascending order
  Enumeration, ///< one value of an enumeration
  SessionId    ///< of a subject calibration; 0 means none
};

enum class EDirection
{
  Input,
  Output
};

/// Type of one argument of a function or callback, as its signature has it.
struct ArgumentType
{
  EArgumentType type;
  EDirection direction;
  const TypeRecord* enumeration = nullptr; ///< for WarningMap and Enumeration
};

}

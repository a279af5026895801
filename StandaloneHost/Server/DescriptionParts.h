#pragma once

#include "HostInterface/NMX/IResult.h"
#include "HostInterface/TerminalServer2/ArgumentType.h"

#include <boost/json/object.hpp>

#include <span>
#include <string>
#include <string_view>

/// What the documents that describe the API have in common.
namespace Server
{

struct DocumentedFailure
{
  NMX::EResult code;
  std::string_view text;
};

/// The server's own functions for notifications; both take the same argument and answer alike.
struct SubscriptionText
{
  std::string_view method;
  std::string_view description;
  std::span<const DocumentedFailure> failures;
};

[[nodiscard]] std::span<const SubscriptionText> SubscriptionTexts();

inline constexpr std::string_view subscriptionNameText =
    "Name of a callback, or of a group followed by \".*\" for all its callbacks.";

/// What stands before the point in the name of a function or callback.
[[nodiscard]] std::string_view GroupOf(std::string_view name);

/// True when the documentation begins with the mark "@deprecated".
[[nodiscard]] bool IsDeprecated(std::string_view description);

/// The schema of a value. `title` is unique in its document: generators of clients name their types after it.
[[nodiscard]] boost::json::object ArgumentSchema(const TerminalServer2::ArgumentType& type, const std::string& title);

/// The schema of a whole number that needs 64 bits.
[[nodiscard]] boost::json::object SequenceSchema(const std::string& title, std::string_view description);

/// The schema of a whole number that a double holds.
[[nodiscard]] boost::json::object CountSchema(const std::string& title, std::string_view description);

[[nodiscard]] boost::json::object TextSchema(const std::string& title, std::string_view description);

/// The schema of an object of which every member is required.
[[nodiscard]] boost::json::object ObjectSchema(const std::string& title, boost::json::object properties);

/// The schema of a successful answer with the given outputs.
[[nodiscard]] boost::json::object ResultSchema(const std::string& method, boost::json::object outputs,
                                               bool returnsTruth);

/// The schema of a successful answer to one of the subscription functions.
[[nodiscard]] boost::json::object SubscriptionResultSchema(const std::string& method);

}

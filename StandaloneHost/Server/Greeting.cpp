#include "StandaloneHost/Server/Greeting.h"

#include "StandaloneHost/Server/DescriptionParts.h"
#include "StandaloneHost/Server/JsonText.h"

#include <boost/json.hpp>

#include <utility>

namespace Server
{

namespace json = boost::json;

namespace
{

struct LevelText
{
  std::string_view name;
  std::string_view description;
};

constexpr LevelText levelTexts[] = {{"open", "Level of what everybody may call."},
                                    {"preview", "Level of what is a preview."},
                                    {"granted", "Least level that this client may call."}};

}

std::string GreetingText(const Greeting& greeting)
{
  std::string text = "{\"jsonrpc\":\"2.0\",\"method\":";
  AppendString(text, greetingMethod);
  text += ",\"params\":{\"session\":";
  AppendNumber(text, greeting.session);
  text += ",\"epoch\":";
  AppendString(text, greeting.epoch);
  text += ",\"api\":";
  AppendString(text, greeting.api);
  text += ",\"limits\":";
  char separator = '{';
  for (const LimitRow& limit : LimitRows())
  {
    text += std::exchange(separator, ',');
    AppendString(text, limit.name);
    text += ':';
    AppendNumber(text, std::uint64_t{greeting.limits.*limit.member});
  }
  text += "},\"levels\":{\"open\":2,\"preview\":1,\"granted\":";
  AppendNumber(text, std::uint64_t{greeting.grantedLevel});
  text += "}}}";
  return text;
}

json::object GreetingMembers()
{
  const std::string title(greetingMethod);
  json::object api = TextSchema(title + ".Api", "SHA-256 of openrpc.json followed by asyncapi.json, in hexadecimal: "
                                                "another text when the API is another one.");
  api["pattern"] = "^[0-9a-f]{64}$";
  json::object limits;
  for (const LimitRow& limit : LimitRows())
    limits[limit.name] = CountSchema(title + ".Limits." + std::string(limit.name), limit.description);
  json::object levels;
  for (const LevelText& level : levelTexts)
    levels[level.name] = CountSchema(title + ".Levels." + std::string(level.name), level.description);
  return {{"session", CountSchema(title + ".Session", "Number of the connection, since the host was started.")},
          {"epoch", TextSchema(title + ".Epoch", "New at each start of the host. When it differs after a reconnection, "
                                                 "everything that a client remembers may be stale.")},
          {"api", std::move(api)},
          {"limits", ObjectSchema(title + ".Limits", std::move(limits))},
          {"levels", ObjectSchema(title + ".Levels", std::move(levels))}};
}

}

#include "StandaloneHost/Server/TokenFile.h"

#include "StandaloneHost/Server/VServer.h"

#include <algorithm>
#include <fstream>
#include <system_error>

namespace Server
{

std::string ReadTokenFile(const std::filesystem::path& file)
{
  constexpr std::size_t longest = 512;
  const std::string name = '"' + file.string() + '"';
  std::error_code error;
  std::ifstream in;
  if (std::filesystem::is_regular_file(file, error))
    in.open(file, std::ios::binary);
  if (!in.is_open())
    throw ServerError("cannot read a token from " + name);
  std::string token(longest + 2, '\0');
  in.read(token.data(), static_cast<std::streamsize>(token.size()));
  token.resize(static_cast<std::size_t>(in.gcount()));
  token.resize(std::min(token.find('\n'), token.size()));
  while (!token.empty() && (token.back() == '\r' || token.back() == ' '))
    token.pop_back();
  if (token.empty())
    throw ServerError("the first line of " + name + " is empty");
  const bool fits = std::all_of(token.begin(), token.end(), [](char c) { return c >= ' ' && c <= '~'; });
  if (!fits || token.front() == ' ' || token.size() > longest)
    throw ServerError("the first line of " + name + " is not up to " + std::to_string(longest) +
                      " printable ASCII characters");
  return token;
}

}

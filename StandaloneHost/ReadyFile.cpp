#include "StandaloneHost/ReadyFile.h"

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StandaloneHost/Files/WholeFile.h"
#include "StandaloneHost/PluginModule.h"

#include <fcntl.h>
#include <stdexcept>
#include <string>
#include <sys/stat.h>
#include <system_error>
#include <unistd.h>
#include <utility>

namespace
{

namespace fs = std::filesystem;

/// Where the content of a file is or will be.
fs::path Resolved(const fs::path& file)
{
  std::error_code error;
  const fs::path absolute = fs::absolute(file, error);
  fs::path resolved = fs::weakly_canonical(absolute, error);
  return error ? absolute : resolved;
}

bool IsSame(const fs::path& file, const fs::path& other)
{
  std::error_code error;
  return !other.empty() && (Resolved(file) == Resolved(other) || fs::equivalent(file, other, error));
}

/// Whether the file is `own`, or one whose name begins like it, as the store's log does.
bool BelongsTo(const fs::path& file, const fs::path& own)
{
  const fs::path resolved = Resolved(file);
  for (const fs::path& place : {Resolved(own), Resolved(own.parent_path()) / own.filename()})
    if (resolved.parent_path() == place.parent_path() &&
        resolved.filename().string().starts_with(place.filename().string()))
      return true;
  return IsSame(file, own);
}

}

void CheckReadyFile(const Options& options, const fs::path& tokenFile)
{
  const fs::path& file = options.readyFile;
  if (file.empty())
    return;
  const auto refuse = [&](const std::string& what)
  { throw OptionError("--ready-file: \"" + file.string() + "\" is " + what + ", which it would replace"); };
  if (options.dataFolder)
    for (const char* own : {"store.sqlite", "window.ini"})
      if (BelongsTo(file, *options.dataFolder / own))
        refuse("a file that the host keeps in the data folder");
  for (const fs::path& configuration : options.configurations)
    if (IsSame(file, configuration))
      refuse("the file of --config");
  const std::pair<const char*, fs::path> read[]{{"the file of --token-file", tokenFile},
                                                {"the file of --tls-cert", options.server.tlsCertificate},
                                                {"the file of --tls-key", options.server.tlsKey},
                                                {"the plugin", options.pluginFile},
                                                {"the plugin", OwnPluginFile()},
                                                {"this program", "/proc/self/exe"}};
  for (const auto& [what, other] : read)
    if (IsSame(file, other))
      refuse(what);
}

ReadyFile::ReadyFile(const fs::path& file, std::string_view text)
{
  if (file.empty())
    return;
  std::error_code error;
  if (file.has_parent_path() && !fs::is_directory(file.parent_path(), error))
    throw std::runtime_error("cannot write the ready file \"" + file.string() + "\": its folder is not there");
  try
  {
    // Another file may come in its place as soon as it is there.
    Files::WriteWholeFile(file, text,
                          [this](const fs::path& unfinished)
                          { m_descriptor = open(unfinished.c_str(), O_PATH | O_CLOEXEC); });
  }
  catch (const Files::ConfigurationError& failure)
  {
    if (m_descriptor >= 0)
      close(m_descriptor);
    throw std::runtime_error("cannot write the ready file: " + std::string(failure.what()));
  }
  m_target = Resolved(file);
}

ReadyFile::~ReadyFile()
{
  if (m_descriptor < 0)
    return;
  struct stat own{};
  struct stat found{};
  if (fstat(m_descriptor, &own) == 0 && lstat(m_target.c_str(), &found) == 0 && own.st_dev == found.st_dev &&
      own.st_ino == found.st_ino)
    (void)unlink(m_target.c_str());
  close(m_descriptor);
}

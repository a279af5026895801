#pragma once

#include "StandaloneHost/FileIO/VRunaCoreFileIO.h"
#include "StoreInterface/WideText.h"
#include "tests/Support/StoreDump.h"
#include "tests/Support/StoreFixture.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <string>

inline const std::filesystem::path sources = SUBJECT_STORE_SOURCE_DIR;

/// A text that XML changes unless it is escaped.
inline const std::string awkward = " <a & \"b'>]]>\t\r\n caf\xC3\xA9 \xF0\x9F\x98\x80 ";

inline std::wstring Wide(const std::filesystem::path& path)
{
  return NMX::ToWide(path.string()).value();
}

inline std::string ContentOf(const std::filesystem::path& file)
{
  std::ifstream in(file, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), {}};
}

/// What lies in the folder: each file with its content.
inline std::map<std::string, std::string> FilesIn(const std::filesystem::path& folder)
{
  std::map<std::string, std::string> files;
  for (const auto& entry : std::filesystem::recursive_directory_iterator(folder))
    files[entry.path().string()] = entry.is_regular_file() ? ContentOf(entry.path()) : "";
  return files;
}

/// A test of the file service, with a folder and a second store of its own.
class FileIOTest : public StoreFixture
{
protected:
  void LoadStage() { ASSERT_TRUE(Load(sources / "examples/stage.xml").Succeeded()) << reason; }

  NMX::IResult Load(const std::filesystem::path& path) { return io.LoadSubjectConfiguration(Wide(path), reason); }
  NMX::IResult Save(const std::filesystem::path& path) { return io.SaveSubjectConfiguration(Wide(path), reason); }

  Id Find(std::string_view name) const
  {
    Id id;
    EXPECT_TRUE(store->Reader()->FindByName(name, id).Succeeded()) << name;
    return id;
  }

  std::filesystem::path Write(const std::string& name, const std::string& text) const
  {
    std::ofstream(folder.Path() / name, std::ios::binary) << text;
    return folder.Path() / name;
  }

  const TemporaryFolder folder;
  const std::filesystem::path file = folder.Path() / "a.xml";
  std::string reason;
  FileIO::VRunaCoreFileIO io{store};
  std::shared_ptr<Store::VStore> other = NMX::MakeShared<Store::VStore>();
  FileIO::VRunaCoreFileIO otherIO{other};
};

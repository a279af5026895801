#pragma once

#include "StandaloneHost/Files/ConfigurationError.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

/// A test of what reads template files.
class TemplateFixture : public testing::Test
{
protected:
  /// Files' texts, each with what its refusal begins with, or "read" when it is to be read.
  using Refusals = std::vector<std::pair<std::string, std::string>>;

  [[nodiscard]] std::filesystem::path Write(std::string_view text) const
  {
    std::ofstream(m_file, std::ios::binary) << text;
    return m_file;
  }

  /// What follows the file's name in the message of the error, after "unreadable " when the error is of that type;
  /// "read" when there is none.
  template <class Read>
  [[nodiscard]] std::string Refusal(Read read, const std::filesystem::path& file) const
  {
    try
    {
      (void)read(file);
      return "read";
    }
    catch (const Files::ConfigurationError& error)
    {
      const bool unreadable = dynamic_cast<const Files::UnreadableFileError*>(&error) != nullptr;
      return (unreadable ? "unreadable " : "") + std::string(error.what()).substr(file.string().size() + 1);
    }
  }

  template <class Read>
  void ExpectRefusals(Read read, const Refusals& refusals) const
  {
    for (const auto& [text, refusal] : refusals)
      EXPECT_THAT(Refusal(read, Write(text)), testing::StartsWith(refusal)) << text.substr(0, 300);
  }

  /// A file of version 1 with that content, which begins on line 2.
  [[nodiscard]] static std::string File(const std::string& root, const std::string& content)
  {
    return '<' + root + " version='1'>\n" + content + "</" + root + '>';
  }

  /// So many elements on a line each, with a number of their own between the two texts.
  [[nodiscard]] static std::string Many(int count, const std::string& before, const std::string& after)
  {
    std::string text;
    for (int i = 0; i < count; ++i)
      text += before + std::to_string(i) + after + '\n';
    return text;
  }

  const TemporaryFolder m_folder;
  const std::filesystem::path m_file = m_folder.Path() / "a";
  const std::filesystem::path m_shipped = std::filesystem::path(SUBJECT_STORE_SOURCE_DIR) / "StandaloneHost";
};

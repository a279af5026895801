#include "StandaloneHost/FileIO/VRunaCoreFileIO.h"

#include "StandaloneHost/FileIO/TemplateExport.h"
#include "StandaloneHost/Files/SubjectConfiguration.h"
#include "StandaloneHost/Files/TextFile.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/WideText.h"

#include <algorithm>
#include <exception>
#include <filesystem>
#include <new>
#include <utility>

namespace FileIO
{

using Files::ConfigurationError;
using NMX::EResult;
using NMX::IResult;
using NMX::TSubjectStoreId;

namespace
{

std::filesystem::path PathOf(const std::wstring& text)
{
  if (text.empty())
    throw ConfigurationError("no file is named", EResult::InvalidName);
  auto utf8 = NMX::ToUtf8(text);
  if (!utf8 || utf8->find('\0') != std::string::npos)
    throw ConfigurationError("the file's name has a character that no name can have", EResult::InvalidName);
  return *std::move(utf8);
}

/// Runs an operation on a file, which throws when it fails.
template <class Operation>
IResult Run(const std::wstring& file, std::string& reason, Operation operation) noexcept
{
  try
  {
    operation(PathOf(file));
    return EResult::Ok;
  }
  catch (const ConfigurationError& failure)
  {
    reason = failure.what();
    return failure.Result();
  }
  catch (const std::bad_alloc&)
  {
    reason = "there is not enough memory";
    return EResult::AllocationFailure;
  }
  catch (const std::exception& failure)
  {
    reason = failure.what();
    return EResult::FailedWithException;
  }
}

void CheckIsMesh(const std::filesystem::path& file)
{
  std::string extension = file.extension().string();
  std::ranges::transform(extension, extension.begin(),
                         [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; });
  if (extension != ".obj" && extension != ".ply" && extension != ".stl")
    throw ConfigurationError(file.string() + ": this is no mesh by its name, expected one that ends with .obj, .ply or "
                                             ".stl",
                             EResult::NotSupported);
}

void ImportMeshFile(NMX::IStore& store, const std::filesystem::path& file, const std::wstring& path)
{
  Files::CheckReadable(file);
  CheckIsMesh(file);
  const std::string name = file.stem().string();
  const auto check = [&](IResult result, const char* what)
  {
    if (result.Failed())
      throw ConfigurationError(
          file.string() + ": " + what + ' ' + Files::Quoted(name) + ": " + std::string(result.Name()), result);
  };
  const auto editor = store.Editor();
  TSubjectStoreId id;
  const IResult added = editor->Add(NMX::ESubjectKind::SceneMeshes, name, id);
  if (added == EResult::AlreadyPresent)
    throw ConfigurationError(file.string() + ": there is a subject " + Files::Quoted(name) + " already", added);
  check(added, "the store refuses the subject");
  check(editor->SetValue(id, NMX::Paths::FilePath(), path), "the store refuses the path of");
  check(editor->Commit(), "the store cannot keep");
}

}

VRunaCoreFileIO::VRunaCoreFileIO(std::shared_ptr<NMX::IStore> store) : m_store(std::move(store)) {}

IResult VRunaCoreFileIO::LoadSubjectConfiguration(const std::wstring& file, std::string& reason)
{
  return Run(file, reason,
             [this](const std::filesystem::path& path) { Files::ReplaceSubjectConfiguration(*m_store, path); });
}

IResult VRunaCoreFileIO::SaveSubjectConfiguration(const std::wstring& file, std::string& reason)
{
  return Run(file, reason,
             [this](const std::filesystem::path& path) { Files::SaveSubjectConfiguration(*m_store, path); });
}

IResult VRunaCoreFileIO::ImportSubject(const std::wstring& file, bool overwrite, std::string& reason)
{
  return Run(file, reason,
             [&](const std::filesystem::path& path) { Files::ImportSubjects(*m_store, path, overwrite); });
}

IResult VRunaCoreFileIO::ImportMesh(const std::wstring& file, std::string& reason)
{
  return Run(file, reason, [&](const std::filesystem::path& path) { ImportMeshFile(*m_store, path, file); });
}

IResult VRunaCoreFileIO::ExportSubject(TSubjectStoreId subject, const std::wstring& file, std::string& reason)
{
  return Run(file, reason, [&](const std::filesystem::path& path) { Files::ExportSubject(*m_store, subject, path); });
}

IResult VRunaCoreFileIO::ExportTemplate(TSubjectStoreId subject, const std::wstring& file, std::string& reason)
{
  return Run(file, reason, [&](const std::filesystem::path& path) { FileIO::ExportTemplate(*m_store, subject, path); });
}

}

#pragma once

#include "HostInterface/IRunaCoreFileIO.h"
#include "StoreInterface/IStore.h"

#include <memory>

namespace FileIO
{

/// The standalone host's files of subjects: subject configurations, also for single subjects, and templates. The
/// calling thread holds no access to the store. [any]
class VRunaCoreFileIO final : public IRunaCoreFileIO
{
public:
  explicit VRunaCoreFileIO(std::shared_ptr<NMX::IStore> store);

  NMX::IResult LoadSubjectConfiguration(const std::wstring& file, std::string& reason) override;
  NMX::IResult SaveSubjectConfiguration(const std::wstring& file, std::string& reason) override;
  NMX::IResult ImportSubject(const std::wstring& file, bool overwrite, std::string& reason) override;
  /// Only whether the file can be opened is found out: nobody here shows meshes.
  NMX::IResult ImportMesh(const std::wstring& file, std::string& reason) override;
  NMX::IResult ExportSubject(NMX::TSubjectStoreId subject, const std::wstring& file, std::string& reason) override;
  NMX::IResult ExportTemplate(NMX::TSubjectStoreId subject, const std::wstring& file, std::string& reason) override;

private:
  const std::shared_ptr<NMX::IStore> m_store;
};

}

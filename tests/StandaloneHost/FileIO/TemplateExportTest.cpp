#include "StandaloneHost/Calibration/LabellingTemplateFile.h"
#include "StandaloneHost/Calibration/VSubjectCreator.h"
#include "StandaloneHost/Characters/TemplateFile.h"
#include "StandaloneHost/SmartObjects/TemplateFile.h"
#include "tests/StandaloneHost/FileIO/FileIOFixture.h"

using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using testing::HasSubstr;
namespace fs = std::filesystem;
namespace Paths = NMX::Paths;

namespace
{

TEST_F(FileIOTest, ATemplateOfASubjectReadsBackAsWhatItStartsWith)
{
  const Id belt = Add(ESubjectKind::SmartObjects, "Belt");
  Set(belt, Paths::SmartClusters(),
      std::vector<NMX::SmartCluster>{{awkward, "urn", 3, "Corvex1"}, {"\x01%41 Back", "", 0, "Corvex1"}});
  ASSERT_TRUE(io.ExportTemplate(belt, Wide(file), reason).Succeeded()) << reason;
  SmartObjects::SmartObjectTemplate object{{{awkward, "Corvex1"}, {"\x01%41 Back", "Corvex1"}}, {}};
  EXPECT_TRUE(SmartObjects::ReadTemplate(file) == object);
  object.additionalMarkers = {{0.1, -2, 1e-9}};
  Set(belt, Paths::AdditionalMarkerPositions(), object.additionalMarkers);
  ASSERT_TRUE(io.ExportTemplate(belt, Wide(file), reason).Succeeded()) << reason;
  EXPECT_TRUE(SmartObjects::ReadTemplate(file) == object);

  const Id ranger = Add(ESubjectKind::CharactersFromClusters, "Ranger");
  Set(ranger, Paths::Slots(), std::vector<NMX::Slot>{{Id(2), "Hip"}, {Id(1), "Head"}, {Id(3), "Hand"}});
  Set(ranger, Paths::RoleSolving(), false);
  Set(ranger, Paths::RoleRetargeting(), true);
  ASSERT_TRUE(io.ExportTemplate(ranger, Wide(file), reason).Succeeded()) << reason;
  EXPECT_TRUE(Characters::ReadTemplate(file) ==
              (Characters::CharacterTemplate{{{"Hip", ""}, {"Head", "Hip"}, {"Hand", "Hip"}},
                                             {{"Hip", "Hip"}, {"Head", "Head"}, {"Hand", "Hand"}},
                                             false,
                                             true}));
}

TEST_F(FileIOTest, ATemplateOfAGeneralSubjectHasTheSkeletonThatItWasMadeFrom)
{
  const fs::path made = sources / "StandaloneHost/Calibration/Templates/Performer with staff.lbt";
  Calibration::VSubjectCreator creator;
  std::shared_ptr<const ISubjectTemplate> content;
  ASSERT_TRUE(creator.ReadTemplate(Wide(made), L"", content).Succeeded());
  Change([&](NMX::IEntryEditor& editor) { EXPECT_TRUE(creator.CreateSubject(editor, "Anna", *content).Succeeded()); });
  const Id anna = Find("Anna");
  auto expected = Calibration::ReadLabellingTemplate(made);
  ASSERT_TRUE(io.ExportTemplate(anna, Wide(file), reason).Succeeded()) << reason;
  EXPECT_TRUE(Calibration::ReadLabellingTemplate(file) == expected);

  Set(anna, Paths::RoleLabelling(), false);
  Set(Add(ESubjectKind::Props, "Hat"), Paths::ParentSubjectId(), anna);
  Set(Add(ESubjectKind::BasicObjects, "Ring"), Paths::ParentSubjectId(), anna);
  expected.labelling = false;
  expected.children.push_back({ESubjectKind::Props, "Hat", ""});
  ASSERT_TRUE(io.ExportTemplate(anna, Wide(file), reason).Succeeded()) << reason;
  EXPECT_TRUE(Calibration::ReadLabellingTemplate(file) == expected);

  const auto text = ContentOf(file);
  Set(anna, Paths::FilePath(), Wide(folder.Path() / "gone.lbt"));
  EXPECT_EQ(io.ExportTemplate(anna, Wide(file), reason), IResult(EResult::NotSupported));
  EXPECT_THAT(reason, HasSubstr("gone.lbt:1:1: the file cannot be read"));
  EXPECT_EQ(ContentOf(file), text);
}

TEST_F(FileIOTest, AMeshIsASubjectNamedAfterItsFile)
{
  const fs::path mesh = Write("Tavern floor.v2.OBJ", "");
  ASSERT_TRUE(io.ImportMesh(Wide(mesh), reason).Succeeded()) << reason;
  EXPECT_EQ(Get<std::wstring>(Find("Tavern floor.v2"), Paths::FilePath()), Wide(mesh));
  NMX::ESubjectKind kind{};
  EXPECT_TRUE(store->Reader()->Kind(Find("Tavern floor.v2"), kind).Succeeded());
  EXPECT_EQ(kind, ESubjectKind::SceneMeshes);

  const StoreDump before = Dump(*store);
  fs::create_directory(folder.Path() / "folder.obj");
  const std::pair<fs::path, EResult> failures[] = {{mesh, EResult::AlreadyPresent},
                                                   {Write("Tavern floor.v2.stl", ""), EResult::AlreadyPresent},
                                                   {Write("a:b.ply", ""), EResult::InvalidName},
                                                   {Write("walls.fbx", ""), EResult::NotSupported},
                                                   {Write(".obj", ""), EResult::NotSupported},
                                                   {folder.Path() / "none.obj", EResult::FileNotFound},
                                                   {folder.Path() / "folder.obj", EResult::FileIOFailure},
                                                   {"", EResult::InvalidName}};
  for (const auto& [path, result] : failures)
  {
    reason.clear();
    EXPECT_EQ(io.ImportMesh(Wide(path), reason), IResult(result)) << path;
    EXPECT_NE(reason, "") << path;
  }
  archive.full = true;
  EXPECT_EQ(io.ImportMesh(Wide(Write("walls.ply", "")), reason), IResult(EResult::DiskFull));
  EXPECT_TRUE(Dump(*store) == before);
}

}

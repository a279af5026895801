#include "tests/StandaloneHost/FileIO/FileIOFixture.h"
#include "tests/Support/OldStore.h"

#include <sys/resource.h>
#include <sys/stat.h>

#include <csignal>
#include <functional>

using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using testing::HasSubstr;
namespace fs = std::filesystem;
namespace Paths = NMX::Paths;

namespace
{

/// Each thing that can be wrong with a file that is read has its result and its reason, and changes nothing.
TEST_F(FileIOTest, FilesThatCannotBeReadChangeNothing)
{
  LoadStage();
  const std::string stage = ContentOf(sources / "examples/stage.xml");
  const auto subjects = [](const std::string& text)
  { return "<SubjectConfiguration version='1'>\n<Subjects>" + text + "</Subjects></SubjectConfiguration>"; };
  struct Case
  {
    fs::path path;
    EResult result;
    std::string reason;
  };
  const Case both[] = {
      {"", EResult::InvalidName, "no file is named"},
      {std::string("a\0b", 3), EResult::InvalidName, "a character that no name can have"},
      {folder.Path() / "none.xml", EResult::FileNotFound, "none.xml:1:1: the file cannot be read: No such file"},
      {sources / "README.md/a.xml", EResult::FileNotFound, "Not a directory"},
      {folder.Path(), EResult::FileIOFailure, "this is a directory"},
      {"/dev/zero", EResult::FileIOFailure, "this is a device or a pipe"},
      {Write("empty.xml", ""), EResult::SerialisationFailure, "the file is empty"},
      {Write("cut.xml", stage.substr(0, stage.size() / 2)), EResult::SerialisationFailure, "the file ends too early"},
      {Write("latin1.xml", subjects("\n<Subject kind='Props' name='caf\xE9'/>")), EResult::SerialisationFailure,
       "latin1.xml:3:32: this is not a UTF-8 character"},
      {sources / "StandaloneHost/SmartObjects/Templates/Corvex.sot", EResult::SerialisationFailure,
       "Corvex.sot:2:1: unknown element <SmartObjectTemplate>, expected SubjectConfiguration"},
      {Write("name.xml", subjects("\n<Subject kind='Props' name='a/b'/>")), EResult::InvalidName, "name.xml:3:1: "},
      {Write("flags.xml", subjects("<Subject kind='Props' name='a'><Parameters>\n<Flags>1</Flags></Parameters>"
                                   "</Subject>")),
       EResult::InvalidValue, "flags.xml:3:1: the store refuses the value of Parameters/Flags"}};
  const Case imports[] = {
      {sources / "examples/stage.xml", EResult::SerialisationFailure, "stage.xml:7:5: there is a device"},
      {Write("none-in-it.xml", subjects("")), EResult::SerialisationFailure, "there is no subject"}};
  const StoreDump before = Dump(*store);
  const auto files = FilesIn(folder.Path());
  const auto expect = [&](const Case& each, const std::function<IResult()>& read)
  {
    reason.clear();
    EXPECT_EQ(read(), IResult(each.result)) << each.path << ' ' << reason;
    EXPECT_THAT(reason, HasSubstr(each.reason));
    EXPECT_TRUE(Dump(*store) == before) << each.path;
  };
  for (const Case& each : both)
  {
    expect(each, [&] { return Load(each.path); });
    expect(each, [&] { return io.ImportSubject(Wide(each.path), true, reason); });
  }
  for (const Case& each : imports)
    expect(each, [&] { return io.ImportSubject(Wide(each.path), true, reason); });
  archive.full = true;
  expect({file, EResult::DiskFull, "DiskFull"}, [&] { return Load(sources / "examples/stage.xml"); });
  EXPECT_EQ(io.LoadSubjectConfiguration({static_cast<wchar_t>(0xD800)}, reason), IResult(EResult::InvalidName));
  EXPECT_TRUE(FilesIn(folder.Path()) == files);
}

TEST_F(FileIOTest, FilesThatCannotBeWrittenStayAsTheyWere)
{
  LoadStage();
  Write("a.xml", "before");
  const Id cable = Add(ESubjectKind::BasicObjects, "Cable");
  const Id badName = Add(ESubjectKind::SmartObjects, "Unnamed");
  Set(badName, Paths::SmartClusters(), std::vector<NMX::SmartCluster>{{"", "", 0, "Corvex1"}});
  FileIO::VRunaCoreFileIO oldIO(OpenOldStore({"Old"}, std::string(1025, 'g')));
  struct Case
  {
    std::function<IResult()> write;
    EResult result;
    std::string reason;
  };
  const auto exporting = [&](Id id, const fs::path& path)
  { return [this, id, path] { return io.ExportSubject(id, Wide(path), reason); }; };
  const auto templating = [&](Id id) { return [this, id] { return io.ExportTemplate(id, Wide(file), reason); }; };
  const Case cases[] = {
      {exporting(cable, ""), EResult::InvalidName, "no file is named"},
      {exporting(cable, folder.Path()), EResult::FileIOFailure, "this is a directory"},
      {exporting(cable, "/dev/null"), EResult::FileIOFailure, "this is a device"},
      {exporting(cable, file / "b.xml"), EResult::FileIOFailure, "Not a directory"},
      {exporting(cable, folder.Path() / "no/such/folder.xml"), EResult::FileIOFailure, "No such file or directory"},
      {exporting(cable, "/proc/self/a.xml"), EResult::FileIOFailure, "/proc/self/a.xml: the file cannot be written"},
      {exporting(cable, folder.Path() / std::string(300, 'n')), EResult::FileIOFailure, "File name too long"},
      {exporting(Id(12345), file), EResult::InvalidId, "no such subject"},
      // What the format cannot say must not become a file that cannot be read.
      {templating(badName), EResult::SerialisationFailure,
       "it could not be read again: attribute \"label\" of <SmartCluster> is empty"},
      {[&] { return oldIO.SaveSubjectConfiguration(Wide(file), reason); }, EResult::SerialisationFailure,
       "subject \"Old\": <ProximityGroupName> is a text of 1025 bytes, expected at most 1024"},
      {templating(Id(12345)), EResult::InvalidId, "no such subject"},
      {templating(cable), EResult::NotSupported, "kind BasicObjects"},
      {templating(Add(ESubjectKind::CharactersFromClusters, "Slotless")), EResult::SerialisationFailure, "<Segments>"},
      {templating(Add(ESubjectKind::GeneralSubjects, "Anna")), EResult::NotSupported, "not made from a template"}};
  const StoreDump before = Dump(*store);
  const auto files = FilesIn(folder.Path());
  for (const Case& each : cases)
  {
    SCOPED_TRACE(each.reason);
    EXPECT_EQ(each.write(), IResult(each.result)) << reason;
    EXPECT_THAT(reason, HasSubstr(each.reason));
    EXPECT_TRUE(FilesIn(folder.Path()) == files);
  }
  EXPECT_TRUE(Dump(*store) == before);
}

/// The disk takes only the beginning of what is written.
TEST_F(FileIOTest, AFileThatIsCutShortDoesNotAppear)
{
  LoadStage();
  Write("a.xml", "before");
  const auto files = FilesIn(folder.Path());
  rlimit before{};
  ASSERT_EQ(getrlimit(RLIMIT_FSIZE, &before), 0);
  const rlimit few{1000, before.rlim_max};
  const auto handler = std::signal(SIGXFSZ, SIG_IGN);
  ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &few), 0);
  const IResult saved = Save(file);
  const IResult savedElsewhere = Save(folder.Path() / "new/b.xml");
  ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &before), 0);
  std::signal(SIGXFSZ, handler);
  EXPECT_EQ(saved, IResult(EResult::FileIOFailure));
  EXPECT_EQ(savedElsewhere, IResult(EResult::FileIOFailure));
  EXPECT_THAT(reason, HasSubstr("File too large"));
  EXPECT_TRUE(FilesIn(folder.Path()) == files);
}

TEST_F(FileIOTest, AFileIsReplacedWithItsPermissionsAndThroughLinksAndItsFolderIsMade)
{
  LoadStage();
  Write("a.xml", "before");
  ASSERT_EQ(chmod(file.c_str(), 0640), 0);
  const fs::path link = folder.Path() / "link.xml";
  fs::create_symlink("a.xml", link);
  ASSERT_TRUE(Save(link).Succeeded()) << reason;
  EXPECT_TRUE(fs::is_symlink(link));
  EXPECT_GT(fs::file_size(file), 1000U);
  EXPECT_EQ(fs::status(file).permissions(), fs::perms(0640));
  ASSERT_TRUE(Save(folder.Path() / "new/b.xml").Succeeded()) << reason;
  EXPECT_EQ(ContentOf(folder.Path() / "new/b.xml"), ContentOf(file));
  EXPECT_EQ(FilesIn(folder.Path()).size(), 4U) << "two files, the link, the folder";
}

}

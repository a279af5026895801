#include "StandaloneHost/SmartObjects/TemplateFile.h"

#include "tests/Support/TemporaryFolder.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <fstream>
#include <map>
#include <string_view>

namespace SmartObjects
{

namespace
{

using Path = std::filesystem::path;

class TemplateFileTest : public testing::Test
{
protected:
  Path Write(std::string_view text) const
  {
    const Path file = m_folder.Path() / "a.sot";
    std::ofstream(file, std::ios::binary) << text;
    return file;
  }

  /// The message of the error, with files by their bare names; "read" when there is none.
  std::string Refusal(const Path& file) const
  {
    try
    {
      (void)ReadTemplate(file);
      return "read";
    }
    catch (const Files::ConfigurationError& error)
    {
      std::string text = error.what();
      const std::string folder = m_folder.Path().string() + '/';
      for (auto at = text.find(folder); at != std::string::npos; at = text.find(folder))
        text.erase(at, folder.size());
      return text;
    }
  }

  TemporaryFolder m_folder;
};

/// A template with that content, which begins on line 2.
std::string File(std::string_view content)
{
  return "<SmartObjectTemplate version='1'>\n" + std::string(content) + "</SmartObjectTemplate>";
}

constexpr std::string_view cluster = "<SmartClusters><SmartCluster label='Grip' type='Corvex1'/></SmartClusters>";

/// The clusters begin on line 3.
std::string Clusters(std::string_view clusters)
{
  return File("<SmartClusters>\n" + std::string(clusters) + "</SmartClusters>");
}

/// A template that is sound but for the markers, which begin on line 3.
std::string Markers(std::string_view markers)
{
  return File(std::string(cluster) + "<AdditionalMarkerPositions>\n" + std::string(markers) +
              "</AdditionalMarkerPositions>");
}

std::string Repeated(std::string_view text, int times)
{
  std::string all;
  for (int i = 0; i < times; ++i)
    all += text;
  return all;
}

/// As many clusters, each with a label of its own, on a line each.
std::string ManyClusters(int count)
{
  std::string clusters;
  for (int i = 0; i < count; ++i)
    clusters += "<SmartCluster label='C" + std::to_string(i) + "' type='Corvex1'/>\n";
  return Clusters(clusters);
}

TEST_F(TemplateFileTest, ReadsClustersAndMarkersInTheirOrder)
{
  const std::string clusters =
      "<SmartClusters><SmartCluster label='Tip' type='Corvex1'/><SmartCluster type='T&#228;g 2' label='Grip'/>"
      "</SmartClusters>";
  const std::string markers = "<AdditionalMarkerPositions>\n <Marker x='136.5' y='82' z='14'/><!-- the other -->\n"
                              "<Marker z='-2.5e1' x='-129' y='0'></Marker></AdditionalMarkerPositions>";
  const SmartObjectTemplate expected{{{"Tip", "Corvex1"}, {"Grip", "T\xC3\xA4g 2"}}, {{136.5, 82, 14}, {-129, 0, -25}}};
  EXPECT_EQ(ReadTemplate(Write("\xEF\xBB\xBF<?xml version='1.0' encoding='UTF-8'?>\r\n" + File(clusters + markers))),
            expected);
  EXPECT_EQ(ReadTemplate(Write(File(markers + "\n" + clusters) + "\n")), expected);
  EXPECT_EQ(ReadTemplate(Write(ManyClusters(64))).clusters.size(), 64U);
}

TEST_F(TemplateFileTest, ReadsTheShippedTemplate)
{
  EXPECT_EQ(ReadTemplate(Path(SUBJECT_STORE_SOURCE_DIR) / "StandaloneHost/SmartObjects/Templates/Corvex.sot"),
            (SmartObjectTemplate{{{"Cluster", "Corvex1"}}, {}}));
}

struct Malformed
{
  std::string text;
  std::string begin;         ///< of the message, with the place
  std::string expected = {}; ///< somewhere in the message
};

TEST_F(TemplateFileTest, RefusesMalformedFilesAndTellsWhere)
{
  using namespace std::string_literals;
  const std::string good = File(cluster);
  const std::string markers = "<AdditionalMarkerPositions/>";
  const auto marker = [](std::string_view x) { return Markers("<Marker x='" + std::string(x) + "' y='2' z='3'/>"); };

  std::vector<Malformed> table{
      // The file as such
      {"", "1:1: the file is empty"},
      {good.substr(0, 55), "2:22: the file ends too early", "expected </SmartClusters>"},
      {File("<SmartClusters><SmartCluster label='\xC3\xA4' type='\xFF'/>"), "2:46: this is not a UTF-8 character",
       "UTF-8"},
      {"\xFF\xFE<\0S\0"s, "1:1: this is not a UTF-8 character"},
      {"<SmartObject version='1'/>", "1:1: unknown element <SmartObject>", "expected SmartObjectTemplate"},
      {"<SmartObjectTemplate/>", "1:1: <SmartObjectTemplate> lacks an attribute", "expected \"version\""},
      {"<SmartObjectTemplate version='1.0'/>", "1:1: the version is \"1.0\"", "expected 1"},
      {"<SmartObjectTemplate version='1' name='x'/>", "1:1: unknown attribute \"name\"", "expected version"},

      // Sections
      {File(""), "1:1: <SmartObjectTemplate> lacks an element", "expected SmartClusters"},
      {File(markers), "1:1: <SmartObjectTemplate> lacks an element", "expected SmartClusters"},
      {File(markers + "<SmartClusters/>"), "2:29: <SmartClusters> is empty", "expected at least one SmartCluster"},
      {File(std::string(cluster) + "\n" + std::string(cluster)), "3:1: repeated <SmartClusters>", "a.sot:2:1"},
      {File(markers + markers), "2:29: repeated <AdditionalMarkerPositions>", "a.sot:2:1"},
      {File("<Markers/>"), "2:1: unknown element <Markers>",
       "expected one of SmartClusters, AdditionalMarkerPositions"},
      {File("<SmartClusters count='1'/>"), "2:1: unknown attribute \"count\" of <SmartClusters>", "expected none"},
      {File("\n x"), "3:2: unexpected text \"x\" in <SmartObjectTemplate>", "expected elements only"},
      {Clusters("<SmartCluster label='Grip'/>"), "3:1: <SmartCluster> lacks an attribute", "expected \"type\""},
      {Clusters("<SmartCluster label='' type='T'/>"), "3:1: attribute \"label\" of <SmartCluster> is empty"},
      {Clusters("<SmartCluster label='L' type=''/>"), "3:1: attribute \"type\" of <SmartCluster> is empty"},
      {Clusters("<SmartCluster label='L' type='T' device='d'/>"), "3:1: unknown attribute \"device\" of <SmartCluster>",
       "expected one of label, type"},
      {Clusters("<SmartCluster label='L' type='T'/>\n <SmartCluster label='L' type='U'/>"), "4:2: repeated label \"L\"",
       "a.sot:3:1"},
      {Clusters("<SmartCluster label='L' type='T'>x</SmartCluster>"), "3:34: unexpected text \"x\" in <SmartCluster>"},
      {ManyClusters(65), "67:1: one cluster too many", "expected at most 64"},

      // Markers
      {Markers("<SmartCluster/>"), "3:1: unknown element <SmartCluster>", "expected Marker"},
      {Markers("<Marker x='1' y='2'/>"), "3:1: <Marker> lacks an attribute", "expected \"z\""},
      {Markers("<Marker x='1' y='2' z='3' w='4'/>"), "3:1: unknown attribute \"w\" of <Marker>",
       "expected one of x, y, z"},
      {Markers("<Marker x='1' y='2' z='3'>\n<Marker/></Marker>"), "4:1: unknown element <Marker>", "expected none"},

      // Declarations and depth that would keep a reader busy
      {"<!-- <!DOCTYPE> --><?p?>\n<!DOCTYPE a SYSTEM 'b'>" + good, "2:1: a document type declaration is not allowed"},
      {Repeated("\xEF\xBB\xBF", 3) + "<!DOCTYPE a>" + good, "1:2: a document type declaration is not allowed"},
      {"<!DOCTYPE a [<!ENTITY b 'laugh'><!ENTITY c '" + Repeated("&b;", 10) + "'><!ENTITY d '" + Repeated("&c;", 10) +
           "'>]>" + File("&d;"),
       "1:1: a document type declaration is not allowed"},
      // Expanded within the declaration already
      {"<!DOCTYPE a [<!ENTITY % b \"<!ENTITY x 'laugh'>\"><!ENTITY % c '" + Repeated("&#37;b;", 1000) + "'>%c;]>" +
           good,
       "1:1: a document type declaration is not allowed"},
      {Markers(Repeated("<Marker x='1' y='2' z='3'>", 20000)), "3:27: unknown element <Marker>", "expected none"},
      {File(Repeated("<a>", 100000)), "2:1: unknown element <a>"},
  };
  for (const char* x : {"", "NaN", "inf", "-Infinity", "1e999", "1,5", " 1", "0x1F", "wide"})
    table.push_back(
        {marker(x), "3:1: attribute \"x\" of <Marker> is \"" + std::string(x) + '"', "expected a finite number"});

  for (const Malformed& malformed : table)
  {
    SCOPED_TRACE(malformed.text.substr(0, 200));
    const std::string refusal = Refusal(Write(malformed.text));
    EXPECT_TRUE(refusal.starts_with("a.sot:" + malformed.begin)) << refusal;
    EXPECT_NE(refusal.find(malformed.expected), std::string::npos) << refusal;
    EXPECT_LT(refusal.size(), 300U);
  }
}

TEST_F(TemplateFileTest, RefusesWhatIsNoReadableFile)
{
  const Path sparse = m_folder.Path() / "sparse.sot";
  std::ofstream(sparse) << "<";
  std::filesystem::resize_file(sparse, 100'000'000);
  const std::map<Path, std::string> refusals{
      {sparse, "sparse.sot:1:1: the file has 100000000 bytes, expected at most 1048576"},
      {m_folder.Path() / "none.sot", "none.sot:1:1: the file cannot be read: No such file or directory"},
      {m_folder.Path(), m_folder.Path().string() + ":1:1: this is a directory, expected a file"}};
  for (const auto& [file, refusal] : refusals)
    EXPECT_EQ(Refusal(file), refusal);

  std::string text = File(cluster);
  text.append((std::size_t{1} << 20) - text.size(), ' ');
  EXPECT_EQ(Refusal(Write(text)), "read");
  EXPECT_EQ(Refusal(Write(text + ' ')), "a.sot:1:1: the file has 1048577 bytes, expected at most 1048576");
}

TEST_F(TemplateFileTest, RefusesAFileThatItMayNotRead)
{
  if (geteuid() == 0)
    GTEST_SKIP() << "root may read everything";
  const Path file = Write(File(cluster));
  std::filesystem::permissions(file, std::filesystem::perms::none);
  EXPECT_EQ(Refusal(file), "a.sot:1:1: the file cannot be read: Permission denied");
}

}

}

#include "StandaloneHost/SmartObjects/TemplateFile.h"

#include "tests/Support/TemplateFixture.h"

namespace SmartObjects
{

namespace
{

class TemplateFileTest : public TemplateFixture
{
protected:
  static std::string File(const std::string& content) { return TemplateFixture::File("SmartObjectTemplate", content); }
  /// The clusters begin on line 3.
  static std::string Clusters(const std::string& clusters)
  {
    return File("<SmartClusters>\n" + clusters + "</SmartClusters>");
  }
};

const std::string cluster = "<SmartClusters><SmartCluster label='Grip' type='Corvex1'/></SmartClusters>";

TEST_F(TemplateFileTest, ReadsClustersAndMarkersInTheirOrder)
{
  const std::string clusters = "<SmartClusters><SmartCluster label='Tip' type='Corvex1'/>"
                               "<SmartCluster type='T&#228;g 2' label='Grip'/></SmartClusters>";
  const std::string markers = "<AdditionalMarkerPositions>\n <Marker x='136.5' y='82' z='14'/><!-- the other -->\n"
                              "<Marker z='-2.5e1' x='-129' y='0'></Marker></AdditionalMarkerPositions>";
  const SmartObjectTemplate expected{{{"Tip", "Corvex1"}, {"Grip", "T\xC3\xA4g 2"}}, {{136.5, 82, 14}, {-129, 0, -25}}};
  EXPECT_EQ(ReadTemplate(Write(File(clusters + markers))), expected);
  EXPECT_EQ(ReadTemplate(Write(File(markers + clusters) + "\n")), expected);
  EXPECT_EQ(ReadTemplate(m_shipped / "SmartObjects/Templates/Corvex.sot"),
            (SmartObjectTemplate{{{"Cluster", "Corvex1"}}, {}}));
}

TEST_F(TemplateFileTest, RefusesMalformedFilesAndTellsWhere)
{
  const std::string good = File(cluster);
  const std::string most = good + std::string((std::size_t{1} << 20) - good.size(), ' ');
  // Sound but for the markers, which begin on line 3
  const auto inMarkers = [](const std::string& markers)
  { return File(cluster + "<AdditionalMarkerPositions>\n" + markers + "</AdditionalMarkerPositions>"); };
  const auto many = [](int count) { return Clusters(Many(count, "<SmartCluster label='", "' type='T'/>")); };

  Refusals table{
      {most, "read"},
      {most + ' ', "1:1: the file has 1048577 bytes, expected at most 1048576"},
      {good + "\n<a/>", "3:1: not well-formed XML"},
      {"<SmartObject version='1'/>", "1:1: unknown element <SmartObject>, expected SmartObjectTemplate"},
      {"<SmartObjectTemplate version='1.0'/>", "1:1: the version is \"1.0\", expected 1"},
      {"<!-- <!DOCTYPE> --><?p?>\n<!DOCTYPE a SYSTEM 'b'>" + good, "2:1: a document type declaration is not allowed"},
      {"\xEF\xBB\xBF\xEF\xBB\xBF\xEF\xBB\xBF<!DOCTYPE a>" + good, "1:2: a document type declaration is not allowed"},

      {File(""), "1:1: <SmartObjectTemplate> lacks an element, expected SmartClusters"},
      {File(cluster + "\n" + cluster), "3:1: repeated <SmartClusters>"},
      {File("<Markers/>"), "2:1: unknown element <Markers>, expected one of SmartClusters, AdditionalMarkerPositions"},
      {File("<SmartClusters n='1'/>"), "2:1: unknown attribute \"n\" of <SmartClusters>, expected none"},
      {File("<SmartClusters/>"), "2:1: <SmartClusters> is empty, expected at least one SmartCluster"},
      {Clusters("<SmartCluster label='' type='T'/>"), "3:1: attribute \"label\" of <SmartCluster> is empty"},
      {Clusters("<SmartCluster label='L' type=''/>"), "3:1: attribute \"type\" of <SmartCluster> is empty"},
      {Clusters("<SmartCluster label='L' type='T' device='d'/>"),
       "3:1: unknown attribute \"device\" of <SmartCluster>"},
      {Clusters("<SmartCluster label='L' type='T'/>\n <SmartCluster label='L' type='U'/>"),
       "4:2: repeated label \"L\""},
      {Clusters("<SmartCluster label='L' type='T'>x</SmartCluster>"), "3:34: unexpected text \"x\" in <SmartCluster>"},
      {many(64), "read"},
      {many(65), "67:1: one cluster too many, expected at most 64"},

      {inMarkers("<SmartCluster/>"), "3:1: unknown element <SmartCluster>, expected Marker"},
      {inMarkers("<Marker x='1' y='2' z='3' w='4'/>"), "3:1: unknown attribute \"w\" of <Marker>"},
      {inMarkers("<Marker x='1' y='2' z='3'>\n<Marker/></Marker>"), "4:1: unknown element <Marker>, expected none"},
  };
  for (const std::string x : {"", "-Infinity", "NaN", "1e999", "1,5", " 1", "0x1F", "wide"})
    table.emplace_back(inMarkers("<Marker x='" + x + "' y='2' z='3'/>"),
                       "3:1: attribute \"x\" of <Marker> is \"" + x + "\", expected a finite number");
  ExpectRefusals(ReadTemplate, table);
}

}

}

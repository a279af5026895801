#pragma once

#include <cstdint>
#include <memory>

class ICharacterControls;
class IFileLocations;
class ISmartObjectControls;
class IRigidObjectControls;

namespace RunaCorePluginInterface
{

class IObjectEvaluationSettings;

/// Bits of the feature mask.
namespace Feature
{
inline constexpr std::uint32_t basicObjects = 1U << 0;
inline constexpr std::uint32_t smartObjects = 1U << 1;
inline constexpr std::uint32_t characters = 1U << 2;
inline constexpr std::uint32_t generalSubjects = 1U << 3;
inline constexpr std::uint32_t props = 1U << 4;
inline constexpr std::uint32_t labellingClusters = 1U << 5;
inline constexpr std::uint32_t objectPresets = 1U << 6;
inline constexpr std::uint32_t proximityGrouping = 1U << 8;
inline constexpr std::uint32_t objectEvaluation = 1U << 9;
inline constexpr std::uint32_t sceneMeshes = 1U << 12;
inline constexpr std::uint32_t markerless = 1U << 14;
inline constexpr std::uint32_t objectAutoAssign = 1U << 15;
}

/// Tells which features the host has switched on. [any]
class IFeatures
{
public:
  virtual ~IFeatures() = default;

  /// One bit for each feature. May change while the program runs: read it afresh where it is needed.
  [[nodiscard]] virtual std::uint32_t Mask() const = 0;
};

/// The application's settings: hands out the objects that the plugin's services are configured with. An object that
/// the host does not have is an empty pointer. [host]
class IPluginSettings
{
public:
  virtual ~IPluginSettings() = default;

  virtual void Features(std::shared_ptr<IFeatures>& features) const = 0;
  virtual void FileLocations(std::shared_ptr<IFileLocations>& locations) const = 0;
  virtual void SmartObjectControls(std::shared_ptr<ISmartObjectControls>& controls) const = 0;
  virtual void RigidObjectControls(std::shared_ptr<IRigidObjectControls>& controls) const = 0;
  virtual void ObjectEvaluationSettings(std::shared_ptr<IObjectEvaluationSettings>& settings) const = 0;
  virtual void CharacterControls(std::shared_ptr<ICharacterControls>& controls) const = 0;
};

}

#pragma once

#include "StoreInterface/Value.h"
#include "SubjectStoreUI/ResultGadget.h"
#include "SubjectStoreUI/VCalibrationObjectMeasurementModel.h"

#include <QObject>
#include <QStringList>

#include <memory>
#include <vector>

namespace SubjectStoreUI
{

struct PanelBackend;

/// Scales an object so that distances between its markers are those that somebody measured. It ends, and deletes
/// itself, with `apply` that succeeds or `cancel`. [gui]
class VCalibrationScalingQml final : public QObject
{
  Q_OBJECT
  Q_PROPERTY(SubjectStoreUI::VCalibrationObjectMeasurementModel* measurements READ measurements CONSTANT)
  /// "Marker 1", …, in the order of the object's markers.
  Q_PROPERTY(QStringList markerNames READ markerNames CONSTANT)
  Q_PROPERTY(double scaleFactor READ scaleFactor NOTIFY scaleFactorChanged)

public:
  /// For a basic object with two markers or more; null for anything else. `backend` outlives it.
  [[nodiscard]] static std::unique_ptr<VCalibrationScalingQml> Make(const PanelBackend& backend,
                                                                    NMX::TSubjectStoreId object);
  ~VCalibrationScalingQml() override;

  [[nodiscard]] VCalibrationObjectMeasurementModel* measurements() { return &m_measurements; }
  [[nodiscard]] QStringList markerNames() const;
  [[nodiscard]] double scaleFactor() const { return m_measurements.scaleFactor(); }

  /// Adds a measurement of the distance between two different markers, by their positions in `markerNames`.
  /// `InvalidArgument` for others.
  Q_INVOKABLE SubjectStoreUI::VResultGadget add(int first, int second);
  Q_INVOKABLE bool remove(int row);

  /// Multiplies the places of the object's markers by the factor. `InvalidValue` unless it is above 0, `Conflict` when
  /// the markers are no longer those that were measured.
  Q_INVOKABLE SubjectStoreUI::VResultGadget apply();
  Q_INVOKABLE void cancel();

Q_SIGNALS:
  void scaleFactorChanged();

private:
  VCalibrationScalingQml(const PanelBackend& backend, NMX::TSubjectStoreId object, std::vector<NMX::Position> markers);

  const PanelBackend& m_backend;
  const NMX::TSubjectStoreId m_object;
  const std::vector<NMX::Position> m_markers;
  VCalibrationObjectMeasurementModel m_measurements;
};

}

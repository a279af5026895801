#pragma once

#include <QAbstractTableModel>
#include <QString>

#include <vector>

namespace SubjectStoreUI
{

/// The distances between markers of a calibration object that the user measured, and the factor by which the object
/// has to be scaled to match them. All distances are in mm. [gui]
class VCalibrationObjectMeasurementModel final : public QAbstractTableModel
{
  Q_OBJECT
  /// The mean of measured distance by model distance over the rows with a model distance above 0; 1 without such rows.
  Q_PROPERTY(double scaleFactor READ scaleFactor NOTIFY ScaleFactorChanged FINAL)

public:
  using QAbstractTableModel::QAbstractTableModel;

  [[nodiscard]] double scaleFactor() const { return m_scaleFactor; }

  /// Adds a row at the end for the distance between two markers, named by `markers`. It counts as measured with a
  /// distance of 0 until another is set.
  void addMeasurement(QString markers, double modelDistance);

  [[nodiscard]] int rowCount(const QModelIndex& parent = {}) const override;
  [[nodiscard]] int columnCount(const QModelIndex& parent = {}) const override;
  [[nodiscard]] QVariant data(const QModelIndex& index, int role = Qt::DisplayRole) const override;
  [[nodiscard]] QVariant headerData(int section, Qt::Orientation orientation,
                                    int role = Qt::DisplayRole) const override;

  /// Sets the measured distance of the row, whichever its column. False unless the value is a finite number.
  bool setData(const QModelIndex& index, const QVariant& value, int role = Qt::EditRole) override;

  /// Both are false, without effect, unless all the rows fit: a new row's label is empty and its distances are 0.
  bool insertRows(int row, int count, const QModelIndex& parent = {}) override;
  bool removeRows(int row, int count, const QModelIndex& parent = {}) override;

Q_SIGNALS:
  void ScaleFactorChanged();

private:
  struct Measurement
  {
    QString markers;
    double modelDistance = 0;
    double measuredDistance = 0;
  };

  [[nodiscard]] int Size() const { return static_cast<int>(m_measurements.size()); }
  [[nodiscard]] bool Holds(const QModelIndex& index) const;
  void UpdateScaleFactor();

  std::vector<Measurement> m_measurements;
  double m_scaleFactor = 1;
};

}

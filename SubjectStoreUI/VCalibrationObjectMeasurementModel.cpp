#include "SubjectStoreUI/VCalibrationObjectMeasurementModel.h"

#include <cmath>
#include <cstddef>
#include <iterator>
#include <utility>

namespace SubjectStoreUI
{

namespace
{

enum EColumn
{
  Markers,
  ModelDistance,
  MeasuredDistance
};

constexpr const char* headers[] = {"Markers", "Model Distance (mm)", "Measured Distance (mm)"};
constexpr int columns = static_cast<int>(std::size(headers));

}

void VCalibrationObjectMeasurementModel::addMeasurement(QString markers, double modelDistance)
{
  beginInsertRows({}, Size(), Size());
  m_measurements.push_back({std::move(markers), modelDistance, 0});
  endInsertRows();
  UpdateScaleFactor();
}

int VCalibrationObjectMeasurementModel::rowCount(const QModelIndex& parent) const
{
  return parent.isValid() ? 0 : Size();
}

int VCalibrationObjectMeasurementModel::columnCount(const QModelIndex& parent) const
{
  return parent.isValid() ? 0 : columns;
}

QVariant VCalibrationObjectMeasurementModel::data(const QModelIndex& index, int role) const
{
  if (!Holds(index) || (role != Qt::DisplayRole && role != Qt::EditRole))
    return {};
  const Measurement& measurement = m_measurements[static_cast<std::size_t>(index.row())];
  switch (index.column())
  {
  case Markers:
    return measurement.markers;
  case ModelDistance:
    return measurement.modelDistance;
  case MeasuredDistance:
    return measurement.measuredDistance;
  default:
    return {};
  }
}

QVariant VCalibrationObjectMeasurementModel::headerData(int section, Qt::Orientation orientation, int role) const
{
  if (role != Qt::DisplayRole)
    return {};
  if (orientation == Qt::Vertical)
    return section + 1;
  if (section < 0 || section >= columns)
    return {};
  return QString::fromUtf8(headers[section]);
}

bool VCalibrationObjectMeasurementModel::setData(const QModelIndex& index, const QVariant& value, int role)
{
  if (!Holds(index) || role != Qt::EditRole)
    return false;
  bool isNumber = false;
  const double distance = value.toDouble(&isNumber);
  if (!isNumber || !std::isfinite(distance))
    return false;
  m_measurements[static_cast<std::size_t>(index.row())].measuredDistance = distance;
  Q_EMIT dataChanged(index, index, {Qt::DisplayRole, Qt::EditRole});
  UpdateScaleFactor();
  return true;
}

bool VCalibrationObjectMeasurementModel::insertRows(int row, int count, const QModelIndex& parent)
{
  if (parent.isValid() || count < 1 || row < 0 || row > Size())
    return false;
  beginInsertRows({}, row, row + count - 1);
  m_measurements.insert(m_measurements.begin() + row, static_cast<std::size_t>(count), {});
  endInsertRows();
  return true;
}

bool VCalibrationObjectMeasurementModel::removeRows(int row, int count, const QModelIndex& parent)
{
  if (parent.isValid() || count < 1 || row < 0 || count > Size() - row)
    return false;
  beginRemoveRows({}, row, row + count - 1);
  const auto first = m_measurements.begin() + row;
  m_measurements.erase(first, first + count);
  endRemoveRows();
  UpdateScaleFactor();
  return true;
}

bool VCalibrationObjectMeasurementModel::Holds(const QModelIndex& index) const
{
  // An index that somebody kept may be of a row that is no more.
  return index.isValid() && index.model() == this && index.row() < Size();
}

void VCalibrationObjectMeasurementModel::UpdateScaleFactor()
{
  double sum = 0;
  int count = 0;
  for (const Measurement& measurement : m_measurements)
    if (measurement.modelDistance > 0)
    {
      sum += measurement.measuredDistance / measurement.modelDistance;
      ++count;
    }
  const double factor = count > 0 ? sum / count : 1;
  if (factor == m_scaleFactor)
    return;
  m_scaleFactor = factor;
  Q_EMIT ScaleFactorChanged();
}

}

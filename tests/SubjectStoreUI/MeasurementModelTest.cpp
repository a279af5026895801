#include "SubjectStoreUI/VCalibrationObjectMeasurementModel.h"

#include <QAbstractItemModelTester>
#include <QSignalSpy>
#include <gmock/gmock.h>

#include <functional>
#include <limits>
#include <string>
#include <utility>

using Model = SubjectStoreUI::VCalibrationObjectMeasurementModel;

namespace
{

class MeasurementModelTest : public testing::Test
{
protected:
  /// Every cell: "A 100 101; B 200 198".
  std::string Rows() const
  {
    QStringList rows;
    for (int row = 0; row < model.rowCount(); ++row)
    {
      QStringList cells;
      for (int column = 0; column < model.columnCount(); ++column)
        cells << model.index(row, column).data().toString();
      rows << cells.join(' ');
    }
    return rows.join("; ").toStdString();
  }

  /// What the model told since the last call, such as "insert 0-1; remove 2-2; change 0,2; factor 1.5".
  std::string Signals()
  {
    QStringList told;
    for (; !inserted.isEmpty(); inserted.removeFirst())
      told << QString("insert %1-%2").arg(inserted[0][1].toInt()).arg(inserted[0][2].toInt());
    for (; !removed.isEmpty(); removed.removeFirst())
      told << QString("remove %1-%2").arg(removed[0][1].toInt()).arg(removed[0][2].toInt());
    for (; !changed.isEmpty(); changed.removeFirst())
    {
      const auto first = changed[0][0].toModelIndex();
      EXPECT_EQ(first, changed[0][1].toModelIndex());
      told << QString("change %1,%2").arg(first.row()).arg(first.column());
    }
    for (; !factorChanged.isEmpty(); factorChanged.removeFirst())
      told << QString("factor %1").arg(model.property("scaleFactor").toDouble());
    return told.join("; ").toStdString();
  }

  bool Set(int row, int column, const QVariant& value) { return model.setData(model.index(row, column), value); }

  Model model;
  QAbstractItemModelTester tester{&model, QAbstractItemModelTester::FailureReportingMode::Fatal};
  QSignalSpy inserted{&model, &Model::rowsInserted};
  QSignalSpy removed{&model, &Model::rowsRemoved};
  QSignalSpy changed{&model, &Model::dataChanged};
  QSignalSpy factorChanged{&model, &Model::ScaleFactorChanged};
};

}

TEST_F(MeasurementModelTest, EachEditTellsExactlyWhatChangedAndTheFactorFollows)
{
  struct Step
  {
    std::function<bool()> edit;
    const char* told;
    const char* rows;
  };
  const auto add = [&](const char* markers, double distance) { return model.addMeasurement(markers, distance), true; };
  const Step steps[] = {
      {[&] { return add("A", 100); }, "insert 0-0; factor 0", "A 100 0"},
      {[&] { return Set(0, 2, 101.0); }, "change 0,2; factor 1.01", "A 100 101"},
      {[&] { return add("B", 200); }, "insert 1-1; factor 0.505", "A 100 101; B 200 0"},
      {[&] { return Set(1, 0, "198"); }, "change 1,0; factor 1", "A 100 101; B 200 198"},
      {[&] { return Set(1, 1, 198); }, "change 1,1", "A 100 101; B 200 198"},
      {[&] { return model.insertRows(1, 2); }, "insert 1-2", "A 100 101;  0 0;  0 0; B 200 198"},
      {[&] { return Set(2, 2, 7); }, "change 2,2", "A 100 101;  0 0;  0 7; B 200 198"},
      {[&] { return add("C", -1) && Set(4, 2, 5); }, "insert 4-4; change 4,2",
       "A 100 101;  0 0;  0 7; B 200 198; C -1 5"},
      {[&] { return model.removeRows(0, 2); }, "remove 0-1; factor 0.99", " 0 7; B 200 198; C -1 5"},
      {[&] { return model.removeRows(1, 2); }, "remove 1-2; factor 1", " 0 7"},
      {[&] { return model.insertRow(1); }, "insert 1-1", " 0 7;  0 0"},
      {[&] { return model.removeRows(0, 2); }, "remove 0-1", ""},
  };
  EXPECT_EQ(model.scaleFactor(), 1);
  for (const Step& step : steps)
  {
    EXPECT_TRUE(step.edit());
    EXPECT_EQ(Signals(), step.told) << step.rows;
    EXPECT_EQ(Rows(), step.rows);
  }
}

TEST_F(MeasurementModelTest, RefusesWhatDoesNotFit)
{
  model.addMeasurement("A", 100);
  model.addMeasurement("B", 200);
  model.addMeasurement("C", 300);
  const QModelIndex cell = model.index(0, 2);
  const QModelIndex gone = model.index(2, 2);
  EXPECT_TRUE(model.removeRow(2));
  Model other;
  other.addMeasurement("X", 100);
  (void)Signals();

  constexpr int most = std::numeric_limits<int>::max();
  for (const auto& [row, count] : {std::pair{0, 0}, {0, -1}, {-1, 1}, {3, 1}, {most, 1}})
    EXPECT_FALSE(model.insertRows(row, count)) << row << ' ' << count;
  for (const auto& [row, count] : {std::pair{0, 0}, {1, -1}, {-1, 1}, {2, 1}, {1, 2}, {1, most}, {most, most}})
    EXPECT_FALSE(model.removeRows(row, count)) << row << ' ' << count;
  EXPECT_FALSE(model.insertRows(0, 1, cell) || model.removeRows(0, 1, cell));
  for (const QVariant& value : {QVariant("seven"), QVariant(""), QVariant(), QVariant("nan"), QVariant("inf")})
    EXPECT_FALSE(model.setData(cell, value)) << value.toString().toStdString();
  EXPECT_FALSE(model.setData(cell, 7, Qt::DisplayRole));
  for (const QModelIndex& stray : {QModelIndex(), gone, other.index(0, 2)})
    EXPECT_FALSE(model.setData(stray, 7) || model.data(stray).isValid());
  EXPECT_EQ(Signals(), "");
  EXPECT_EQ(Rows(), "A 100 0; B 200 0");
}

TEST_F(MeasurementModelTest, AnswersHeadersAndCellsInTheirRolesOnly)
{
  model.addMeasurement("A", 100);
  const QModelIndex cell = model.index(0, 1);
  EXPECT_EQ(cell.data(Qt::EditRole), QVariant(100.0));
  EXPECT_FALSE(cell.data(Qt::ToolTipRole).isValid() || cell.data(Qt::CheckStateRole).isValid());
  EXPECT_EQ(model.columnCount(cell), 0);
  EXPECT_FALSE(cell.flags().testFlag(Qt::ItemIsEditable));

  const QVariant expected[] = {{}, "Markers", "Model Distance (mm)", "Measured Distance (mm)", {}};
  for (int section = -1; section <= 3; ++section)
    EXPECT_EQ(model.headerData(section, Qt::Horizontal), expected[section + 1]) << section;
  EXPECT_EQ(model.headerData(0, Qt::Vertical), QVariant(1));
  for (const auto orientation : {Qt::Horizontal, Qt::Vertical})
    EXPECT_FALSE(model.headerData(0, orientation, Qt::EditRole).isValid());
}

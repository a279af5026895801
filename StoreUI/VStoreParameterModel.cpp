#include "StoreUI/VStoreParameterModel.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StoreInterface/ColourText.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreUI/ResultSentence.h"

#include <QPointer>

#include <algorithm>
#include <cmath>
#include <limits>
#include <utility>

namespace StoreUI
{

using NMX::EValueType;
using NMX::IResult;

namespace
{

constexpr int refreshIntervalInMilliseconds = 50;

QString TypeText(EValueType type)
{
  switch (type)
  {
  case EValueType::Bool:
    return "bool";
  case EValueType::Int32:
  case EValueType::UInt32:
  case EValueType::Double:
    return "number";
  case EValueType::Colour:
    return "colour";
  case EValueType::Option:
    return "option";
  case EValueType::Action:
    return "action";
  default:
    return "text";
  }
}

/// The name of what is chosen; empty when nothing is.
QString ChosenName(const NMX::Option& option)
{
  const auto chosen = std::find_if(option.choices.begin(), option.choices.end(),
                                   [&](const NMX::Choice& choice) { return choice.path == option.chosen; });
  return chosen != option.choices.end() ? QString::fromStdString(chosen->name) : QString();
}

struct ToVariant
{
  QVariant operator()(bool value) const { return value; }
  QVariant operator()(std::int32_t value) const { return value; }
  QVariant operator()(std::uint32_t value) const { return value; }
  QVariant operator()(double value) const { return value; }
  QVariant operator()(const std::string& value) const { return QString::fromStdString(value); }
  QVariant operator()(const std::wstring& value) const { return QString::fromStdWString(value); }
  QVariant operator()(const NMX::Colour& value) const { return QString::fromStdString(NMX::ColourToText(value)); }
  QVariant operator()(const NMX::Option& value) const { return ChosenName(value); }
  QVariant operator()(const NMX::Action& value) const { return (value.state & NMX::Action::impossible) == 0; }
  template <class Other>
  QVariant operator()(const Other& /*value*/) const
  {
    return {};
  }
};

template <class Number>
std::optional<NMX::Value> WholeNumber(const QVariant& variant)
{
  bool is = false;
  const double number = variant.toDouble(&is);
  if (!is || number != std::floor(number) || number < static_cast<double>(std::numeric_limits<Number>::min()) ||
      number > static_cast<double>(std::numeric_limits<Number>::max()))
    return std::nullopt;
  return static_cast<Number>(number);
}

std::optional<NMX::Value> ChosenFrom(const NMX::Option& option, const std::string& name)
{
  NMX::Option chosen = option;
  if (name.empty())
    chosen.chosen.clear();
  else
  {
    const auto choice = std::find_if(option.choices.begin(), option.choices.end(),
                                     [&](const NMX::Choice& each) { return each.name == name; });
    if (choice == option.choices.end())
      return std::nullopt;
    chosen.chosen = choice->path;
  }
  return chosen;
}

}

std::optional<NMX::Value> FromVariant(const QVariant& variant, const NMX::Value& current)
{
  switch (NMX::TypeOf(current))
  {
  case EValueType::Bool:
    if (variant.typeId() != QMetaType::Bool)
      return std::nullopt;
    return variant.toBool();
  case EValueType::Int32:
    return WholeNumber<std::int32_t>(variant);
  case EValueType::UInt32:
    return WholeNumber<std::uint32_t>(variant);
  case EValueType::Double:
  {
    bool is = false;
    const double number = variant.toDouble(&is);
    if (!is || !std::isfinite(number))
      return std::nullopt;
    return number;
  }
  case EValueType::Nothing:
  case EValueType::Text:
    return variant.toString().toStdString();
  case EValueType::WideText:
    return variant.toString().toStdWString();
  case EValueType::Colour:
  {
    NMX::Colour colour;
    if (NMX::ColourFromText(variant.toString().toStdString(), colour).Failed())
      return std::nullopt;
    return colour;
  }
  case EValueType::Option:
    return ChosenFrom(std::get<NMX::Option>(current), variant.toString().toStdString());
  default:
    return std::nullopt;
  }
}

VStoreParameterModel::VStoreParameterModel(std::shared_ptr<NMX::IStore> store, std::weak_ptr<NMX::IPostalService> gui,
                                           std::vector<Parameter> parameters, QObject* parent)
    : QAbstractListModel(parent), m_store(std::move(store)), m_parameters(std::move(parameters))
{
  m_timer.setSingleShot(true);
  m_timer.setInterval(refreshIntervalInMilliseconds);
  connect(&m_timer, &QTimer::timeout, this, [this] { Refresh(); });
  const auto changed = [self = QPointer<VStoreParameterModel>(this)]
  {
    if (self && !self->m_timer.isActive())
      self->m_timer.start();
  };
  m_subscriptions.push_back(m_store->OnChange("Application/*", gui, changed));
  for (const NMX::ESubjectKind kind : NMX::allSubjectKinds)
    m_subscriptions.push_back(m_store->SubjectsChanged(kind)->Subscribe(gui, changed));
  m_rows = Read();
}

void VStoreParameterModel::ShowSubject(NMX::TSubjectStoreId subject)
{
  if (m_subject == subject)
    return;
  beginResetModel(); // the rows are those of something else
  m_subject = subject;
  m_rows = Read();
  endResetModel();
}

int VStoreParameterModel::rowCount(const QModelIndex& parent) const
{
  return parent.isValid() ? 0 : static_cast<int>(m_rows.size());
}

QVariant VStoreParameterModel::data(const QModelIndex& index, int role) const
{
  if (!checkIndex(index, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
    return {};
  const Row& row = m_rows[static_cast<std::size_t>(index.row())];
  const auto* option = std::get_if<NMX::Option>(&row.value);
  const auto* action = std::get_if<NMX::Action>(&row.value);
  switch (role)
  {
  case ParameterRole::Key:
    return row.parameter->key;
  case Qt::DisplayRole:
  case ParameterRole::Label:
    return row.parameter->label;
  case ParameterRole::Type:
    return TypeText(NMX::TypeOf(row.value));
  case ParameterRole::Value:
    return std::visit(ToVariant{}, row.value);
  case ParameterRole::Choices:
  {
    QStringList names;
    if (option != nullptr)
      for (const NMX::Choice& choice : option->choices)
        names.append(QString::fromStdString(choice.name));
    return names;
  }
  case ParameterRole::Editable:
    return row.parameter->editable && action == nullptr;
  case ParameterRole::Problem:
    if (action != nullptr && (action->state & NMX::Action::impossible) != 0)
      return QString::fromStdString(action->text);
    return row.problem;
  default:
    return {};
  }
}

QHash<int, QByteArray> VStoreParameterModel::roleNames() const
{
  return {{ParameterRole::Key, "key"},         {ParameterRole::Label, "label"},
          {ParameterRole::Type, "type"},       {ParameterRole::Value, "value"},
          {ParameterRole::Choices, "choices"}, {ParameterRole::Editable, "editable"},
          {ParameterRole::Problem, "problem"}};
}

bool VStoreParameterModel::setData(const QModelIndex& index, const QVariant& value, int role)
{
  if (role != ParameterRole::Value || !data(index, ParameterRole::Editable).toBool())
    return false;
  Row& row = m_rows[static_cast<std::size_t>(index.row())];
  std::string problem;
  const IResult written = Write(row, value, problem);
  row.problem = QString::fromStdString(problem);
  Refresh();
  Q_EMIT dataChanged(index, index, {ParameterRole::Value, ParameterRole::Problem}); // also back to what it was
  return written.Succeeded();
}

IResult VStoreParameterModel::Write(const Row& row, const QVariant& value, std::string& problem)
{
  const auto fail = [&](IResult result, std::string sentence)
  {
    problem = std::move(sentence);
    return result;
  };
  auto now = FromVariant(value, row.value);
  if (!now)
    return fail(NMX::EResult::InvalidValue,
                "The value is not one that \"" + row.parameter->label.toStdString() + "\" can have.");
  const auto editor = m_store->Editor();
  IResult written;
  if (!m_subject)
    written = editor->SetApplicationEntry(row.parameter->path, *std::move(now));
  else if (row.parameter->path == NMX::Paths::Name())
    written = editor->Rename(*m_subject, std::get<std::string>(*now), NMX::ENotify::Yes);
  else
    written = editor->SetValue(*m_subject, row.parameter->path, *std::move(now), NMX::ENotify::Yes);
  if (written.Succeeded())
    written = editor->Commit();
  return written.Succeeded() ? written : fail(written, ResultSentence(written));
}

const NMX::Value* VStoreParameterModel::Find(const NMX::IStoreReader& access, const Parameter& parameter) const
{
  if (!m_subject)
    return access.FindApplicationEntry(parameter.path);
  const NMX::Value* value = nullptr;
  return access.Find(*m_subject, parameter.path, value).Succeeded() ? value : nullptr;
}

std::vector<VStoreParameterModel::Row> VStoreParameterModel::Read() const
{
  std::vector<Row> rows;
  const auto access = m_store->Reader();
  for (const Parameter& parameter : m_parameters)
    if (const NMX::Value* value = Find(*access, parameter))
      rows.push_back({&parameter, *value, {}});
  return rows;
}

void VStoreParameterModel::Refresh()
{
  std::vector<Row> now = Read();
  const bool same = std::equal(now.begin(), now.end(), m_rows.begin(), m_rows.end(),
                               [](const Row& a, const Row& b) { return a.parameter == b.parameter; });
  if (!same)
  {
    beginResetModel();
    m_rows = std::move(now);
    endResetModel();
    return;
  }
  for (std::size_t row = 0; row < now.size(); ++row)
  {
    if (m_rows[row].value == now[row].value)
      continue;
    m_rows[row] = std::move(now[row]);
    const QModelIndex index = createIndex(static_cast<int>(row), 0);
    Q_EMIT dataChanged(index, index);
  }
}

}

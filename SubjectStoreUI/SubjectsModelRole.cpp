#include "SubjectStoreUI/SubjectsModelRole.h"

namespace SubjectStoreUI
{

namespace
{

bool IsCapital(char character)
{
  return character >= 'A' && character <= 'Z';
}

}

QByteArray RoleName(std::string_view key)
{
  if (key.ends_with("Role"))
    key.remove_suffix(4);
  if (key.size() > 2 && key[0] == 'E' && IsCapital(key[1]))
    key.remove_prefix(1);
  QByteArray name(key.data(), static_cast<qsizetype>(key.size()));
  if (!name.isEmpty() && IsCapital(name[0]))
    name[0] = static_cast<char>(name[0] - 'A' + 'a');
  return name;
}

const QList<int>& SubjectsModelRole::All()
{
  static const QList<int> all = []
  {
    QList<int> roles;
    for (const Key& key : keys)
      roles.append(key.role);
    return roles;
  }();
  return all;
}

const QHash<int, QByteArray>& SubjectsModelRole::Names()
{
  static const QHash<int, QByteArray> names = RoleNames(keys);
  return names;
}

}

#pragma once

#include "StoreInterface/IStore.h"

#include <string_view>

namespace NMX
{

/// Whether a subject could be added at present: what IEntryEditor::Add says. Changes nothing. For work that has to look
/// at a file between this question and its edit, as no edit may be open meanwhile. [any]
inline IResult TryToAdd(IStore& store, ESubjectKind kind, std::string_view name)
{
  TSubjectStoreId unused;
  return store.Editor()->Add(kind, name, unused);
}

}

#include "StandaloneHost/Server/Documents.h"

#include <algorithm>

namespace Server
{

const Document* Documents::Find(std::string_view target) const
{
  const auto found = std::find_if(m_documents.begin(), m_documents.end(),
                                  [target](const Document& document) { return document.target == target; });
  return found == m_documents.end() ? nullptr : &*found;
}

}

#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace Server
{

/// A text that is read with GET.
struct Document
{
  std::string_view target; ///< such as "/openrpc.json"
  std::string_view type;   ///< as in the header Content-Type
  std::shared_ptr<const std::string> text;
  bool open = false; ///< read without a token: it holds nothing but what everybody has who has the program
};

/// What the server has to read. Filled when the server opens.
class Documents
{
public:
  void Add(Document document) { m_documents.push_back(std::move(document)); }

  /// The document at a target; null when there is none.
  [[nodiscard]] const Document* Find(std::string_view target) const;

private:
  std::vector<Document> m_documents;
};

}

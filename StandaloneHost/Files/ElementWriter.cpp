#include "StandaloneHost/Files/ElementWriter.h"

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StoreInterface/WideText.h"

#include <algorithm>

namespace Files
{

namespace
{

bool IsXml(wchar_t c)
{
  return c >= 0x20 ? c != 0xFFFE && c != 0xFFFF : c == L'\t' || c == L'\n' || c == L'\r';
}

void CheckText(std::string_view element, std::string_view text)
{
  const auto wide = NMX::ToWide(text);
  if (!wide || !std::all_of(wide->begin(), wide->end(), IsXml))
    throw ConfigurationError("a text of " + Tag(element) + " has a character that no XML file can hold");
}

/// White space other than a space would be read as a space in an attribute, and a line's end in a text as another.
std::string Escaped(std::string_view text)
{
  std::string escaped;
  for (const char c : text)
    switch (c)
    {
    case '&':
      escaped += "&amp;";
      break;
    case '<':
      escaped += "&lt;";
      break;
    case '>':
      escaped += "&gt;";
      break;
    case '"':
      escaped += "&quot;";
      break;
    case '\t':
    case '\n':
    case '\r':
      escaped += "&#" + std::to_string(static_cast<int>(c)) + ';';
      break;
    default:
      escaped += c;
    }
  return escaped;
}

}

ElementWriter::ElementWriter(std::string_view root) : m_text("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n")
{
  Open(root, {{"version", "1"}});
}

void ElementWriter::Open(std::string_view name, const Attributes& attributes)
{
  Level level{std::string(name), m_text.size(), m_inTag};
  BeginLine();
  AppendTag(name, attributes);
  m_inTag = true;
  m_levels.push_back(std::move(level));
}

void ElementWriter::Close()
{
  const std::string name = std::move(m_levels.back().name);
  m_levels.pop_back();
  if (m_inTag)
  {
    m_text += "/>\n";
    m_inTag = false;
    return;
  }
  BeginLine();
  m_text += "</" + name + ">\n";
}

void ElementWriter::CloseUnlessEmpty()
{
  if (!m_inTag)
    return Close();
  m_text.resize(m_levels.back().begin);
  m_inTag = m_levels.back().wasInTag;
  m_levels.pop_back();
}

void ElementWriter::Add(std::string_view name, const Attributes& attributes)
{
  Open(name, attributes);
  Close();
}

void ElementWriter::AddText(std::string_view name, std::string_view text)
{
  CheckText(name, text);
  BeginLine();
  AppendTag(name, {});
  m_text += '>' + Escaped(text) + "</" + std::string(name) + ">\n";
}

std::string ElementWriter::Finish()
{
  Close();
  return std::move(m_text);
}

void ElementWriter::BeginLine()
{
  if (m_inTag)
    m_text += ">\n";
  m_inTag = false;
  m_text.append(2 * m_levels.size(), ' ');
}

void ElementWriter::AppendTag(std::string_view name, const Attributes& attributes)
{
  m_text.append("<").append(name);
  for (const auto& [attribute, text] : attributes)
  {
    CheckText(name, text);
    m_text.append(" ").append(attribute).append("=\"").append(Escaped(text)).append("\"");
  }
}

}

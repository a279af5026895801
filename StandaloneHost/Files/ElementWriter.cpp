#include "StandaloneHost/Files/ElementWriter.h"

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StandaloneHost/Files/PercentText.h"
#include "StoreInterface/ValueLimits.h"

#include <algorithm>

namespace Files
{

namespace
{

constexpr std::string_view percentAttribute = " encoding=\"percent\"";

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

/// What the file holds of a text, in an element that announces an encoding or does not.
std::string Content(std::string_view text, bool encoded)
{
  return Escaped(encoded ? ToPercent(text) : std::string(text));
}

void CheckText(std::string_view element, std::string_view text)
{
  if (!NMX::ValueLimits::IsUtf8(text))
    throw ConfigurationError("a text of " + Tag(element) + " is not UTF-8, which no file can hold");
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
  const bool encoded = !FitsXml(text);
  BeginLine();
  m_text.append("<").append(name);
  if (encoded)
    m_text += percentAttribute;
  m_text += '>' + Content(text, encoded) + "</" + std::string(name) + ">\n";
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
  const bool encoded =
      std::ranges::any_of(attributes, [](const auto& attribute) { return !FitsXml(attribute.second); });
  m_text.append("<").append(name);
  for (const auto& [attribute, text] : attributes)
  {
    CheckText(name, text);
    m_text.append(" ").append(attribute).append("=\"").append(Content(text, encoded)).append("\"");
  }
  if (encoded)
    m_text += percentAttribute;
}

}

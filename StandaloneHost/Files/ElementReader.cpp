#include "StandaloneHost/Files/ElementReader.h"

#include "StandaloneHost/Files/PercentText.h"
#include "StoreInterface/ValueLimits.h"

#include <QString>
#include <QXmlStreamReader>

#include <algorithm>

namespace Files
{

namespace
{

/// Announces how the texts of its element are encoded.
constexpr const char* encodingAttribute = "encoding";

std::string ToText(QStringView text)
{
  return text.toUtf8().toStdString();
}

/// Where something begins that is no white space, comment or processing instruction.
qsizetype AfterComments(QStringView text)
{
  qsizetype at = 0;
  for (;;)
  {
    // A second byte order mark, which the XML reader skips.
    while (at < text.size() && (text[at].isSpace() || text[at] == QChar::ByteOrderMark))
      ++at;
    const bool comment = text.sliced(at).startsWith(u"<!--");
    if (!comment && !text.sliced(at).startsWith(u"<?"))
      return at;
    const qsizetype end = comment ? text.indexOf(u"-->", at + 4) : text.indexOf(u"?>", at + 2);
    if (end < 0)
      return at;
    at = end + (comment ? 3 : 2);
  }
}

}

void Element::AllowAttributes(std::initializer_list<std::string_view> names) const
{
  for (const auto& [attribute, text] : attributes)
    if (std::find(names.begin(), names.end(), attribute) == names.end())
      Fail(place, "unknown attribute " + Quoted(attribute) + " of " + Tag(name) + ", " + Expected(names));
}

const std::string* Element::Attribute(std::string_view attribute) const
{
  for (const auto& [known, text] : attributes)
    if (known == attribute)
      return &text;
  return nullptr;
}

const std::string& Element::RequiredAttribute(std::string_view attribute) const
{
  const std::string* text = Attribute(attribute);
  if (text == nullptr)
    Fail(place, Tag(name) + " lacks an attribute, expected " + Quoted(attribute));
  return *text;
}

const std::string& Element::FilledAttribute(std::string_view attribute) const
{
  const std::string& text = RequiredAttribute(attribute);
  if (text.empty())
    Fail(place, "attribute " + Quoted(attribute) + " of " + Tag(name) + " is empty, expected a text");
  return text;
}

void FailUnknown(const Element& element, std::span<const std::string_view> expected)
{
  Fail(element.place, "unknown element " + Tag(element.name) + ", " + Expected(expected));
}

/// The tokens of a file, without those that say nothing, and where they stand.
class ElementReader::Tokens
{
public:
  using Type = QXmlStreamReader::TokenType;

  Tokens(const std::filesystem::path& file, std::size_t maximumBytes)
      : m_file(file), m_text(QString::fromStdString(ReadTextFile(file, maximumBytes))), m_xml(m_text), m_place{&file}
  {
    // The XML reader tells of a declaration only after it has carried it out, which can take it minutes.
    const qsizetype begin = AfterComments(m_text);
    if (QStringView(m_text).sliced(begin).startsWith(u"<!DOCTYPE"))
      Fail(PlaceAt(begin), "a document type declaration is not allowed, expected elements only");
    m_xml.setNamespaceProcessing(false);
  }

  Type Next()
  {
    do
    {
      m_begin = m_xml.characterOffset();
      m_xml.readNext();
      Check();
    } while (m_xml.isComment() || m_xml.isProcessingInstruction() || m_xml.isStartDocument());
    if (m_xml.isEndElement())
    {
      m_closed = std::move(m_open.back());
      m_open.pop_back();
    }
    return m_xml.tokenType();
  }

  /// The element whose start is the latest token.
  Element Start()
  {
    Element element{ToText(m_xml.qualifiedName()), {}, PlaceAt(TagBegin())};
    const bool encoded = IsEncoded(element);
    for (const QXmlStreamAttribute& attribute : m_xml.attributes())
    {
      const std::string name = ToText(attribute.qualifiedName());
      if (name != encodingAttribute)
        element.attributes.emplace_back(name, AttributeText(element, name, ToText(attribute.value()), encoded));
    }
    m_open.push_back({element.name, element.place, encoded});
    return element;
  }

  /// The text of the element that was left last, of which the file holds `text`.
  [[nodiscard]] std::string TextOfClosed(std::string text) const
  {
    return m_closed.encoded ? Decoded(m_closed.place, Tag(m_closed.name), text) : std::move(text);
  }

  [[nodiscard]] bool IsWhitespace() const { return m_xml.isWhitespace(); }
  [[nodiscard]] QStringView Text() const { return m_xml.text(); }

  [[noreturn]] void FailAtChild()
  {
    const std::string parent = Open();
    const Element child = Start();
    Fail(child.place, "unexpected element " + Tag(child.name) + " in " + Tag(parent) + ", expected text only");
  }

  [[noreturn]] void FailAtText()
  {
    while (m_begin < m_text.size() - 1 && m_text[m_begin].isSpace())
      ++m_begin;
    Fail(PlaceAt(m_begin),
         "unexpected text " + Quoted(ToText(Text().trimmed())) + " in " + Tag(Open()) + ", expected elements only");
  }

private:
  struct OpenElement
  {
    std::string name;
    Place place;
    bool encoded; // whether it announces that its texts are
  };

  /// The element that was entered last.
  [[nodiscard]] const std::string& Open() const { return m_open.back().name; }

  [[nodiscard]] bool IsEncoded(const Element& element) const
  {
    if (!m_xml.attributes().hasAttribute(QLatin1String(encodingAttribute)))
      return false;
    if (const std::string encoding = ToText(m_xml.attributes().value(QLatin1String(encodingAttribute)));
        encoding != "percent")
      Fail(element.place, "the encoding of " + Tag(element.name) + " is " + Quoted(encoding) + ", expected percent");
    return true;
  }

  static std::string AttributeText(const Element& element, const std::string& name, std::string text, bool encoded)
  {
    const std::string what = "attribute " + Quoted(name) + " of " + Tag(element.name);
    if (encoded)
      text = Decoded(element.place, what, text);
    if (const std::string problem = NMX::ValueLimits::TextProblem(text); !problem.empty())
      Fail(element.place, what + ' ' + problem);
    return text;
  }

  static std::string Decoded(const Place& place, const std::string& what, const std::string& text)
  {
    auto decoded = FromPercent(text);
    if (!decoded || !NMX::ValueLimits::IsUtf8(*decoded))
      Fail(place, what + " is " + Quoted(text) +
                      (decoded ? ", expected a text in UTF-8" : ", expected two hexadecimal digits after each %"));
    return *std::move(decoded);
  }

  /// Where the tag begins that the latest token ends with: no tag has another "<" in it.
  [[nodiscard]] qsizetype TagBegin() const { return m_text.lastIndexOf(u'<', m_xml.characterOffset() - 1); }

  void Check()
  {
    if (m_xml.hasError())
      FailSyntax();
    if (const QStringView encoding = m_xml.documentEncoding();
        !encoding.isEmpty() && encoding.compare(u"UTF-8", Qt::CaseInsensitive) != 0)
      Fail(PlaceAt(0), "the declared encoding is " + Quoted(ToText(encoding)) + ", expected UTF-8");
  }

  [[noreturn]] void FailSyntax()
  {
    const qsizetype end = m_xml.characterOffset();
    if (m_xml.error() == QXmlStreamReader::PrematureEndOfDocumentError)
      Fail(PlaceAt(end), "the file ends too early, expected " + (m_open.empty() ? "an element" : Tag('/' + Open())));
    std::string reason = ToText(m_xml.errorString());
    while (reason.ends_with('.'))
      reason.pop_back();
    if (!m_open.empty() && !reason.starts_with("Expected"))
      reason += ", expected content or " + Tag('/' + Open());
    const bool inTag = end > 0 && m_text[end - 1] == u'>';
    Fail(PlaceAt(inTag ? TagBegin() : std::max<qsizetype>(end - 1, 0)),
         "not well-formed XML" + (m_open.empty() ? "" : " in " + Tag(Open())) + ": " + reason);
  }

  /// The place of a character; characters are asked for in ascending order.
  Place PlaceAt(qsizetype offset)
  {
    for (; m_counted < offset; ++m_counted)
    {
      if (m_text[m_counted] == u'\n')
        m_place = {&m_file, m_place.line + 1, 1};
      else if (!m_text[m_counted].isLowSurrogate())
        ++m_place.column;
    }
    return m_place;
  }

  const std::filesystem::path& m_file;
  QString m_text;
  QXmlStreamReader m_xml;
  qsizetype m_begin = 0; // where the latest token begins, when the one before it is a tag
  qsizetype m_counted = 0;
  Place m_place; // of the character m_counted
  std::vector<OpenElement> m_open;
  OpenElement m_closed{}; // the one that was left last
};

ElementReader::ElementReader(const std::filesystem::path& file, std::size_t maximumBytes)
    : m_tokens(std::make_unique<Tokens>(file, maximumBytes))
{
}

ElementReader::~ElementReader() = default;

Element ElementReader::EnterRoot(std::string_view name)
{
  // Outside of elements, nothing but the outermost one's start is well-formed.
  m_tokens->Next();
  Element root = m_tokens->Start();
  if (root.name != name)
    FailUnknown(root, {&name, 1});
  return root;
}

std::optional<Element> ElementReader::EnterChild()
{
  for (;;)
  {
    const auto token = m_tokens->Next();
    if (token == QXmlStreamReader::StartElement)
      return m_tokens->Start();
    if (token == QXmlStreamReader::EndElement)
      return std::nullopt;
    if (!m_tokens->IsWhitespace())
      m_tokens->FailAtText();
  }
}

std::string ElementReader::LeaveWithText()
{
  std::string text;
  for (;;)
  {
    const auto token = m_tokens->Next();
    if (token == QXmlStreamReader::StartElement)
      m_tokens->FailAtChild();
    if (token == QXmlStreamReader::EndElement)
      return m_tokens->TextOfClosed(std::move(text));
    text += ToText(m_tokens->Text());
  }
}

void ElementReader::LeaveEmpty()
{
  if (const auto child = EnterChild())
    FailUnknown(*child, {});
}

void ElementReader::End()
{
  m_tokens->Next();
}

}

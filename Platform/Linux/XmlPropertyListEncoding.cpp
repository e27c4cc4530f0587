// SPDX-License-Identifier: MIT
#include "Platform/Linux/XmlPropertyListEncoding.h"

#include <QString>
#include <QStringDecoder>
#include <string_view>

#include "Platform/Linux/XmlPropertyListLeaves.h"

namespace kestro {
namespace {

struct Utf16 {
  QStringConverter::Encoding encoding;
  std::size_t markSize;
};

std::optional<Utf16> utf16Of(std::string_view list) {
  using namespace std::string_view_literals;
  if (list.starts_with("\xFE\xFF"sv)) return Utf16{QStringConverter::Utf16BE, 2};
  if (list.starts_with("\xFF\xFE"sv)) return Utf16{QStringConverter::Utf16LE, 2};
  if (list.starts_with("\0<"sv)) return Utf16{QStringConverter::Utf16BE, 0};
  if (list.starts_with("<\0"sv)) return Utf16{QStringConverter::Utf16LE, 0};
  return std::nullopt;
}

/// The XML declaration without its end, if the list begins with one.
std::string_view declarationOf(std::string_view list) {
  const std::size_t start = list.find_first_not_of(kXmlSpaces);
  if (start == std::string_view::npos || !list.substr(start).starts_with("<?xml")) return {};
  return list.substr(start, list.substr(start).find("?>"));
}

/// The list without the encoding that its declaration names.
std::string withoutEncoding(std::string_view list) {
  const std::string_view declaration = declarationOf(list);
  if (!declaredEncoding(declaration)) return std::string(list);
  const auto end = static_cast<std::size_t>(declaration.data() - list.data()) + declaration.size();
  return "<?xml version=\"1.0\"" + std::string(list.substr(end));
}

}  // namespace

Result<std::optional<std::string>> xmlInUtf8(ByteView list) {
  const std::string_view bytes(reinterpret_cast<const char*>(list.data()), list.size());
  if (const std::optional<Utf16> form = utf16Of(bytes)) {
    const std::string_view units = bytes.substr(form->markSize);
    QStringDecoder decoder(form->encoding, QStringConverter::Flag::Stateless);
    const QString text =
        decoder(QByteArrayView(units.data(), static_cast<qsizetype>(units.size())));
    if (units.size() % 2 != 0 || decoder.hasError() || !text.isValidUtf16()) {
      return failure("XML property list: a text that is no UTF-16");
    }
    const std::string converted = text.toStdString();
    if (declaredEncoding(declarationOf(converted)).value_or("utf-16") != "utf-16") {
      return failure("XML property list: an encoding other than that of its bytes");
    }
    return withoutEncoding(converted);
  }
  if (declaredEncoding(declarationOf(bytes)).value_or("") != "iso-8859-1") return std::nullopt;
  return withoutEncoding(
      QString::fromLatin1(bytes.data(), static_cast<qsizetype>(bytes.size())).toStdString());
}

}  // namespace kestro

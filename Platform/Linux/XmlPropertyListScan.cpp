// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <string_view>
#include <utility>
#include <vector>

#include "Platform/Linux/PropertyListScan.h"
#include "Platform/Linux/XmlPropertyListLeaves.h"
#include "Platform/Utf8.h"

namespace kestro {
namespace {

constexpr bool isSpace(char character) {
  return character == ' ' || character == '\n' || character == '\t' || character == '\r';
}

constexpr bool isNameCharacter(char character) { return character >= 'a' && character <= 'z'; }

constexpr bool isMarkup(char character) { return character == '<' || character == '&'; }

/// The library moves the rest of a text once for each entity in it. When more bytes than these may
/// have to be moved, texts are divided.
constexpr std::size_t kEntityWork = std::size_t{512} * 1024 * 1024;

/// A part of a divided text has so many entities at most, and so many bytes without one.
constexpr std::size_t kEntitiesOfPart = 16;
constexpr std::size_t kBytesOfPart = 1024;

/// The library compares a key with those before it, all of them when their hashes collide. When
/// more comparisons than these may be needed in all, keys get beginnings whose hashes do not.
constexpr std::size_t kKeyWork = 50'000'000;

struct Tag {
  enum class Form { Open, Close, Empty };
  std::string_view name;
  Form form = Form::Open;
  std::size_t at = 0;
};

/// A container whose end has not come yet.
struct OpenContainer {
  bool isDictionary = false;
  bool needsValue = false;  ///< in a dictionary: a key came, its value must follow
  std::size_t keys = 0;
};

class XmlScan {
 public:
  XmlScan(std::string_view text, const PropertyListLimits& limits) : _text(text), _limits(limits) {}

  Result<PropertyListFacts> scan() {
    if (checkText() && readProlog() && readValues() && readEnd()) {
      _facts.hasManyKeys = _keyWork > kKeyWork;
      _facts.needsEdits |= _facts.hasManyKeys || _entityWork > kEntityWork;
      return std::move(_facts);
    }
    return failure(fmt::format("XML property list: {} (byte {})", _problem, _problemAt));
  }

 private:
  bool fail(std::string_view problem, std::size_t at) {
    _problem = problem;
    _problemAt = at;
    return false;
  }
  bool fail(std::string_view problem) { return fail(problem, _at); }

  [[nodiscard]] std::string_view rest() const { return _text.substr(_at); }

  bool checkText() {
    const std::size_t valid = validTextPrefix(_text);
    return valid == _text.size() || fail("not UTF-8, or a NUL", valid);
  }

  // --- Around the value

  bool readProlog() {
    skipSpaces();
    if (beginsDeclaration() && !readDeclaration()) return false;
    if (!skipSpacesAndComments()) return false;
    if (rest().starts_with("<!DOCTYPE") && !(readDoctype() && skipSpacesAndComments())) {
      return false;
    }
    // A value may stand alone behind a declaration.
    _isBare = _isDeclared && !rest().starts_with("<plist");
    return _isBare || readPlistTag();
  }

  /// Moves past `end`, which closes what begins here, and sets `inside` to what lies between.
  bool readUntil(std::string_view end, std::string_view& inside) {
    const std::size_t found = _text.find(end, _at);
    if (found == std::string_view::npos) return fail("cut off");
    inside = _text.substr(_at, found - _at);
    _at = found + end.size();
    return true;
  }

  [[nodiscard]] bool beginsDeclaration() const {
    constexpr std::string_view kStart = "<?xml";
    return rest().starts_with(kStart) && rest().size() > kStart.size() &&
           isSpace(rest()[kStart.size()]);
  }

  bool readDeclaration() {
    const std::size_t start = _at;
    std::string_view declaration;
    if (!readUntil("?>", declaration)) return false;
    _isDeclared = true;
    return declaredEncoding(declaration).value_or("utf-8") == "utf-8" ||
           fail("an encoding other than that of its bytes", start);
  }

  bool readDoctype() {
    const std::size_t start = _at;
    std::string_view doctype;
    if (!readUntil(">", doctype)) return false;
    const bool isPlain = doctype.find_first_of("[<", 1) == std::string_view::npos &&
                         std::ranges::count(doctype, '"') % 2 == 0 &&
                         std::ranges::count(doctype, '\'') % 2 == 0;
    return isPlain || fail("a DOCTYPE with more than a name and identifiers", start);
  }

  bool readPlistTag() {
    if (!rest().starts_with("<plist")) return fail("no <plist> where it should begin");
    std::string_view inside;
    if (!readUntil(">", inside)) return false;
    inside.remove_prefix(std::string_view("<plist").size());
    const bool isPlain = inside.empty() || isSpace(inside.front());
    return (isPlain && inside.find_first_of("<&/") == std::string_view::npos) ||
           fail("a malformed <plist>");
  }

  bool readEnd() {
    if (_isBare) {
      if (!skipSpacesAndComments()) return false;
      return _at == _text.size() || fail("something after the value");
    }
    Tag tag;
    if (!skipSpacesAndComments() || !readTag(tag)) return false;
    if (tag.name != "plist" || tag.form != Tag::Form::Close) {
      return fail("more than one value", tag.at);
    }
    if (!skipSpacesAndComments()) return false;
    return _at == _text.size() || fail("something after </plist>");
  }

  /// Moves past the characters of one kind.
  template <class Predicate>
  void skipWhile(Predicate predicate) {
    while (_at < _text.size() && predicate(_text[_at])) ++_at;
  }

  void skipSpaces() { skipWhile(isSpace); }

  bool skipSpacesAndComments() {
    skipSpaces();
    while (rest().starts_with("<!--")) {
      if (!readComment()) return false;
      skipSpaces();
    }
    return true;
  }

  // Where a comment ends must be beyond doubt.
  bool readComment() {
    const std::size_t start = _at;
    _at += std::string_view("<!--").size();
    std::string_view comment;
    if (!readUntil("--", comment)) return false;
    const bool isClear = rest().starts_with('>') && !comment.starts_with('>') &&
                         !comment.starts_with("->") && !comment.ends_with('-');
    if (!isClear) return fail("a malformed comment", start);
    ++_at;
    return true;
  }

  // --- The value

  bool readTag(Tag& tag) {
    if (!rest().starts_with('<')) return fail("no tag where one should begin");
    tag.at = _at++;
    tag.form = Tag::Form::Open;
    if (rest().starts_with('/')) {
      tag.form = Tag::Form::Close;
      ++_at;
    }
    const std::size_t name = _at;
    skipWhile(isNameCharacter);
    tag.name = _text.substr(name, _at - name);
    skipSpaces();
    if (tag.form == Tag::Form::Open && rest().starts_with('/')) {
      tag.form = Tag::Form::Empty;
      ++_at;
    }
    if (!rest().starts_with('>')) return fail("a malformed tag", tag.at);
    ++_at;
    return true;
  }

  bool readValues() {
    do {
      Tag tag;
      if (!skipSpacesAndComments() || !readTag(tag)) return false;
      if (!(tag.form == Tag::Form::Close ? closeContainer(tag) : readElement(tag))) return false;
    } while (!_open.empty());
    return true;
  }

  bool closeContainer(const Tag& tag) {
    if (_open.empty()) return fail("no value", tag.at);
    const OpenContainer& container = _open.back();
    if (tag.name != (container.isDictionary ? "dict" : "array")) {
      return fail("a wrong end tag", tag.at);
    }
    if (container.needsValue) return fail("a key without a value", tag.at);
    _open.pop_back();
    return true;
  }

  bool readElement(const Tag& tag) {
    if (++_nodes > _limits.nodes) return fail("too many nodes", tag.at);
    if (!_open.empty() && _open.back().isDictionary) {
      OpenContainer& dictionary = _open.back();
      if ((tag.name == "key") == dictionary.needsValue) {
        return fail("a dictionary whose keys and values do not alternate", tag.at);
      }
      dictionary.needsValue = !dictionary.needsValue;
      if (tag.name == "key") return readKey(tag, dictionary);
    }
    if (tag.name == "dict" || tag.name == "array") return openContainer(tag);
    if (tag.name == "string") return readText(tag);
    return readLeaf(tag);
  }

  bool readKey(const Tag& tag, OpenContainer& dictionary) {
    _keyWork += ++dictionary.keys;
    edit(tag.form == Tag::Form::Empty ? tag.at : _at, _at, XmlEdit::Kind::Key);
    return readText(tag);
  }

  void edit(std::size_t start, std::size_t end, XmlEdit::Kind kind) {
    _facts.edits.push_back({.at = static_cast<std::uint32_t>(start),
                            .length = static_cast<std::uint32_t>(end - start),
                            .kind = kind});
  }

  bool openContainer(const Tag& tag) {
    if (_open.size() >= _limits.levels) return fail("nested too deeply", tag.at);
    if (tag.form == Tag::Form::Open) _open.push_back({.isDictionary = tag.name == "dict"});
    return true;
  }

  bool readEndTagOf(const Tag& tag) {
    Tag end;
    if (!readTag(end)) return false;
    return (end.form == Tag::Form::Close && end.name == tag.name) ||
           fail("a wrong end tag", end.at);
  }

  bool readLeaf(const Tag& tag) {
    std::string_view content;
    const std::size_t start = _at;
    if (tag.form == Tag::Form::Open) {
      _at = std::min(_text.find('<', _at), _text.size());
      content = _text.substr(start, _at - start);
      if (!readEndTagOf(tag)) return false;
    }
    const LeafVerdict verdict = checkXmlLeaf(tag.name, content);
    _facts.hasLargeIntegers |= verdict.isLargeInteger;
    _facts.hasFarDates |= verdict.isFarDate;
    if (verdict.zeros != 0) {
      const std::size_t zeros = start + verdict.zerosAt;
      edit(zeros, zeros + verdict.zeros, XmlEdit::Kind::Zeros);
      _facts.needsEdits = true;
    }
    return verdict.problem.empty() || fail(verdict.problem, tag.at);
  }

  /// What is read of a text since its beginning, or since it can last be divided.
  struct TextPart {
    std::size_t entities = 0;
    std::size_t entitiesEnd = 0;  ///< behind the last of them
  };

  /// Lets the text be divided behind its last entity when the part is large enough.
  void divideText(TextPart& part) {
    const bool isLarge = part.entities == kEntitiesOfPart ||
                         (part.entities != 0 && _at - part.entitiesEnd > kBytesOfPart);
    if (!isLarge) return;
    edit(part.entitiesEnd, part.entitiesEnd, XmlEdit::Kind::TextBreak);
    part.entities = 0;
  }

  /// A text or a key: characters, entities and CDATA sections.
  bool readText(const Tag& tag) {
    if (tag.form == Tag::Form::Empty) return true;
    const std::size_t start = _at;
    std::size_t entities = 0;
    TextPart part;
    while (_at < _text.size()) {
      skipWhile([](char character) { return !isMarkup(character); });
      divideText(part);
      if (rest().starts_with('&')) {
        ++entities;
        ++part.entities;
        if (!readEntity()) return false;
        part.entitiesEnd = _at;
      } else if (rest().starts_with("<![CDATA[")) {
        part.entities = 0;
        std::string_view section;
        if (!readUntil("]]>", section)) return false;
      } else {
        break;
      }
    }
    _entityWork += entities * (_at - start);
    return readEndTagOf(tag);
  }

  bool readEntity() {
    constexpr std::size_t kLongest = 16;  // leading zeros included
    const std::size_t length = rest().substr(0, kLongest).find(';');
    if (length == std::string_view::npos || !isXmlEntity(rest().substr(1, length - 1))) {
      return fail("an entity that is none of XML's own");
    }
    _at += length + 1;
    return true;
  }

  std::string_view _text;
  const PropertyListLimits& _limits;
  std::size_t _at = 0;
  bool _isDeclared = false;
  bool _isBare = false;  ///< without <plist> around the value
  std::vector<OpenContainer> _open;
  PropertyListFacts _facts;
  std::size_t _nodes = 0;
  std::size_t _entityWork = 0;
  std::size_t _keyWork = 0;
  std::string_view _problem;
  std::size_t _problemAt = 0;
};

}  // namespace

Result<PropertyListFacts> scanXmlPropertyList(ByteView bytes, const PropertyListLimits& limits) {
  const std::string_view text(reinterpret_cast<const char*>(bytes.data()), bytes.size());
  return XmlScan(text, limits).scan();
}

}  // namespace kestro

#include "platform/registry_text.h"

#include <algorithm>
#include <optional>
#include <stdexcept>
#include <utility>

#include "platform/registry_store.h"
#include "platform/unicode.h"

namespace tendril {
namespace {

constexpr std::u16string_view kEditorHeader = u"Windows Registry Editor Version 5.00";
constexpr std::string_view kUtf16Mark = "\xFF\xFE";
constexpr std::string_view kUtf8Mark = "\xEF\xBB\xBF";

// Keys, values and lines that a file may have. A path of two bytes makes a key of two hundred.
constexpr std::size_t kMostItems = 1'000'000;

// Where the first byte stands that is no UTF-8; npos where there is none.
std::size_t FindStrayByte(std::u16string_view text) {
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] >= 0xD800 && text[i] < 0xDC00) {
      ++i;  // the first half of a character
    } else if (text[i] >= 0xDC00 && text[i] < 0xE000) {
      return i;
    }
  }
  return text.npos;
}

[[noreturn]] void Refuse() {
  throw std::runtime_error("it is neither UTF-16 with a byte order mark, low byte first, nor UTF-8.");
}

// Read as something else and written again, a file in another encoding would be lost.
void RefuseOtherForms(std::string_view bytes) {
  const std::string_view begin = bytes.substr(0, 4);
  const bool mark_of_utf16 = bytes.starts_with(kUtf16Mark) && begin != std::string_view("\xFF\xFE\0\0", 4);
  const bool zeros = begin.find('\0') != begin.npos && !mark_of_utf16;
  if (zeros || bytes.starts_with("\xFE\xFF") || bytes.starts_with("REGEDIT4")) Refuse();
}

std::u16string DecodeUtf8(std::string_view bytes) {
  std::u16string text = Utf16(bytes);
  const std::size_t stray = FindStrayByte(text);
  if (stray == text.npos) return text;
  // A file that was cut off may end within a character, of which up to three bytes are there.
  constexpr std::size_t kLongestPart = 3;
  if (text.size() - stray > kLongestPart) Refuse();
  text.resize(stray);
  return text;
}

std::u16string Decode(std::string_view bytes, RegistryEncoding& encoding) {
  RefuseOtherForms(bytes);
  if (!bytes.starts_with(kUtf16Mark)) {
    encoding = bytes.starts_with(kUtf8Mark) ? RegistryEncoding::kUtf8WithMark : RegistryEncoding::kUtf8;
    if (encoding == RegistryEncoding::kUtf8WithMark) bytes.remove_prefix(kUtf8Mark.size());
    return DecodeUtf8(bytes);
  }
  encoding = RegistryEncoding::kUtf16;
  bytes.remove_prefix(kUtf16Mark.size());
  return Utf16Text({reinterpret_cast<const std::uint8_t*>(bytes.data()), bytes.size()});
}

Bytes Encode(std::u16string_view text, RegistryEncoding encoding) {
  Bytes bytes;
  if (encoding == RegistryEncoding::kUtf16) {
    bytes = Utf16Bytes(text);
    bytes.insert(bytes.begin(), kUtf16Mark.begin(), kUtf16Mark.end());
    return bytes;
  }
  if (encoding == RegistryEncoding::kUtf8WithMark) bytes.assign(kUtf8Mark.begin(), kUtf8Mark.end());
  const std::string utf8 = Utf8(text);
  bytes.insert(bytes.end(), utf8.begin(), utf8.end());
  return bytes;
}

// What separates words, and begins the next line of a value.
bool IsBlank(char16_t unit) { return unit == u' ' || unit == u'\t'; }

std::u16string_view Trimmed(std::u16string_view text) {
  while (!text.empty() && IsBlank(text.front())) text.remove_prefix(1);
  while (!text.empty() && IsBlank(text.back())) text.remove_suffix(1);
  return text;
}

std::u16string AsComment(std::u16string lines) {
  std::replace_if(
      lines.begin(), lines.end(), [](char16_t unit) { return unit == u'\n' || unit == u'\r'; }, u' ');
  return std::u16string(u"; ").append(Trimmed(lines));
}

// Takes `prefix` off the front of `text`, if it is there.
bool Take(std::u16string_view& text, std::u16string_view prefix) {
  if (!text.starts_with(prefix)) return false;
  text.remove_prefix(prefix.size());
  return true;
}

// The value of exactly `digits` hexadecimal digits, taken off the front of `text`.
std::optional<std::uint32_t> TakeHex(std::u16string_view& text, std::size_t digits) {
  if (text.size() < digits) return std::nullopt;
  std::uint32_t value = 0;
  for (const char16_t unit : text.substr(0, digits)) {
    value <<= 4;
    if (unit >= u'0' && unit <= u'9') {
      value += static_cast<std::uint32_t>(unit - u'0');
    } else if (unit >= u'a' && unit <= u'f') {
      value += static_cast<std::uint32_t>(unit - u'a' + 10);
    } else if (unit >= u'A' && unit <= u'F') {
      value += static_cast<std::uint32_t>(unit - u'A' + 10);
    } else {
      return std::nullopt;
    }
  }
  text.remove_prefix(digits);
  return value;
}

// The text between quotes at the front of `text`, taken off it with them. A backslash that escapes nothing stands for
// itself.
std::optional<std::u16string> TakeQuoted(std::u16string_view& text) {
  if (!Take(text, u"\"")) return std::nullopt;
  std::u16string quoted;
  while (!text.empty()) {
    const char16_t unit = text.front();
    text.remove_prefix(1);
    if (unit == u'"') return quoted;
    if (unit == u'\\' && Take(text, u"n")) {
      quoted += u'\n';
    } else if (unit == u'\\' && Take(text, u"r")) {
      quoted += u'\r';
    } else if (unit == u'\\' && (text.starts_with(u'\\') || text.starts_with(u'"'))) {
      quoted += text.front();
      text.remove_prefix(1);
    } else {
      quoted += unit;
    }
  }
  return std::nullopt;
}

std::optional<RegistryValue> ReadText(std::u16string_view data) {
  std::optional<std::u16string> text = TakeQuoted(data);
  if (!text || !data.empty()) return std::nullopt;
  text->push_back(u'\0');
  return RegistryValue{kRegSz, Utf16Bytes(*text)};
}

// Of a line that was cut off, fewer than all digits would be another number.
std::optional<RegistryValue> ReadNumber(std::u16string_view data, bool line_is_whole) {
  constexpr std::size_t kDigits = 8;
  const std::size_t digits = line_is_whole ? std::clamp<std::size_t>(data.size(), 1, kDigits) : kDigits;
  const std::optional<std::uint32_t> number = TakeHex(data, digits);
  if (!number || !data.empty()) return std::nullopt;
  RegistryValue value{kRegDword, {}};
  for (const int shift : {0, 8, 16, 24})
    value.data.push_back(static_cast<std::uint8_t>(*number >> shift & 0xFF));
  return value;
}

// What stands behind "hex".
std::optional<RegistryValue> ReadHex(std::u16string_view data) {
  RegistryValue value{kRegBinary, {}};
  if (Take(data, u"(")) {
    const std::size_t end = data.find(u')');
    if (end == 0 || end > 8) return std::nullopt;
    const std::optional<std::uint32_t> type = TakeHex(data, end);
    if (!type) return std::nullopt;
    value.type = *type;
    data.remove_prefix(1);
  }
  if (!Take(data, u":")) return std::nullopt;
  for (bool first = true; !data.empty(); first = false) {
    if (!first && !Take(data, u",")) return std::nullopt;
    const std::optional<std::uint32_t> byte = TakeHex(data, 2);
    if (!byte) return std::nullopt;
    value.data.push_back(static_cast<std::uint8_t>(*byte));
  }
  return value;
}

// Reads line after line.
class Reader {
 public:
  Reader(RegistryForm& form, RegistryTree& tree, const UnreadLineSink& unread)
      : form_(form), tree_(tree), unread_(unread) {}

  void Read(std::u16string_view text);

 private:
  // The next line, without its end and the blanks at either side.
  std::u16string_view NextLine();
  void ReadHeader();
  bool ReadLine(std::u16string_view line);
  bool ReadKey(std::u16string_view line);
  bool ReadValue(std::u16string_view line);
  void Count(std::size_t items);

  RegistryForm& form_;
  RegistryTree& tree_;
  const UnreadLineSink& unread_;
  std::u16string_view rest_;
  std::size_t line_number_ = 0;  // of the line read last
  bool line_has_end_ = false;
  std::size_t items_ = 0;       // so far, at most kMostItems
  RegistryKey* key_ = nullptr;  // that the lines belong to
};

std::u16string_view Reader::NextLine() {
  const std::size_t end = rest_.find(u'\n');
  std::u16string_view line = rest_.substr(0, end);
  line_has_end_ = end != rest_.npos;
  rest_.remove_prefix(line_has_end_ ? end + 1 : rest_.size());
  ++line_number_;
  line = Trimmed(line);
  // Not only directly in front of the line feed: there it would be when the line is written again.
  while (line.ends_with(u'\r')) line = Trimmed(line.substr(0, line.size() - 1));
  return line;
}

void Reader::ReadHeader() {
  const std::size_t end = rest_.find(u'\n');
  if (end != rest_.npos && (end == 0 || rest_[end - 1] != u'\r')) form_.line_end = u"\n";
  const std::u16string_view at_first_line = rest_;
  const std::u16string_view line = NextLine();
  if (line == kEditorHeader) {
    form_.header = line;
  } else {
    rest_ = at_first_line;
    line_number_ = 0;
  }
}

void Reader::Read(std::u16string_view text) {
  rest_ = text;
  ReadHeader();
  while (!rest_.empty()) {
    std::u16string_view line = NextLine();
    const std::size_t first_number = line_number_;
    const char16_t* const begin = line.data();
    std::u16string joined;
    bool read = false;
    if (line.starts_with(u'"') || line.starts_with(u'@')) {
      if (line.ends_with(u'\\') && !rest_.empty() && IsBlank(rest_.front())) joined = line;
      while (joined.ends_with(u'\\') && !rest_.empty() && IsBlank(rest_.front())) {
        joined.pop_back();
        line = NextLine();
        joined += line;
      }
      read = ReadValue(joined.empty() ? line : joined);
    } else {
      read = ReadLine(line);
    }
    if (!line.empty()) Count(1);
    if (read) continue;
    // What was passed over is kept as it stands. What was cut off would pass for whole when it is written with an end,
    // and becomes a comment.
    std::u16string kept(begin, static_cast<std::size_t>(line.data() + line.size() - begin));
    if (!kept.starts_with(u';')) {
      unread_(first_number);
      if (!line_has_end_) kept = AsComment(std::move(kept));
    }
    (key_ != nullptr ? key_->other_lines : form_.lines_outside).push_back(std::move(kept));
  }
}

void Reader::Count(std::size_t items) {
  items_ += items;
  if (items_ > kMostItems)
    throw std::length_error("it has more than a million keys, values and other lines.");
}

bool Reader::ReadLine(std::u16string_view line) {
  if (line.empty()) return true;
  if (!line.starts_with(u'[')) return false;
  key_ = nullptr;  // below a key that cannot be read, nothing can
  return ReadKey(line);
}

bool Reader::ReadKey(std::u16string_view line) {
  if (line.size() < 3 || !line.ends_with(u']')) return false;
  line = line.substr(1, line.size() - 2);
  if (Take(line, u"-")) {
    tree_.Remove(line);
    return true;
  }
  std::size_t made = 0;
  key_ = tree_.Create(line, &made);
  if (key_ == nullptr) return false;
  if (made > 1) Count(made - 1);  // the key itself counts as a line
  return true;
}

bool Reader::ReadValue(std::u16string_view line) {
  if (key_ == nullptr) return false;
  std::optional<std::u16string> name = Take(line, u"@") ? std::u16string() : TakeQuoted(line);
  line = Trimmed(line);
  if (!name || !Take(line, u"=")) return false;
  line = Trimmed(line);
  if (line == u"-") {
    key_->values.erase(*name);
    return true;
  }
  std::optional<RegistryValue> value;
  if (line.starts_with(u'"')) {
    value = ReadText(line);
  } else if (Take(line, u"dword:")) {
    value = ReadNumber(line, line_has_end_);
  } else if (Take(line, u"hex") && line_has_end_) {
    // Of a file that was cut off, nobody can tell whether its last bytes are all there.
    value = ReadHex(line);
  }
  if (!value) return false;
  key_->values.insert_or_assign(*std::move(name), *std::move(value));
  return true;
}

// The text of data that can be written between quotes: a line's worth of characters and their terminator.
std::optional<std::u16string> PlainText(const RegistryValue& value) {
  const Bytes& data = value.data;
  if (value.type != kRegSz || data.size() % 2 != 0 || data.empty()) return std::nullopt;
  std::u16string text = Utf16Text(data);
  if (text.back() != u'\0') return std::nullopt;
  text.pop_back();
  const bool has_controls = std::any_of(text.begin(), text.end(), [](char16_t unit) { return unit < u' '; });
  if (has_controls || FindStrayByte(text) != text.npos || Utf16(Utf8(text)) != text) return std::nullopt;
  return text;
}

std::u16string HexDigits(std::uint32_t value, int digits) {
  std::u16string text;
  for (int shift = 4 * (digits - 1); shift >= 0; shift -= 4)
    text += u"0123456789abcdef"[value >> shift & 0xF];
  return text;
}

// Writes line after line.
class Writer {
 public:
  explicit Writer(std::u16string_view line_end) : line_end_(line_end) {}

  void Line(std::u16string_view line) { text_.append(line).append(line_end_); }
  void Lines(const std::vector<std::u16string>& lines) {
    for (const std::u16string& line : lines) Line(line);
  }
  // `path` is the key's own.
  void Key(const std::u16string& path, const RegistryKey& key);

  const std::u16string& text() const { return text_; }

 private:
  void Quoted(std::u16string_view text);
  void Value(std::u16string_view name, const RegistryValue& value);
  void Hex(const RegistryValue& value);

  std::u16string_view line_end_;
  std::u16string text_;
};

void Writer::Quoted(std::u16string_view text) {
  text_ += u'"';
  for (const char16_t unit : text) {
    if (unit == u'\\' || unit == u'"' || unit == u'\n' || unit == u'\r') text_ += u'\\';
    text_ += unit == u'\n' ? u'n' : unit == u'\r' ? u'r' : unit;
  }
  text_ += u'"';
}

void Writer::Hex(const RegistryValue& value) {
  text_ += u"hex";
  if (value.type != kRegBinary) {
    text_.append(u"(").append(HexDigits(value.type, value.type < 0x10 ? 1 : 8)).append(u")");
  }
  text_ += u':';
  constexpr std::size_t kBytesPerLine = 25;  // no wider than an export
  for (std::size_t i = 0; i < value.data.size(); ++i) {
    if (i != 0) text_ += u',';
    if (i != 0 && i % kBytesPerLine == 0) text_.append(u"\\").append(line_end_).append(u"  ");
    text_ += HexDigits(value.data[i], 2);
  }
  text_ += line_end_;
}

void Writer::Value(std::u16string_view name, const RegistryValue& value) {
  if (name.empty()) {
    text_ += u'@';
  } else {
    Quoted(name);
  }
  text_ += u'=';
  const Bytes& data = value.data;
  if (const std::optional<std::u16string> text = PlainText(value)) {
    Quoted(*text);
    text_ += line_end_;
  } else if (value.type == kRegDword && data.size() == 4) {
    text_ += u"dword:";
    for (const std::size_t byte : {3U, 2U, 1U, 0U}) text_ += HexDigits(data[byte], 2);
    text_ += line_end_;
  } else {
    Hex(value);
  }
}

void Writer::Key(const std::u16string& path, const RegistryKey& key) {
  // A key without anything of its own is there as a part of its subkeys' paths; a root key is there anyhow.
  const bool is_root = path.find(u'\\') == path.npos;
  const bool has_content = !key.values.empty() || !key.other_lines.empty();
  if (has_content || (key.subkeys.empty() && !is_root)) {
    Line(u"");
    Line(u"[" + path + u"]");
    Lines(key.other_lines);
    for (const auto& [name, value] : key.values) Value(name, value);
  }
  for (const auto& [name, subkey] : key.subkeys) {
    std::u16string subkey_path = path;
    Key(subkey_path.append(u"\\").append(name), *subkey);
  }
}

}  // namespace

RegistryForm ReadRegistryText(std::span<const std::uint8_t> bytes, RegistryTree& tree,
                              const UnreadLineSink& unread) {
  RegistryForm form;
  const std::u16string text =
      Decode({reinterpret_cast<const char*>(bytes.data()), bytes.size()}, form.encoding);
  Reader(form, tree, unread).Read(text);
  return form;
}

Bytes WriteRegistryText(const RegistryForm& form, const RegistryTree& tree) {
  Writer writer(form.line_end);
  writer.Line(form.header);
  writer.Lines(form.lines_outside);
  for (const auto& [name, root] : tree.top().subkeys) writer.Key(name, *root);
  writer.Line(u"");
  return Encode(writer.text(), form.encoding);
}

}  // namespace tendril

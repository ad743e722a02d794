// The table-driven converter of the compiled single-byte pages.
#include "table_pages.hpp"

#include <algorithm>
#include <memory>
#include <mutex>
#include <utility>

namespace nlssm::refhost {

TableCodec::TableCodec(const TablePage &page, bool swapLfNl) : substitute_(page.substitute) {
  std::copy(std::begin(page.toUnicode), std::end(page.toUnicode), toUnicode_);
  if (swapLfNl) {
    for (char16_t &c : toUnicode_) {
      if (c == u'\n')
        c = 0x85;
      else if (c == 0x85)
        c = u'\n';
    }
  }
  for (int b = 0; b < 256; ++b) {
    if (toUnicode_[b] != 0xFFFF)
      fromUnicode_.emplace_back(toUnicode_[b], static_cast<std::uint8_t>(b));
  }
  std::stable_sort(fromUnicode_.begin(), fromUnicode_.end(),
                   [](const auto &a, const auto &b) { return a.first < b.first; });
}

const TableCodec *TableCodec::find(std::string_view name) {
  if (name.substr(0, kTablePrefix.size()) != kTablePrefix) return nullptr;
  name.remove_prefix(kTablePrefix.size());
  constexpr std::string_view kSwap = ",swaplfnl";
  const bool swap = name.size() > kSwap.size() && name.substr(name.size() - kSwap.size()) == kSwap;
  if (swap) name.remove_suffix(kSwap.size());
  // Two codecs per page (plain and swapped), built once on first use.
  static std::once_flag once;
  static std::vector<std::unique_ptr<TableCodec>> codecs;
  std::call_once(once, [] {
    for (std::size_t i = 0; i < kTablePageCount; ++i) {
      codecs.emplace_back(new TableCodec(kTablePages[i], false));
      codecs.emplace_back(new TableCodec(kTablePages[i], true));
    }
  });
  for (std::size_t i = 0; i < kTablePageCount; ++i) {
    if (name == kTablePages[i].name) return codecs[2 * i + (swap ? 1 : 0)].get();
  }
  return nullptr;
}

void TableCodec::decode(const std::uint8_t *source, std::size_t length, std::u16string &out) const {
  out.resize(length);
  for (std::size_t i = 0; i < length; ++i) {
    const char16_t c = toUnicode_[source[i]];
    out[i] = c == 0xFFFF ? char16_t{0x1A} : c;
  }
}

bool TableCodec::encode(const std::u16string &text, std::string &out,
                        std::vector<std::int32_t> &offsets) const {
  out.clear();
  offsets.clear();
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char16_t c = text[i];
    const auto start = static_cast<std::int32_t>(i);
    std::uint8_t byte = substitute_;
    if (c >= 0xD800 && c <= 0xDBFF && i + 1 < text.size() && text[i + 1] >= 0xDC00 &&
        text[i + 1] <= 0xDFFF) {
      ++i;  // a supplementary character: no single-byte page has one
    } else if (c >= 0xD800 && c <= 0xDFFF) {
      return false;
    } else {
      const auto at =
          std::lower_bound(fromUnicode_.begin(), fromUnicode_.end(), c,
                           [](const auto &entry, char16_t v) { return entry.first < v; });
      if (at != fromUnicode_.end() && at->first == c) byte = at->second;
    }
    out.push_back(static_cast<char>(byte));
    offsets.push_back(start);
  }
  return true;
}

}  // namespace nlssm::refhost

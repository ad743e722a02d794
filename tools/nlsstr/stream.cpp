#include "stream.hpp"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <iostream>

#include "cursor/char_model.hpp"
#include "edit/character_walk.hpp"
#include "session.hpp"

namespace nlsstr {
namespace {

using nlssm::cursor::kModalShiftIn;
using nlssm::cursor::kModalShiftOut;
using nlssm::cursor::modal_double;

// Calls fn with the module's character model of the handle's class.
template <class Fn>
decltype(auto) with_model(const NLSSMHandle *h, Fn &&fn) {
  switch (h->encodingClass) {
    case NLSSM_CLASS_WCS2:
      return nlssm::edit::wide_big_endian(h) ? fn(nlssm::cursor::Wcs2Model<true>(h))
                                             : fn(nlssm::cursor::Wcs2Model<false>(h));
    case NLSSM_CLASS_WCS4:
      return fn(nlssm::cursor::FixedModel(h));
    case NLSSM_CLASS_MBCS_MODAL:
      return fn(nlssm::cursor::ModalModel(h));
    default:
      return nlssm::edit::with_multibyte_model(h, fn);
  }
}

template <class M>
Boundaries::Cut cut_with(const M &m, const uint8_t *p, size_t limit, size_t available, bool shifted,
                         bool prefer_single) {
  const auto lim = static_cast<int64_t>(limit), avail = static_cast<int64_t>(available);
  uint32_t state = shifted ? kModalShiftOut : kModalShiftIn;
  int64_t off = 0, end = 0, single_end = -1;
  int64_t open_shift = -1;  // where a shift-out not yet followed by a character starts
  uint32_t end_state = state;
  bool full = false;
  for (;;) {
    const int64_t before = off;
    const bool was_double = modal_double(state);
    m.skip_shifts(p, off, avail, state);  // a shift-in goes with what precedes it
    if (off != before) open_shift = !was_double && modal_double(state) ? before : -1;
    if (off > lim && end > 0) {
      full = true;
      break;
    }
    end = off;
    end_state = state;
    if (!modal_double(state)) single_end = off;
    if (off >= avail) break;
    const int64_t size = std::min(m.step(p + off, avail - off, state), avail - off);
    if (off + size > lim && end > 0) {
      full = true;
      break;
    }
    off += size;
    open_shift = -1;
  }
  // A shift-out goes with the characters it shifts.
  if (full && open_shift > 0) return {static_cast<size_t>(open_shift), false};
  if (prefer_single && modal_double(end_state) && single_end > 0)
    return {static_cast<size_t>(single_end), false};
  return {static_cast<size_t>(end), modal_double(end_state)};
}

// The first unit of `width` bytes in p[0, available), on a unit boundary,
// equal to `unit`.
size_t find_unit(const uint8_t *p, size_t available, const uint8_t *unit, size_t width) {
  for (size_t off = 0; off + width <= available; off += width)
    if (std::memcmp(p + off, unit, width) == 0) return off;
  return available;
}

}  // namespace

Boundaries::Boundaries(const NLSSMHandle *h) : h_(h) {
  if (h->encodingClass == NLSSM_CLASS_MBCS_MODAL) {
    const nlssm::cursor::ModalModel model(h);
    const auto length = static_cast<size_t>(model.length);
    shift_out_.assign(model.shift_out, model.shift_out + length);
    shift_in_.assign(model.shift_in, model.shift_in + length);
  }
}

Boundaries::Cut Boundaries::cut(const uint8_t *p, size_t limit, size_t available, bool shifted,
                                bool prefer_single) const {
  if (h_->encodingClass == NLSSM_CLASS_SBCS) return {std::min(limit, available), false};
  return with_model(h_, [&](const auto &model) {
    return cut_with(model, p, limit, available, shifted, prefer_single);
  });
}

size_t Boundaries::newline(const uint8_t *p, size_t available, size_t &width) const {
  width = 1;
  switch (h_->encodingClass) {
    case NLSSM_CLASS_WCS2:
    case NLSSM_CLASS_WCS4: {
      width = h_->encodingClass == NLSSM_CLASS_WCS2 ? 2 : 4;
      uint8_t unit[4] = {};
      unit[nlssm::edit::wide_big_endian(h_) ? width - 1 : 0] = 0x0A;
      return find_unit(p, available, unit, width);
    }
    default:
      break;
  }
  // Byte encodings: no newline byte occurs inside a multi-byte character.
  if (h_->encodingFlags & 1u) {
    const void *found = std::memchr(p, 0x0A, available);
    return found ? static_cast<size_t>(static_cast<const uint8_t *>(found) - p) : available;
  }
  for (size_t off = 0; off < available; ++off)
    if (p[off] == 0x15 || p[off] == 0x25) return off;  // EBCDIC NL and LF
  return available;
}

Reader::Reader(int fd, bool owned, std::string label)
    : fd_(fd), owned_(owned), label_(std::move(label)) {
  struct stat info {};
  if (fstat(fd_, &info) == 0 && S_ISREG(info.st_mode)) total_ = static_cast<uint64_t>(info.st_size);
  progress_ = isatty(STDERR_FILENO) == 1;
  interactive_ = isatty(fd_) == 1;
  start_ = last_ = std::chrono::steady_clock::now();
}

Reader::~Reader() {
  finish_progress();
  if (owned_) close(fd_);
}

size_t Reader::fill(size_t want) {
  while (available() < want && !ended_) {
    if (begin_ > 0) {  // keep the unread bytes at the front
      std::memmove(buffer_.data(), buffer_.data() + begin_, end_ - begin_);
      end_ -= begin_;
      begin_ = 0;
    }
    if (end_ == buffer_.size()) {
      // Full: grow by doubling, as far as what is wanted or the longest text
      // taken whole, so that a long line is read in ever larger pieces.
      const size_t most = std::max(want, kWholeLimit + 1);
      buffer_.resize(std::max(kPieceBytes, std::min(2 * buffer_.size(), most)));
    }
    const ssize_t got = read(fd_, buffer_.data() + end_, buffer_.size() - end_);
    if (got < 0) {
      if (errno == EINTR) continue;
      throw Failure("cannot read " + label_ + ": " + std::strerror(errno), 0, kExitInput);
    }
    if (got == 0) ended_ = true;
    end_ += static_cast<size_t>(got);
    read_ += static_cast<uint64_t>(got);
    show_progress(false);
  }
  return available();
}

void Reader::show_progress(bool force) {
  if (!progress_ || (total_ != 0 ? total_ : read_) < kProgressBytes) return;
  const auto now = std::chrono::steady_clock::now();
  if (!force && now - last_ < std::chrono::milliseconds(250)) return;
  last_ = now;
  const double seconds = std::chrono::duration<double>(now - start_).count();
  const double mib = static_cast<double>(read_) / (1 << 20);
  if (total_ != 0)
    std::fprintf(stderr, "\r%s: %.0f of %.0f MiB (%.0f%%), %.0f MiB/s\033[K", label_.c_str(), mib,
                 static_cast<double>(total_) / (1 << 20),
                 100.0 * static_cast<double>(read_) / static_cast<double>(total_),
                 seconds > 0 ? mib / seconds : 0.0);
  else
    std::fprintf(stderr, "\r%s: %.0f MiB, %.0f MiB/s\033[K", label_.c_str(), mib,
                 seconds > 0 ? mib / seconds : 0.0);
  shown_ = true;
}

void Reader::finish_progress() {
  if (!shown_) return;
  std::fputs("\r\033[K", stderr);
  shown_ = false;
}

Stream::Stream(Split split, size_t record_bytes, bool batch, int fd, bool owned, std::string label)
    : split_(split),
      record_bytes_(record_bytes),
      batch_(batch && record_bytes < kBatchBytes),
      reader_(fd, owned, std::move(label)) {}

// Appends the text up to the last character boundary within `limit` bytes.
// Modal text is kept whole on both sides of a cut inside a double-byte run:
// the text before it is closed with shift-in, the one after opened with
// shift-out.
void Stream::cut_into(std::vector<uint8_t> &text, size_t limit, bool prefer_single) {
  const std::vector<uint8_t> &shift_out = boundaries_->shift_out(),
                             &shift_in = boundaries_->shift_in();
  reader_.fill(limit + 4 + shift_in.size());
  const Boundaries::Cut cut =
      boundaries_->cut(reader_.data(), limit, reader_.available(), shifted_, prefer_single);
  if (shifted_) text.insert(text.end(), shift_out.begin(), shift_out.end());
  text.insert(text.end(), reader_.data(), reader_.data() + cut.end);
  reader_.consume(cut.end);
  shifted_ = cut.shifted && reader_.fill(1) > 0;
  if (shifted_) text.insert(text.end(), shift_in.begin(), shift_in.end());
}

std::vector<uint8_t> Stream::next(const NLSSMHandle *h) {
  if (boundaries_ == nullptr) boundaries_ = std::make_unique<Boundaries>(h);
  ++count_;
  taken_ = 1;
  switch (split_) {
    case Split::kWhole: {
      reader_.fill(kWholeLimit + 1);
      if (reader_.available() > kWholeLimit)
        throw Failure("the input is longer than 64 MiB; give --records N or --lines", 0,
                      kExitInput);
      std::vector<uint8_t> text(reader_.data(), reader_.data() + reader_.available());
      reader_.consume(reader_.available());
      return text;
    }
    case Split::kPieces: {
      std::vector<uint8_t> text;
      cut_into(text, kPieceBytes, true);
      return text;
    }
    case Split::kRecords: {
      std::vector<uint8_t> text;
      if (batch_) text.reserve(kBatchBytes + 2 * record_bytes_ + 16);
      cut_into(text, record_bytes_, false);
      while (batch_ && text.size() + record_bytes_ <= kBatchBytes && more()) {
        cut_into(text, record_bytes_, false);
        ++count_;
        ++taken_;
      }
      return text;
    }
    case Split::kLines: {
      // Only the bytes read since the last look are searched again.
      size_t width = 0, at = 0, want = 1, searched = 0;
      for (;;) {
        reader_.fill(want);
        const size_t available = reader_.available();
        at =
            searched + boundaries_->newline(reader_.data() + searched, available - searched, width);
        if (at < available || available < want) break;  // found, or the end
        if (available > kWholeLimit) throw Failure("a line is longer than 64 MiB", 0, kExitInput);
        searched = available - available % width;
        want = available + 1;
      }
      const size_t end = std::min(at, reader_.available());
      std::vector<uint8_t> text(reader_.data(), reader_.data() + end);
      line_end_.assign(reader_.data() + end,
                       reader_.data() + std::min(end + width, reader_.available()));
      reader_.consume(end + line_end_.size());
      return text;
    }
  }
  return {};
}

bool Stream::more() {
  if (reader_.interactive() && reader_.available() == 0) std::cout.flush();
  return reader_.fill(1) > 0;
}

bool Stream::more_pieces() {
  return split_ == Split::kPieces && more();
}

}  // namespace nlsstr

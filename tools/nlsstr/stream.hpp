// The input of a verb as a stream: --file or standard input, read in a
// bounded buffer and handed out whole, in pieces, as fixed-length records or
// as lines, always cut between characters of the encoding.
#pragma once

#include <nlssm/nlssm.h>

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace nlsstr {

// How the input is taken apart.
enum class Split {
  kWhole,    // one text, read whole (up to kWholeLimit bytes)
  kPieces,   // one text, handed out in pieces of about kPieceBytes
  kRecords,  // fixed-length records
  kLines,    // texts separated by the encoding's newline
};

inline constexpr size_t kWholeLimit = size_t{64} << 20;
inline constexpr size_t kPieceBytes = size_t{1} << 20;
inline constexpr size_t kBatchBytes = size_t{256} << 10;
// Inputs larger than this show a progress line on a terminal.
inline constexpr uint64_t kProgressBytes = uint64_t{8} << 20;

// Where a text of one encoding may be cut: its character boundaries, with
// the shift state of modal text, and its newline.
class Boundaries {
 public:
  explicit Boundaries(const NLSSMHandle *h);

  struct Cut {
    size_t end;    // bytes before the cut
    bool shifted;  // modal text: the cut falls inside a double-byte run
  };
  // The last character boundary at or before `limit` in p[0, available) for
  // a text that starts in the double-byte state when `shifted`. With
  // `prefer_single`, a boundary in the single-byte state wins when there is
  // one. At least one character is taken, even when it is longer than limit.
  Cut cut(const uint8_t *p, size_t limit, size_t available, bool shifted, bool prefer_single) const;
  // The offset of the first newline in p[0, available) (`available` when
  // there is none); its length through `width`.
  size_t newline(const uint8_t *p, size_t available, size_t &width) const;

  const std::vector<uint8_t> &shift_out() const { return shift_out_; }
  const std::vector<uint8_t> &shift_in() const { return shift_in_; }

 private:
  const NLSSMHandle *h_;
  std::vector<uint8_t> shift_out_, shift_in_;
};

// A file descriptor read into a buffer that grows only as far as one text
// needs, with a progress line on standard error when it is a terminal and
// the input is large.
class Reader {
 public:
  Reader(int fd, bool owned, std::string label);
  ~Reader();
  Reader(const Reader &) = delete;
  Reader &operator=(const Reader &) = delete;

  // Buffers at least `want` bytes unless the input ends first; answers the
  // bytes buffered.
  size_t fill(size_t want);
  const uint8_t *data() const { return buffer_.data() + begin_; }
  size_t available() const { return end_ - begin_; }
  void consume(size_t n) { begin_ += n; }
  bool ended() const { return ended_ && begin_ == end_; }
  // Whether the input is a terminal, where someone waits for each result.
  bool interactive() const { return interactive_; }
  // Removes the progress line, if one is shown.
  void finish_progress();

 private:
  void show_progress(bool force);

  int fd_;
  bool owned_;
  std::string label_;
  std::vector<uint8_t> buffer_;
  size_t begin_ = 0, end_ = 0;
  bool ended_ = false;
  uint64_t total_ = 0;  // size of a regular file, else 0
  uint64_t read_ = 0;
  bool progress_ = false, shown_ = false, interactive_ = false;
  std::chrono::steady_clock::time_point start_, last_;
};

// The texts of one input in the order a verb takes them.
class Stream {
 public:
  // With `batch`, records come in batches of whole records, about
  // kBatchBytes at a time, one after another in one text.
  Stream(Split split, size_t record_bytes, bool batch, int fd, bool owned, std::string label);

  // The next text in the handle's encoding; the first call fixes the
  // encoding the input is cut in.
  std::vector<uint8_t> next(const NLSSMHandle *h);
  // Whether another text follows. On a terminal, what was printed so far
  // is shown first.
  bool more();
  // Whether the last text was a piece and more of the same text follows.
  bool more_pieces();
  // Number of the last record or line (the first of a batch), from 1; 0 for
  // a whole text.
  int64_t record() const {
    return split_ == Split::kRecords || split_ == Split::kLines ? count_ - taken_ + 1 : 0;
  }
  // Records in the last text.
  int64_t records() const { return taken_; }
  Split split() const { return split_; }
  // The newline that ended the last line (empty at the end of the input).
  const std::vector<uint8_t> &line_end() const { return line_end_; }
  void finish() { reader_.finish_progress(); }

 private:
  void cut_into(std::vector<uint8_t> &text, size_t limit, bool prefer_single);

  Split split_;
  size_t record_bytes_;
  bool batch_;
  Reader reader_;
  std::unique_ptr<Boundaries> boundaries_;
  bool shifted_ = false;  // the next text continues a double-byte run
  int64_t count_ = 0;     // records and lines taken
  int64_t taken_ = 0;     // of them in the last text
  std::vector<uint8_t> line_end_;
};

}  // namespace nlsstr

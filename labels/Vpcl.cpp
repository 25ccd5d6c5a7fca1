#include "labels/Vpcl.h"

#include <array>
#include <charconv>
#include <cstdint>
#include <cstring>

namespace quendal::vpcl {

namespace {

// Writes one packet. The plain parameters gather in a small buffer that
// goes to the text in one append, before a quoted text and at the end: a
// format is a few hundred parameters, and some classes render theirs with
// every label.
class Writer {
 public:
  explicit Writer(std::string& out) : out_(out) {}
  Writer& Letter(char c) {
    Separate();
    buf_[n_++] = c;
    return *this;
  }
  Writer& Number(long value) {
    Separate();
    n_ = static_cast<std::size_t>(std::to_chars(buf_ + n_, buf_ + sizeof buf_, value).ptr - buf_);
    return *this;
  }
  Writer& Raw(std::string_view text) {
    Separate();
    Flush();
    out_ += text;
    return *this;
  }
  Writer& Quoted(std::string_view text) {
    Separate();
    buf_[n_++] = '"';
    Flush();
    AppendFieldData(out_, text);
    out_ += '"';
    return *this;
  }
  void End() {
    buf_[n_++] = '|';
    Flush();
  }

 private:
  // Room for the longest number and its separator is always left.
  void Separate() {
    if (n_ > sizeof buf_ - 24) Flush();
    if (started_) buf_[n_++] = ',';
    started_ = true;
  }
  void Flush() {
    out_.append(buf_, n_);
    n_ = 0;
  }
  std::string& out_;
  char buf_[128];
  std::size_t n_ = 0;
  bool started_ = false;
};

struct Render {
  std::string& out;
  void operator()(const Line& p) const {
    Writer(out).Letter('L').Letter('S').Number(p.row1).Number(p.column1).Number(p.row2)
        .Number(p.column2).Number(p.thickness).Quoted("11111111").End();
  }
  void operator()(const Box& p) const {
    Writer(out).Letter('Q').Number(p.row1).Number(p.column1).Number(p.row2).Number(p.column2)
        .Number(p.thickness).Quoted(p.pattern).End();
  }
  void operator()(const Text& p) const {
    Writer(out).Letter('C').Number(p.row).Number(p.column).Number(0).Number(p.font)
        .Number(p.across).Number(p.down).Letter(p.style).Letter(p.align).Number(0)
        .Number(p.rotation).Quoted(p.text).End();
  }
  void operator()(const Field& p) const {
    Writer(out).Letter('T').Number(p.field).Number(p.maxLength).Letter('V').Number(p.row)
        .Number(p.column).Number(0).Number(p.font).Number(p.across).Number(p.down)
        .Letter(p.style).Letter(p.align).Number(0).Number(0).Number(0).End();
  }
  void operator()(const Barcode& p) const {
    Writer(out).Letter('B').Number(p.field).Number(p.maxLength).Letter(p.data).Number(p.row)
        .Number(p.column).Number(8).Number(p.density).Number(p.height).Number(8).Letter('L')
        .Number(0).End();
  }
  void operator()(const FixedData& p) const {
    Writer(out).Letter('R').Number(p.field).Quoted(p.data).End();
  }
  void operator()(const Graphic& p) const {
    Writer(out).Letter('G').Number(p.number).Number(p.row).Number(p.column).Number(0).Number(0)
        .End();
  }
};

}  // namespace

namespace {

enum class Treat : unsigned char { Keep, Drop, Space };

constexpr auto kTreat = [] {
  std::array<Treat, 256> treat{};
  for (int c = 0; c < 0x20; ++c) treat[static_cast<std::size_t>(c)] = Treat::Space;
  treat[0x7F] = Treat::Space;
  for (unsigned char c : {'"', '|', '{', '}'}) treat[c] = Treat::Drop;
  return treat;
}();

}  // namespace

// True when none of the 8 bytes at `p` needs treatment: no control
// character, no DEL and none of " | { }. Most field data is plain, so it
// is checked a word at a time.
bool PlainWord(const char* p) {
  std::uint64_t x;
  std::memcpy(&x, p, sizeof x);
  constexpr std::uint64_t kOnes = 0x0101010101010101ULL;
  constexpr std::uint64_t kHigh = 0x8080808080808080ULL;
  // A byte of x equal to b becomes 0 in x ^ (b * kOnes); a zero byte, or a
  // byte below 0x20 in x itself, sets its high bit in the tests below.
  const auto zeroByte = [](std::uint64_t v) { return (v - kOnes) & ~v & kHigh; };
  const std::uint64_t below20 = (x - 0x20 * kOnes) & ~x & kHigh;
  return (below20 | zeroByte(x ^ ('"' * kOnes)) | zeroByte(x ^ ('|' * kOnes)) |
          zeroByte(x ^ ('{' * kOnes)) | zeroByte(x ^ ('}' * kOnes)) |
          zeroByte(x ^ (0x7F * kOnes))) == 0;
}

void AppendFieldData(std::string& out, std::string_view text) {
  std::size_t run = 0;  // start of the characters kept as they are
  std::size_t i = 0;
  while (i + 8 <= text.size() && PlainWord(text.data() + i)) i += 8;
  for (; i < text.size(); ++i) {
    const Treat treat = kTreat[static_cast<unsigned char>(text[i])];
    if (treat == Treat::Keep) continue;
    out.append(text.data() + run, i - run);
    if (treat == Treat::Space) out += ' ';
    run = i + 1;
  }
  out.append(text.data() + run, text.size() - run);
}

std::string FieldData(std::string_view text) {
  std::string out;
  out.reserve(text.size());
  AppendFieldData(out, text);
  return out;
}

std::string RenderFormat(std::string_view number, const Format& format) {
  std::string out;
  out.reserve(64 + format.packets.size() * 64);
  out += '{';
  Writer(out).Letter('F').Raw(FieldData(number)).Letter('A').Letter('R').Letter(format.storage)
      .Number(format.length).Number(format.width).Quoted(format.name).End();
  const Render render{out};
  for (const Packet& packet : format.packets) std::visit(render, packet);
  out += '}';
  return out;
}

Batch::Batch(std::string_view number, int quantity, std::string_view batchMode) {
  text_.reserve(1024);
  text_ += '{';
  Writer(text_).Letter('B').Raw(FieldData(number)).Letter('N').Number(quantity).End();
  Writer(text_).Letter('E').Raw(FieldData(batchMode)).Number(0).Number(1).Number(1).Number(0)
      .Number(1).End();
}

Batch& Batch::Field(int number, std::string_view data) {
  // `number,"data"|`, appended in place: a batch has a few dozen fields per label.
  char digits[24];
  const auto end = std::to_chars(digits, digits + sizeof digits, number).ptr;
  text_.append(digits, static_cast<std::size_t>(end - digits));
  text_.append(",\"", 2);
  AppendFieldData(text_, data);
  text_.append("\"|", 2);
  return *this;
}

std::string Batch::Finish() && {
  text_ += '}';
  return std::move(text_);
}

}  // namespace quendal::vpcl

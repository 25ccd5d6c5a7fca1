// VPCL II packets. A format (the fixed layout a thermal printer stores) is
// declared as data, a list of packets, and rendered once; a batch (one
// carton's field texts for a stored format) is built field by field.
//
// Grammar: "{" header "|" packet "|" ... packet "|}", a packet being a
// letter and comma-separated parameters (plain decimal numbers, single
// letters, texts in double quotes). Rows count upward from the label's
// bottom edge, columns rightward from its left edge.
#pragma once

#include <array>
#include <cstddef>
#include <utility>
#include <span>
#include <string>
#include <string_view>
#include <variant>

namespace quendal::vpcl {

// L,S,row1,column1,row2,column2,thickness,"11111111"
struct Line {
  int row1, column1, row2, column2, thickness;
};
// Q,row1,column1,row2,column2,thickness,"pattern"
struct Box {
  int row1, column1, row2, column2, thickness;
  std::string_view pattern;
};
// C,row,column,0,font,across,down,style,align,0,rotation,"text"
// style: O, B or W; align: L or R; rotation: 0 or 3.
struct Text {
  int row, column, font, across, down;
  char style, align;
  int rotation;
  std::string_view text;
};
// T,field,maxLength,V,row,column,0,font,across,down,style,align,0,0,0
struct Field {
  int field, maxLength, row, column, font, across, down;
  char style, align;
};
// B,field,maxLength,V|F,row,column,8,density,height,8,L,0
// data: V for data from the batch, F for data fixed in the format.
struct Barcode {
  int field, maxLength;
  char data;
  int row, column, density, height;
};
// R,field,"data": the data of a fixed-data barcode field.
struct FixedData {
  int field;
  std::string_view data;
};
// G,number,row,column,0,0: places a downloaded graphic.
struct Graphic {
  int number, row, column;
};

using Packet = std::variant<Line, Box, Text, Field, Barcode, FixedData, Graphic>;

namespace detail {
template <class T, std::size_t N, std::size_t M, std::size_t... I>
constexpr std::array<T, N + M> Join(const std::array<T, N>& a, const std::array<T, M>& b,
                                    std::index_sequence<I...>) {
  return {{(I < N ? a[I] : b[I - N])...}};
}
}  // namespace detail

// Lists one after the other: a format's packets (or a batch's fields) put
// together from pieces that several formats share.
template <class T, std::size_t N, std::size_t M>
constexpr std::array<T, N + M> Join(const std::array<T, N>& a, const std::array<T, M>& b) {
  return detail::Join(a, b, std::make_index_sequence<N + M>());
}
template <class T, std::size_t N, std::size_t M, class... Rest>
constexpr auto Join(const std::array<T, N>& a, const std::array<T, M>& b, const Rest&... rest) {
  return Join(Join(a, b), rest...);
}

struct Format {
  std::string_view name;
  int length;  // header units, along the rows
  int width;   // along the columns
  std::span<const Packet> packets;
  // The header's unit letter: "E" hundredths of an inch, "M" tenths of a millimetre.
  char storage = 'E';
};

// "{F,<number>,A,R,<storage>,<length>,<width>,"<name>"|" + packets + "}".
std::string RenderFormat(std::string_view number, const Format& format);

// A batch: "{B,<number>,N,<quantity>|E,<batch mode>,0,1,1,0,1|", then one
// `field,"data"|` per Field, then "}".
class Batch {
 public:
  Batch(std::string_view number, int quantity, std::string_view batchMode);
  Batch& Field(int number, std::string_view data);
  std::string Finish() &&;

 private:
  std::string text_;
};

// Text made safe for a quoted field: a double quote would end the field
// early, "|" would end the packet and "{" "}" would open or close a
// format or batch, so they are removed; control characters (line breaks,
// tabs) become spaces, since the stream carries no line breaks.
std::string FieldData(std::string_view text);
void AppendFieldData(std::string& out, std::string_view text);

}  // namespace quendal::vpcl

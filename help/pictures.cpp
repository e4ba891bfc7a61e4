#include "pictures.h"

#include <algorithm>
#include <cstdint>
#include <fstream>
#include <functional>
#include <sstream>
#include <stdexcept>
#include <string_view>
#include <vector>

#include "html.h"
#include "quorrel/catalog.h"
#include "quorrel/session.h"

namespace quorrel::help {
namespace {

// One instance driven by script lines, its expressions read back as the host reads them.
class Probe {
 public:
  Probe(const tool::ModuleLoader& module, const std::vector<std::string>& script)
      : session_(module, {}, &ignored_) {
    for (const std::string& line : script) run(line);
  }
  Probe(const Probe&) = delete;
  Probe& operator=(const Probe&) = delete;
  void run(const std::string& line) {
    std::ostringstream out;
    session_.execute(tool::parseLine(line), out);
  }
  hostsim::ExpressionResult ask(const std::string& call) {
    const tool::Command command = tool::parseLine("E " + call);
    const auto code =
        command.name.empty() ? command.code : tool::codeOfTypedName(false, command.name).value();
    return session_.instance().callExpression(code, command.args);
  }
  int32_t number(const std::string& call) { return ask(call).number; }
  std::string text(const std::string& call) { return ask(call).text; }

 private:
  std::ostringstream ignored_;
  tool::Session session_;
};

std::string quoted(const std::string& text) {
  return '"' + text + '"';
}
std::string call(const std::string& name, std::initializer_list<std::string> args) {
  std::string text = name + "(";
  for (const std::string& arg : args) text += (text.back() == '(' ? "" : ", ") + arg;
  return text + ")";
}
std::string str(int32_t n) {
  return std::to_string(n);
}

// A drawing in user units; the page scales it to the column, down to a narrow window.
class Svg {
 public:
  void rect(double x, double y, double w, double h, const std::string& cls) {
    body_ += "<rect class=\"" + cls + "\" x=\"" + num(x) + "\" y=\"" + num(y) + "\" width=\"" +
             num(w) + "\" height=\"" + num(h) + "\"/>";
    grow(x + w, y + h);
  }
  void text(double x, double y, const std::string& content, const std::string& cls,
            const char* anchor = "middle") {
    body_ += "<text class=\"" + cls + "\" x=\"" + num(x) + "\" y=\"" + num(y) +
             "\" text-anchor=\"" + anchor + "\">" + escapeHtml(content) + "</text>";
    // Room for the text as well, at most about 8 units a character.
    size_t characters = 0;
    for (const char c : content) characters += (static_cast<unsigned char>(c) & 0xC0) != 0x80;
    const double width = 8.0 * static_cast<double>(characters);
    grow(x + (std::string_view(anchor) == "start"    ? width
              : std::string_view(anchor) == "middle" ? width / 2
                                                     : 0),
         y + 4);
  }
  std::string html(const std::string& label) const {
    const std::string w = num(width_ + 4), h = num(height_ + 4);
    return "<svg class=\"picture\" viewBox=\"0 0 " + w + ' ' + h + "\" width=\"" + w +
           "\" role=\"img\" aria-label=\"" + escapeHtml(label) + "\"><title>" + escapeHtml(label) +
           "</title>" + body_ + "</svg>";
  }

 private:
  static std::string num(double v) {
    std::ostringstream out;
    out << v;
    return out.str();
  }
  void grow(double x, double y) {
    width_ = std::max(width_, x);
    height_ = std::max(height_, y);
  }
  std::string body_;
  double width_ = 0, height_ = 0;
};

std::string figure(const std::string& svg, const std::string& caption) {
  return "<figure class=\"picture\">" + svg + "\n<figcaption>" + caption +
         "</figcaption></figure>\n";
}

constexpr double kCell = 34;

// A grid of cells at coordinates; `cell(x, y)` gives the text and whether it is empty.
struct GridCell {
  std::string text;
  std::string cls = "cell";
};
void grid(Svg& svg, double left, double top, int columns, int rows, const std::string& title,
          const std::function<GridCell(int, int)>& cell) {
  svg.text(left, top + 12, title, "title", "start");
  top += 22;
  for (int x = 0; x < columns; ++x)
    svg.text(left + 16 + (x + .5) * kCell, top + 10, str(x), "axis");
  for (int y = 0; y < rows; ++y) {
    svg.text(left + 6, top + 16 + (y + .5) * kCell + 4, str(y), "axis");
    for (int x = 0; x < columns; ++x) {
      const GridCell c = cell(x, y);
      const double cx = left + 16 + x * kCell, cy = top + 16 + y * kCell;
      svg.rect(cx, cy, kCell, kCell, c.cls);
      svg.text(cx + kCell / 2, cy + kCell / 2 + 4, c.text, "value");
    }
  }
}

// 1D, 2D and 3D: the index of each coordinate, as the module computes it.
std::string indexLayout(const tool::ModuleLoader& module) {
  Svg svg;
  Probe one(module, {"new dims=1"});
  grid(svg, 0, 0, 6, 1, "1D: index = X", [&](int x, int) {
    return GridCell{str(one.number(call("indexOfDimIndex", {quoted(str(x))})))};
  });
  Probe two(module, {"new dims=2 x=4"});
  const int32_t cx2 = two.number("boundaryX");
  grid(svg, 0, 80, cx2, 3, "2D, X boundary " + str(cx2) + ": index = X + Y × " + str(cx2),
       [&](int x, int y) {
         return GridCell{str(two.number(call("indexOfXY", {str(x), str(y)})))};
       });
  Probe three(module, {"new dims=3 x=3 y=2"});
  const int32_t cx3 = three.number("boundaryX"), cy3 = three.number("boundaryY");
  svg.text(0, 242,
           "3D, X " + str(cx3) + ", Y " + str(cy3) + ": index = X + Y × " + str(cx3) + " + Z × " +
               str(cx3 * cy3),
           "title", "start");
  for (int z = 0; z < 2; ++z) {
    grid(svg, z * (cx3 * kCell + 60), 252, cx3, cy3, "page Z = " + str(z), [&](int x, int y) {
      const std::string coordinates = str(x) + "," + str(y) + "," + str(z);
      return GridCell{str(three.number(call("indexOfDimIndex", {quoted(coordinates)})))};
    });
  }
  return figure(svg.html("Element index at each coordinate in one, two and three dimensions"),
                "The index of each cell, as <code>indexOfDimIndex(</code> and "
                "<code>indexOfXY(</code> give it: X across, Y down, Z the page.");
}

// The elements of a 2D array at their coordinates, as the module places them.
void arrayGrid(Svg& svg, double left, double top, Probe& probe, const std::string& title) {
  const int32_t size = probe.number("size"), columns = probe.number("boundaryX");
  const int32_t rows = (size + columns - 1) / columns;
  std::map<std::pair<int, int>, std::string> at;
  for (int32_t i = 0; i < size; ++i) {
    at[{probe.number(call("XOfIndex", {str(i)})), probe.number(call("YOfIndex", {str(i)}))}] =
        probe.text(call("get$", {str(i)}));
  }
  grid(svg, left, top, columns, rows, title, [&](int x, int y) {
    const auto found = at.find({x, y});
    if (found == at.end()) return GridCell{"", "cell absent"};
    return found->second.empty() ? GridCell{"", "cell empty"} : GridCell{found->second};
  });
}

std::string boundaryChange(const tool::ModuleLoader& module) {
  const std::string setup = "new dims=2 x=3";
  const std::vector<std::string> letters = {"a", "b", "c", "d", "e", "f", "g", "h"};
  auto filled = [&](Probe& probe) {
    for (const std::string& letter : letters) probe.run("A appendString " + quoted(letter));
  };
  Svg svg;
  Probe before(module, {setup}), set(module, {setup}), resized(module, {setup});
  filled(before);
  filled(set);
  filled(resized);
  set.run("A setDimensionBoundary 1 4");
  resized.run("A resizeDimensionBoundary 1 4");
  arrayGrid(svg, 0, 0, before, "Before: X boundary 3");
  arrayGrid(svg, 0, 160, set, "Set X boundary to 4");
  arrayGrid(svg, 220, 160, resized, "Resize X boundary to 4");
  return figure(svg.html("Set against Resize dimension boundary, before and after"),
                "Eight strings in a 2D array, then X set to 4 both ways. \"Set\" keeps the "
                "elements in their row and reads them at new places; \"Resize\" inserts empty "
                "positions (dashed) so that each complete row keeps its coordinates.");
}

const std::vector<std::string> kTable = {
    "new dims=2 x=2 autoselect=1",     "A setLabel \"name\" 0",
    "A setLabel \"score\" 1",          "A appendRowFromList \"Ann,120\"",
    "A appendRowFromList \"Bob,340\"", "A appendRowFromList \"Cy,95\"",
    "A appendRowFromList \"Dee,210\""};

// Each table row's cells, and whether the row is selected: a row is selected when it is
// one of the visible rows, whose lists the module gives.
struct TableState {
  std::vector<std::vector<std::string>> rows;
  std::vector<bool> selected;
};
TableState tableState(Probe& probe) {
  TableState state;
  const int32_t columns = probe.number("numberOfCols");
  const int32_t tableRows = probe.number("size") / columns;
  std::vector<std::string> visible;
  for (int32_t v = 0; v < probe.number("numberOfRows"); ++v) {
    visible.push_back(probe.text(call("rowList$", {str(v)})));
  }
  for (int32_t r = 0; r < tableRows; ++r) {
    std::vector<std::string> cells;
    std::string joined;
    for (int32_t c = 0; c < columns; ++c) {
      cells.push_back(probe.text(call("getFromColumnRow$", {str(c), str(r)})));
      joined += (c ? probe.text("delimiter$") : "") + cells.back();
    }
    state.rows.push_back(cells);
    state.selected.push_back(std::find(visible.begin(), visible.end(), joined) != visible.end());
  }
  return state;
}

std::string recordset(const tool::ModuleLoader& module) {
  Probe probe(module, kTable);
  probe.run("A startNewWhere");
  probe.run("A selectWhereGreaterByLabel \"score\" 100");
  const TableState state = tableState(probe);
  const int32_t columns = probe.number("numberOfCols");
  constexpr double kWidth = 90, kHeight = 26, kLeft = 74;
  Svg svg;
  svg.text(kLeft - 8, 17, "label", "axis", "end");
  for (int32_t c = 0; c < columns; ++c) {
    svg.rect(kLeft + c * kWidth, 0, kWidth, kHeight, "head");
    svg.text(kLeft + (c + .5) * kWidth, 17, probe.text(call("getLabel$", {str(c)})), "value");
  }
  for (size_t r = 0; r < state.rows.size(); ++r) {
    const double y = (r + 1) * kHeight;
    svg.text(kLeft - 8, y + 17, (state.selected[r] ? "✓ row " : "row ") + std::to_string(r),
             state.selected[r] ? "mark" : "axis", "end");
    for (size_t c = 0; c < state.rows[r].size(); ++c) {
      svg.rect(kLeft + c * kWidth, y, kWidth, kHeight,
               state.selected[r] ? "cell selected" : "cell");
      svg.text(kLeft + (c + .5) * kWidth, y + 17, state.rows[r][c], "value");
    }
  }
  const double y = (state.rows.size() + 1) * kHeight + 6;
  svg.rect(kLeft + kWidth, y, kWidth, kHeight, "total");
  svg.text(kLeft + kWidth - 8, y + 17, "labSum(\"score\")", "axis", "end");
  svg.text(kLeft + 1.5 * kWidth, y + 17, str(probe.number("labSum(\"score\")")), "value");
  return figure(svg.html("A recordset with labels, its selected rows and a column total"),
                "Four rows, then <code>A startNewWhere</code> and <code>A "
                "selectWhereGreaterByLabel \"score\" 100</code>: the selected rows are shaded, "
                "and the column total counts them only.");
}

// The selection after each step of a query, one column per step.
std::string selectionSteps(const tool::ModuleLoader& module, const std::string& title,
                           const std::vector<std::string>& steps) {
  Probe probe(module, kTable);
  std::vector<TableState> states = {tableState(probe)};
  for (const std::string& step : steps) {
    probe.run(step);
    states.push_back(tableState(probe));
  }
  constexpr double kNames = 96, kStep = 40, kRow = 24;
  Svg svg;
  svg.text(0, 12, title, "title", "start");
  for (size_t s = 0; s < states.size(); ++s) {
    svg.text(kNames + (s + .5) * kStep, 34, s == 0 ? "start" : str(static_cast<int32_t>(s)),
             "axis");
  }
  const TableState& first = states.front();
  for (size_t r = 0; r < first.rows.size(); ++r) {
    const double y = 42 + r * kRow;
    svg.text(kNames - 8, y + 16, first.rows[r][0] + " " + first.rows[r][1], "value", "end");
    for (size_t s = 0; s < states.size(); ++s) {
      svg.rect(kNames + s * kStep + 4, y + 2, kStep - 8, kRow - 4,
               states[s].selected[r] ? "cell selected" : "cell");
      if (states[s].selected[r]) svg.text(kNames + (s + .5) * kStep, y + 16, "✓", "mark");
    }
  }
  std::string list = "<ol class=\"steps\">";
  for (const std::string& step : steps) list += "<li><code>" + escapeHtml(step) + "</code></li>";
  return svg.html(title + ": the selected rows after each step") + list + "</ol>";
}

std::string selections(const tool::ModuleLoader& module) {
  const std::string orSteps =
      selectionSteps(module, "OR: either test",
                     {"A startNewWhere", "A selectWhereGreaterByLabel \"score\" 300",
                      "A selectWhereLessByLabel \"score\" 100"});
  const std::string andSteps =
      selectionSteps(module, "AND: both tests",
                     {"A startNewWhere", "A selectWhereGreaterByLabel \"score\" 100",
                      "A selectionModeAnd", "A selectWhereLessByLabel \"score\" 300"});
  return "<figure class=\"picture steps\"><div class=\"side\">" + orSteps +
         "</div><div class=\"side\">" + andSteps +
         "</div>\n<figcaption>The rows of the table above, all selected at the start, after each "
         "step of an OR query and of an AND query.</figcaption></figure>\n";
}

// ---- File strips: the bytes of a saved file, cut into its fields.

struct Field {
  std::string name;
  size_t length;
};

class ByteWalker {
 public:
  explicit ByteWalker(const std::string& bytes) : bytes_(bytes) {}
  void take(const std::string& name, size_t length) {
    if (at_ + length > bytes_.size()) throw std::runtime_error("the file ends inside " + name);
    fields_.push_back({name, length});
    at_ += length;
  }
  int32_t takeNumber(const std::string& name, size_t length) {
    uint32_t value = 0;
    if (at_ + length <= bytes_.size()) {
      for (size_t i = 0; i < length; ++i) {
        value |= static_cast<uint32_t>(static_cast<unsigned char>(bytes_[at_ + i])) << (8 * i);
      }
    }
    take(name + " = " + std::to_string(static_cast<int32_t>(value)), length);
    return static_cast<int32_t>(value);
  }
  // Text up to and with the next line end.
  void takeLine(const std::string& name) {
    const size_t end = bytes_.find("\r\n", at_);
    take(name, (end == std::string::npos ? bytes_.size() : end + 2) - at_);
  }
  bool done() const { return at_ == bytes_.size(); }
  std::vector<Field> fields() const {
    if (!done()) throw std::runtime_error("bytes left after the last field");
    return fields_;
  }

 private:
  const std::string& bytes_;
  size_t at_ = 0;
  std::vector<Field> fields_;
};

std::string readBytes(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) throw std::runtime_error("the module did not write " + path);
  std::ostringstream out;
  out << in.rdbuf();
  return out.str();
}

std::string byteText(unsigned char byte) {
  if (byte == '\r') return "CR";
  if (byte == '\n') return "LF";
  if (byte >= 0x20 && byte < 0x7F) return std::string(1, static_cast<char>(byte));
  return "";
}

std::string strip(const std::string& title, const std::string& made, const std::string& bytes,
                  const std::vector<Field>& fields) {
  constexpr int kPerRow = 16;
  constexpr double kWidth = 26, kRowHeight = 56;
  static const char* const kHex = "0123456789ABCDEF";
  Svg svg;
  std::string legend = "<ol class=\"fields\">";
  size_t at = 0;
  for (size_t f = 0; f < fields.size(); ++f) {
    const std::string shade = "seg" + std::to_string(f % 4);
    legend += "<li><span class=\"swatch " + shade + "\"></span>" + escapeHtml(fields[f].name) +
              " <small>(" + std::to_string(fields[f].length) +
              (fields[f].length == 1 ? " byte" : " bytes") + ")</small></li>";
    for (size_t i = 0; i < fields[f].length; ++i, ++at) {
      const double x = (at % kPerRow) * kWidth, y = (at / kPerRow) * kRowHeight;
      if (i == 0) svg.text(x + 2, y + 11, std::to_string(f + 1), "field", "start");
      const auto byte = static_cast<unsigned char>(bytes[at]);
      svg.rect(x, y + 16, kWidth, 26, "byte " + shade);
      svg.text(x + kWidth / 2, y + 33, std::string{kHex[byte >> 4], kHex[byte & 15]}, "hex");
      svg.text(x + kWidth / 2, y + 53, byteText(byte), "char");
    }
  }
  return "<figure class=\"picture strip\">" + made +
         svg.html(title + ": the " + std::to_string(bytes.size()) + " bytes of a saved file") +
         "\n<figcaption>" + title + ", " + std::to_string(bytes.size()) +
         " bytes as the object wrote them, field by field:</figcaption>" + legend +
         "</ol></figure>\n";
}

// The file a script saved, its fields walked from its own counts.
std::string fileStrip(const tool::ModuleLoader& module, const std::vector<std::string>& script,
                      const std::string& path, const std::string& title,
                      const std::function<void(ByteWalker&)>& walk) {
  Probe probe(module, script);
  const std::string bytes = readBytes(path);
  ByteWalker walker(bytes);
  walk(walker);
  std::string shown = "<pre class=\"made\">";
  for (const std::string& line : script) shown += escapeHtml(line) + "\n";
  return strip(title, shown + "</pre>\n", bytes, walker.fields());
}

void walkNative(ByteWalker& w) {
  w.take("magic ZUBARRAY", 8);
  w.takeNumber("version", 2);
  const int32_t dims = w.takeNumber("dimension count", 4);
  for (int32_t d = 1; d <= dims; ++d) w.takeNumber("boundary " + str(d), 4);
  const int32_t labels = w.takeNumber("label count", 4);
  for (int32_t l = 0; l < labels; ++l) {
    const int32_t length = w.takeNumber("label " + str(l) + " length", 4);
    if (length > 0) w.take("label " + str(l) + " text", static_cast<size_t>(length));
  }
  const int32_t elements = w.takeNumber("element count", 4);
  for (int32_t e = 0; e < elements; ++e) {
    for (const char* part : {"", "key "}) {
      const std::string name = "element " + str(e) + " " + part;
      w.takeNumber(name + "type", 2);
      const int32_t size = w.takeNumber(name + "size", 4);
      if (size > 0) w.take(name + "data", static_cast<size_t>(size));
    }
  }
}

void walkHost(ByteWalker& w) {
  w.take("header CNC ARRAY and a zero", 10);
  w.takeNumber("version", 4);
  const int32_t x = w.takeNumber("X size", 4), y = w.takeNumber("Y size", 4),
                z = w.takeNumber("Z size", 4);
  w.takeNumber("cell kind", 4);
  for (int32_t cell = 0; cell < x * y * z; ++cell) {
    const int32_t length = w.takeNumber("cell " + str(cell) + " length", 4);
    if (length > 0) w.take("cell " + str(cell) + " text", static_cast<size_t>(length));
  }
}

std::map<std::string, std::string> fileStrips(const tool::ModuleLoader& module) {
  std::map<std::string, std::string> strips;
  strips["FILE_NATIVE"] = fileStrip(module,
                                    {"new dims=2 x=3", "A appendString \"ab\"", "A appendValue 7",
                                     "A setKeyStringAt \"k\" 1", "A saveToFile \"strip.arr\""},
                                    "strip.arr", "Array file", walkNative);
  strips["FILE_HOST"] = fileStrip(module,
                                  {"new dims=2 x=2", "A appendString \"ab\"", "A appendValue 7",
                                   "A saveToHostArray \"strip.mmf\""},
                                  "strip.mmf", "MMF array file", walkHost);
  strips["FILE_CSV"] = fileStrip(module,
                                 {"new dims=2 x=2", "A appendRowFromList \"Ann,120\"",
                                  "A appendString \"Bob\"", "A saveToCsv \"strip.csv\""},
                                 "strip.csv", "CSV file", [](ByteWalker& w) {
                                   w.takeLine("row 0");
                                   w.takeLine("row 1");
                                 });
  strips["FILE_INI"] =
      fileStrip(module,
                {"new dims=1", "A appendString \"Ann\"", "A setKeyStringAt \"name\" 0",
                 "A appendValue 7", "A saveToIni \"strip.ini\""},
                "strip.ini", "INI file", [](ByteWalker& w) {
                  w.takeLine("section line");
                  w.takeLine("element 0: key=text");
                  w.takeLine("element 1, no key: =text");
                  w.takeLine("empty line");
                });
  strips["FILE_ELEMENT"] =
      fileStrip(module,
                {"new dims=1", "A appendString \"ab\"", "A appendValue 7",
                 "A saveElementToFile 0 \"strip.bin\"", "A appendElementToFile 1 \"strip.bin\""},
                "strip.bin", "Element file", [](ByteWalker& w) {
                  w.take("element 0: a string's characters", 2);
                  w.take("its terminating zero", 1);
                  w.takeNumber("element 1: a value", 4);
                });
  return strips;
}

}  // namespace

std::map<std::string, std::string> drawPictures(const tool::ModuleLoader& module) {
  std::map<std::string, std::string> pictures = fileStrips(module);
  pictures["INDEX_LAYOUT"] = indexLayout(module);
  pictures["BOUNDARY_CHANGE"] = boundaryChange(module);
  pictures["RECORDSET"] = recordset(module);
  pictures["SELECTION"] = selections(module);
  return pictures;
}

}  // namespace quorrel::help

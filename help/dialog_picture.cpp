#include "dialog_picture.h"

#include <algorithm>
#include <sstream>
#include <stdexcept>
#include <vector>

#include "html.h"
#include "platform/resource_data.h"

namespace quorrel::help {
namespace {

// The setup dialog's resource id in the module's resource script.
constexpr uint16_t kSetupDialog = 20003;

// Dialog units to pixels for the dialog's 8-point font: a character cell of 6 × 13
// pixels, of which a dialog unit is a quarter across and an eighth down.
constexpr double kUnitX = 6.0 / 4, kUnitY = 13.0 / 8;
constexpr double kCaption = 22;  // the title bar above the client area

// Button styles in the low bits of a Button control's style.
constexpr uint32_t kButtonKind = 0xF;
constexpr uint32_t kDefaultPush = 1, kAutoCheck = 3, kGroupBox = 7, kAutoRadio = 9;

std::string num(double v) {
  std::ostringstream out;
  out << v;
  return out.str();
}

std::string rect(double x, double y, double w, double h, const std::string& cls, double r = 0) {
  return "<rect class=\"" + cls + "\" x=\"" + num(x) + "\" y=\"" + num(y) + "\" width=\"" + num(w) +
         "\" height=\"" + num(h) + "\" rx=\"" + num(r) + "\"/>";
}

std::string text(double x, double y, const std::string& content, const std::string& cls,
                 const char* anchor = "start") {
  return "<text class=\"" + cls + "\" x=\"" + num(x) + "\" y=\"" + num(y) + "\" text-anchor=\"" +
         anchor + "\">" + escapeHtml(content) + "</text>";
}

struct Box {
  double x, y, w, h;
};

Box pixels(const platform::DialogControlTemplate& c) {
  return {c.x * kUnitX, kCaption + c.y * kUnitY, c.cx * kUnitX, c.cy * kUnitY};
}

std::string control(const platform::DialogControlTemplate& c) {
  const Box b = pixels(c);
  const std::string kind = c.className;
  const double middle = b.y + b.h / 2 + 4;
  if (kind == "Edit") return rect(b.x, b.y, b.w, b.h, "edit");
  if (kind == "Static") return text(b.x, middle, c.text, "label");
  const uint32_t style = c.style & kButtonKind;
  if (style == kGroupBox) {
    return rect(b.x, b.y + 6, b.w, b.h - 6, "group", 2) +
           rect(b.x + 6, b.y, static_cast<double>(std::string(c.text).size()) * 5.8 + 6, 12,
                "dialog-bg") +
           text(b.x + 9, b.y + 10, c.text, "label");
  }
  if (style == kAutoRadio || style == kAutoCheck) {
    const std::string mark = style == kAutoRadio
                                 ? "<circle class=\"edit\" cx=\"" + num(b.x + 6) + "\" cy=\"" +
                                       num(b.y + b.h / 2) + "\" r=\"5.5\"/>"
                                 : rect(b.x + 1, b.y + b.h / 2 - 5, 10, 10, "edit");
    return mark + text(b.x + 16, middle, c.text, "label");
  }
  return rect(b.x, b.y, b.w, b.h, style == kDefaultPush ? "button default" : "button", 3) +
         text(b.x + b.w / 2, middle, c.text, "label", "middle");
}

std::string kindOf(const platform::DialogControlTemplate& c) {
  const std::string kind = c.className;
  if (kind == "Edit") return "text box";
  if (kind == "Static") return "label";
  switch (c.style & kButtonKind) {
    case kGroupBox:
      return "group";
    case kAutoRadio:
      return "option button";
    case kAutoCheck:
      return "check box";
    default:
      return "button";
  }
}

// What a text box holds: the label just before it in the template names it.
std::string nameOf(const platform::DialogResource& d, size_t index) {
  const auto& c = d.controls[index];
  if (*c.text || index == 0) return c.text;
  const auto& before = d.controls[index - 1];
  std::string name = before.text;
  if (!name.empty() && name.back() == ':') name.pop_back();
  return name;
}

}  // namespace

std::string setupDialogPicture() {
  const platform::DialogResource* dialog = nullptr;
  for (const auto& d : platform::moduleResources().dialogs) {
    if (d.id == kSetupDialog) dialog = &d;
  }
  if (!dialog) throw std::runtime_error("the module's resources have no setup dialog");
  const double width = dialog->cx * kUnitX, height = kCaption + dialog->cy * kUnitY;
  std::string svg = rect(0.5, 0.5, width, height, "dialog-frame", 4) +
                    rect(0.5, 0.5, width, kCaption, "dialog-caption", 4) +
                    text(8, 15, dialog->caption, "caption");
  std::string legend = "<ol class=\"fields dialog-fields\">";
  int number = 0;
  std::vector<size_t> fields;
  for (size_t i = 0; i < dialog->controls.size(); ++i) {
    svg += control(dialog->controls[i]);
    // Every control with an id is a field the dialog reads or a button.
    if (dialog->controls[i].id != 0xFFFF) fields.push_back(i);
  }
  // Numbered as they are read: down the dialog, and across each line.
  std::stable_sort(fields.begin(), fields.end(), [&](size_t a, size_t b) {
    const auto &ca = dialog->controls[a], &cb = dialog->controls[b];
    return ca.y / 8 != cb.y / 8 ? ca.y < cb.y : ca.x < cb.x;
  });
  for (const size_t i : fields) {
    const auto& c = dialog->controls[i];
    const Box b = pixels(c);
    // Beside an option's text; on the top right corner of a box or button.
    const bool option =
        c.className == std::string("Button") && (c.style & kButtonKind) > kDefaultPush;
    const double x =
        option ? b.x + 22 + static_cast<double>(std::string(c.text).size()) * 5.6 : b.x + b.w;
    const double y = option ? b.y + b.h / 2 : b.y;
    svg += "<circle class=\"callout\" cx=\"" + num(x) + "\" cy=\"" + num(y) + "\" r=\"6.5\"/>" +
           text(x, y + 3.5, std::to_string(++number), "callout-text", "middle");
    legend += "<li>" + escapeHtml(nameOf(*dialog, i)) + " <small>(" + kindOf(c) + ", id " +
              std::to_string(c.id) + ")</small></li>";
  }
  const std::string w = num(width + 8), h = num(height + 8);
  return "<figure class=\"picture\"><svg class=\"picture dialog\" viewBox=\"-4 -4 " + w + ' ' + h +
         "\" width=\"" + w +
         "\" role=\"img\" aria-label=\"The setup dialog\"><title>The setup "
         "dialog, laid out from the module's resource template</title>" +
         svg + "</svg>\n<figcaption>\"" + escapeHtml(dialog->caption) +
         "\" as the module's resource template lays it out (" + std::to_string(dialog->cx) + " × " +
         std::to_string(dialog->cy) +
         " dialog units, drawn at 1.5 × 1.625 pixels a unit), its fields numbered:</figcaption>" +
         legend + "</ol></figure>\n";
}

}  // namespace quorrel::help

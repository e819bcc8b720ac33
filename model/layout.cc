#include "model/layout.h"

#include <cairo-pdf.h>
#include <pango/pangocairo.h>

#include <algorithm>
#include <map>
#include <memory>

#include "host/currency.h"
#include "host/decimal.h"
#include "host/error.h"

#if defined(__SANITIZE_ADDRESS__)
// The font configuration that Pango loads through fontconfig is kept for the life of
// the process and never released: under the leak checker that is not a leak of ours.
extern "C" const char* __lsan_default_suppressions() { return "leak:libfontconfig.so\n"; }
#endif

namespace model {

namespace {

std::map<std::string, Layout>& layouts() {
  static std::map<std::string, Layout> registered;
  return registered;
}

// A4 in points; everything below is in points.
constexpr double kPageWidth = 595.28, kPageHeight = 841.89;
constexpr double kMargin = 36, kBottom = kPageHeight - 48;
constexpr double kContentWidth = kPageWidth - 2 * kMargin;
constexpr double kPad = 2.5;  // inside a table cell

enum class Font { body, bold, small, title, company };
enum class Align { left, right, center };

using Surface = std::unique_ptr<cairo_surface_t, decltype(&cairo_surface_destroy)>;
using Context = std::unique_ptr<cairo_t, decltype(&cairo_destroy)>;
struct Unref {
  void operator()(void* object) const { g_object_unref(object); }
};

const char* fontName(Font font) {
  switch (font) {
    case Font::body: return "DejaVu Sans Condensed 8";
    case Font::bold: return "DejaVu Sans Condensed Bold 8";
    case Font::small: return "DejaVu Sans 7";
    case Font::title: return "DejaVu Sans Bold 14";
    case Font::company: return "DejaVu Sans Bold 11";
  }
  return "DejaVu Sans 8";
}

std::string amountText(const std::string& text, int decimals) {
  auto amount = host::Decimal::parse(text);
  return amount ? host::frenchAmountText(*amount, decimals) : text;
}

std::string rateText(std::string text) {
  std::replace(text.begin(), text.end(), '.', ',');
  return text;
}

// One document being laid out. It is laid out twice: once to count the pages, once
// to draw them with "Page n / N".
class Painter {
 public:
  Painter(cairo_t* cr, const Layout& layout, const Impression& document, const Company& company,
          const std::function<int(const std::string&)>& decimals)
      : cr_(cr), layout_(layout), doc_(document), company_(company), decimals_(decimals) {
    text_.reset(pango_cairo_create_layout(cr_));
    // A label prints as it was typed: a word broken at the end of a line gets no hyphen.
    PangoAttrList* attributes = pango_attr_list_new();
    pango_attr_list_insert(attributes, pango_attr_insert_hyphens_new(FALSE));
    pango_layout_set_attributes(text_.get(), attributes);
    pango_attr_list_unref(attributes);
  }

  // Lays the document out; draws only when `pages` (the count of the first pass) is given.
  int run(int pages) {
    draw_ = pages > 0;
    row_ = 0;
    pages_ = pages;
    page_ = 0;
    if (layout_.form) {
      bool any = false;
      for (std::size_t i = 0; i < doc_.blocks.size(); ++i) {
        if (doc_.blocks[i].kind != "fiche") continue;
        std::size_t end = i + 1;
        while (end < doc_.blocks.size() && doc_.blocks[end].kind != "fiche") ++end;
        form(i, end);
        any = true;
      }
      if (!any) startPage();
    } else {
      list();
    }
    finishPage();
    return page_;
  }

 private:
  // ---- text
  // Lays `text` out in a box `width` wide; returns its height. Draws it at (x, y) when
  // drawing.
  double text(const std::string& text, double x, double y, double width, Font font = Font::body,
              Align align = Align::left, bool wrap = true) {
    PangoLayout* l = text_.get();
    pango_layout_set_font_description(l, fontOf(font));
    pango_layout_set_width(l, wrap ? static_cast<int>(width * PANGO_SCALE) : -1);
    pango_layout_set_wrap(l, PANGO_WRAP_WORD_CHAR);
    pango_layout_set_alignment(l, align == Align::right    ? PANGO_ALIGN_RIGHT
                                  : align == Align::center ? PANGO_ALIGN_CENTER
                                                           : PANGO_ALIGN_LEFT);
    pango_layout_set_text(l, text.c_str(), -1);
    int w = 0, h = 0;
    pango_layout_get_size(l, &w, &h);
    if (draw_) {
      cairo_move_to(cr_, x, y);
      pango_cairo_show_layout(cr_, l);
    }
    return static_cast<double>(h) / PANGO_SCALE;
  }

  const PangoFontDescription* fontOf(Font font) {
    auto& slot = fonts_[static_cast<int>(font)];
    if (!slot) slot.reset(pango_font_description_from_string(fontName(font)));
    return slot.get();
  }

  void rule(double y, double width = 0.5) {
    if (!draw_) return;
    cairo_set_line_width(cr_, width);
    cairo_move_to(cr_, kMargin, y);
    cairo_line_to(cr_, kMargin + kContentWidth, y);
    cairo_stroke(cr_);
  }

  // ---- pages
  void finishPage() {
    if (page_ == 0) return;
    if (draw_) {
      text("Page " + std::to_string(page_) + " / " + std::to_string(pages_), kMargin, kBottom + 14, kContentWidth,
           Font::small, Align::center);
      cairo_show_page(cr_);
    }
  }

  // A new page with the company and the title.
  void startPage() {
    finishPage();
    ++page_;
    double top = kMargin;
    double y = top + text(company_.name, kMargin, top, kContentWidth * 0.55, Font::company);
    for (const std::string& line : company_.address)
      if (!line.empty()) y += text(line, kMargin, y, kContentWidth * 0.55);
    if (!company_.siren.empty()) y += text("SIREN " + company_.siren, kMargin, y, kContentWidth * 0.55);
    double titleBottom = top + text(layout_.title, kMargin + kContentWidth * 0.55, top, kContentWidth * 0.45,
                                    Font::title, Align::right);
    y_ = std::max(y, titleBottom) + 6;
    rule(y_, 1);
    y_ += 8;
  }

  void needs(double height) {
    if (y_ + height > kBottom) startPage();
  }

  // ---- labelled values
  double labelled(const std::vector<Zone>& zones, const Values& values, double x, double width) {
    double y = y_;
    const double label = 70;
    for (const Zone& z : zones) {
      std::string value = shown(z, values, values);
      if (value.empty()) continue;  // a criterion not given, a date not set
      double h = std::max(text(z.title, x, y, label, Font::bold), text(value, x + label, y, width - label));
      y += h + 1;
    }
    return y;
  }

  std::string shown(const Zone& zone, const Values& values, const Values& record) {
    const std::string& raw = valueOf(values, zone.name);
    switch (zone.format) {
      case Format::amount: return amountText(raw, decimalsOf(record));
      case Format::rate: return rateText(raw);
      default: return raw;
    }
  }

  int decimalsOf(const Values& record) { return decimals_(valueOf(record, layout_.currency)); }

  // ---- tables
  // The width of `text` on one line.
  double naturalWidth(const std::string& text, Font font) {
    bool drawing = draw_;
    draw_ = false;
    this->text(text, 0, 0, 0, font, Align::left, false);
    draw_ = drawing;
    int w = 0, h = 0;
    pango_layout_get_size(text_.get(), &w, &h);
    return static_cast<double>(w) / PANGO_SCALE;
  }

  // Columns share the page by their widths, each at least as wide as its heading's
  // longest word and, for a date, as a date: a heading or a date is never broken.
  const std::vector<double>& widths() {
    if (!widths_.empty()) return widths_;
    std::vector<double> least;
    for (const Zone& z : layout_.columns) {
      double w = 0;
      std::size_t from = 0;
      for (std::size_t to; from <= z.title.size(); from = to + 1) {
        to = std::min(z.title.find(' ', from), z.title.size());
        w = std::max(w, naturalWidth(z.title.substr(from, to - from), Font::bold));
      }
      if (z.format == Format::date) w = std::max(w, naturalWidth("00/00/0000", Font::body));
      least.push_back(w + 2 * kPad + 1);
    }
    std::vector<bool> fixed(least.size(), false);
    widths_.assign(least.size(), 0);
    for (bool changed = true; changed;) {
      changed = false;
      double room = kContentWidth, shares = 0;
      for (std::size_t c = 0; c < least.size(); ++c) {
        if (fixed[c]) room -= least[c];
        else shares += layout_.columns[c].width;
      }
      for (std::size_t c = 0; c < least.size(); ++c) {
        widths_[c] = fixed[c] ? least[c] : room * layout_.columns[c].width / shares;
        if (!fixed[c] && widths_[c] < least[c]) fixed[c] = changed = true;
      }
    }
    return widths_;
  }

  static Align alignOf(Format f) { return f == Format::amount || f == Format::rate ? Align::right : Align::left; }

  double row(const std::vector<std::string>& cells, Font font, bool measureOnly) {
    const std::vector<double>& w = widths();
    bool drawing = draw_;
    if (measureOnly) draw_ = false;
    double x = kMargin, h = 0;
    for (std::size_t c = 0; c < cells.size(); ++c) {
      Format format = layout_.columns[c].format;
      h = std::max(h, text(cells[c], x + kPad, y_ + kPad, w[c] - 2 * kPad, font, alignOf(format), format != Format::date));
      x += w[c];
    }
    draw_ = drawing;
    return h + 2 * kPad;
  }

  void headings() {
    std::vector<std::string> titles;
    for (const Zone& z : layout_.columns) titles.push_back(z.title);
    double h = row(titles, Font::bold, true);
    needs(h + 20);
    row(titles, Font::bold, false);
    y_ += h;
    rule(y_);
  }

  // A row of the table; a new page repeats the headings first. Rows are measured in
  // the first pass; the second reuses their heights.
  void tableRow(const std::vector<std::string>& cells, Font font = Font::body) {
    double h;
    if (draw_) {
      h = heights_[row_++];
    } else {
      h = row(cells, font, true);
      heights_.push_back(h);
    }
    if (y_ + h > kBottom) {
      startPage();
      headings();
    }
    if (draw_) row(cells, font, false);
    y_ += h;
  }

  std::vector<std::string> cellsOf(const Values& values, const Values& record) {
    std::vector<std::string> cells;
    for (const Zone& z : layout_.columns) cells.push_back(shown(z, values, record));
    return cells;
  }

  // ---- a form: the record's blocks are [first, end)
  void form(std::size_t first, std::size_t end) {
    const Values& record = doc_.blocks[first].values;
    startPage();
    double top = y_;
    double left = labelled(layout_.heading, record, kMargin, kContentWidth * 0.5);
    double right = top;
    if (!layout_.address.empty()) {
      double x = kMargin + kContentWidth * 0.58, w = kContentWidth * 0.42;
      bool firstLine = true;
      for (const std::string& name : layout_.address) {
        const std::string& line = valueOf(record, name);
        if (line.find_first_not_of(' ') == std::string::npos) continue;
        right += text(line, x, right, w, firstLine ? Font::bold : Font::body);
        firstLine = false;
      }
    }
    y_ = std::max(left, right) + 10;
    headings();
    std::map<std::string, std::pair<host::Decimal, host::Decimal>> byRate;
    std::map<std::string, std::string> rateShown;
    for (std::size_t i = first + 1; i < end; ++i) {
      const Values& line = doc_.blocks[i].values;
      tableRow(cellsOf(line, record));
      if (layout_.vat) {
        std::string rate = valueOf(line, layout_.vat->rate);
        auto& sums = byRate[rate];
        sums.first += host::Decimal::parse(valueOf(line, layout_.vat->base)).value_or(host::Decimal());
        sums.second += host::Decimal::parse(valueOf(line, layout_.vat->vat)).value_or(host::Decimal());
      }
    }
    rule(y_);
    y_ += 8;
    // The VAT breakdown at the left and the totals at the right, kept on one page.
    std::size_t summary = std::max(layout_.vat && !byRate.empty() ? byRate.size() + 1 : 0, layout_.totals.size());
    needs(13.0 * static_cast<double>(summary));
    int decimals = decimalsOf(record);
    double bottom = y_;
    if (layout_.vat && !byRate.empty()) {
      double x = kMargin, w = kContentWidth * 0.5;
      double y = y_ + text("Taux de TVA", x, y_, w / 3, Font::bold) + 1;
      text("Base HT", x + w / 3, y_, w / 3, Font::bold, Align::right);
      text("TVA", x + 2 * w / 3, y_, w / 3, Font::bold, Align::right);
      std::vector<std::pair<host::Decimal, std::string>> rates;
      for (const auto& entry : byRate)
        rates.push_back({host::Decimal::parse(entry.first).value_or(host::Decimal()), entry.first});
      std::sort(rates.begin(), rates.end(), [](const auto& a, const auto& b) { return a.first < b.first; });
      for (const auto& rate : rates) {
        const auto& sums = byRate[rate.second];
        text(rateText(rate.second) + " %", x, y, w / 3);
        text(host::frenchAmountText(sums.first, decimals), x + w / 3, y, w / 3, Font::body, Align::right);
        y += text(host::frenchAmountText(sums.second, decimals), x + 2 * w / 3, y, w / 3, Font::body, Align::right) + 1;
      }
      bottom = y;
    }
    double x = kMargin + kContentWidth * 0.6, w = kContentWidth * 0.4, y = y_;
    for (const Zone& z : layout_.totals) {
      text(z.title, x, y, w * 0.5, Font::bold);
      y += text(shown(z, record, record), x + w * 0.5, y, w * 0.5, Font::bold, Align::right) + 1;
    }
    y_ = std::max(y, bottom);
  }

  // ---- a list
  void list() {
    startPage();
    y_ = labelled(layout_.heading, doc_.heading, kMargin, kContentWidth) + 8;
    headings();
    // Totals per currency: amounts of different currencies are never added up.
    std::map<std::string, std::vector<host::Decimal>> sums;
    std::vector<std::string> order;
    for (const Block& b : doc_.blocks) {
      tableRow(cellsOf(b.values, b.values));
      std::string currency = valueOf(b.values, layout_.currency);
      auto [at, added] = sums.try_emplace(currency, layout_.columns.size());
      if (added) order.push_back(currency);
      for (std::size_t c = 0; c < layout_.columns.size(); ++c)
        if (layout_.columns[c].total)
          at->second[c] += host::Decimal::parse(valueOf(b.values, layout_.columns[c].name)).value_or(host::Decimal());
    }
    rule(y_);
    bool anyTotal = std::any_of(layout_.columns.begin(), layout_.columns.end(), [](const Zone& z) { return z.total; });
    if (!anyTotal) return;
    for (const std::string& currency : order) {
      std::vector<std::string> cells(layout_.columns.size());
      cells[0] = currency.empty() ? "Total" : "Total " + currency;
      for (std::size_t c = 0; c < cells.size(); ++c)
        if (layout_.columns[c].total) cells[c] = host::frenchAmountText(sums[currency][c], decimals_(currency));
      tableRow(cells, Font::bold);
    }
  }

  cairo_t* cr_;
  const Layout& layout_;
  const Impression& doc_;
  const Company& company_;
  const std::function<int(const std::string&)>& decimals_;
  std::unique_ptr<PangoLayout, Unref> text_;
  std::vector<double> widths_;
  std::vector<double> heights_;  // of the table rows, measured in the first pass
  std::size_t row_ = 0;
  std::unique_ptr<PangoFontDescription, decltype(&pango_font_description_free)> fonts_[5] = {
      {nullptr, pango_font_description_free}, {nullptr, pango_font_description_free},
      {nullptr, pango_font_description_free}, {nullptr, pango_font_description_free},
      {nullptr, pango_font_description_free}};
  bool draw_ = false;
  int pages_ = 0, page_ = 0;
  double y_ = 0;
};

}  // namespace

const std::string& valueOf(const Values& values, const std::string& name) {
  static const std::string none;
  for (const auto& [n, v] : values)
    if (n == name) return v;
  return none;
}

void registerLayout(const std::string& module, Layout layout) { layouts()[module] = std::move(layout); }

const Layout* layoutFor(const std::string& module) {
  auto it = layouts().find(module);
  return it == layouts().end() ? nullptr : &it->second;
}

void writePdf(const Layout& layout, const Impression& document, const Company& company,
              const std::function<int(const std::string&)>& decimals, const std::string& path) {
  Surface surface(cairo_pdf_surface_create(path.c_str(), kPageWidth, kPageHeight), cairo_surface_destroy);
  if (cairo_surface_status(surface.get()) != CAIRO_STATUS_SUCCESS)
    throw host::HostError("impression impossible dans « " + path + " » : " +
                          cairo_status_to_string(cairo_surface_status(surface.get())));
  cairo_pdf_surface_set_metadata(surface.get(), CAIRO_PDF_METADATA_TITLE, layout.title.c_str());
  {
    Context cr(cairo_create(surface.get()), cairo_destroy);
    cairo_set_source_rgb(cr.get(), 0, 0, 0);
    Painter painter(cr.get(), layout, document, company, decimals);
    int pages = painter.run(0);
    painter.run(pages);
  }
  cairo_surface_finish(surface.get());
  if (cairo_surface_status(surface.get()) != CAIRO_STATUS_SUCCESS)
    throw host::HostError("impression impossible dans « " + path + " » : " +
                          cairo_status_to_string(cairo_surface_status(surface.get())));
}

}  // namespace model

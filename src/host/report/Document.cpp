#include "host/report/Document.h"

#include <cairo-pdf.h>
#include <pango/pangocairo.h>

#include <algorithm>
#include <cmath>
#include <map>
#include <string>
#include <unordered_map>

#include "host/Texte.h"

// Fontconfig keeps its font configuration for the life of the process (Pango's font map holds
// it and is never released); the leak checker of sanitizer builds must not count it as ours.
#if defined(__SANITIZE_ADDRESS__)
extern "C" const char* __lsan_default_suppressions() {
  return "leak:libfontconfig\n";
}
#endif

namespace quarvo::host::report {

namespace {

constexpr double kMm = 72.0 / 25.4;
constexpr double kMarge = 12 * kMm;
constexpr double kPadX = 1.2 * kMm;
constexpr double kPadY = 0.8 * kMm;
constexpr const char* kPolice = "DejaVu Sans";
constexpr uint32_t kGrisTetes = 0xE4E8EE;
constexpr uint32_t kFilet = 0x7A8594;

// One drawing of a page, its text kept in the document's text arena (a long report holds
// hundreds of thousands of them).
struct Item {
  enum Kind : uint8_t { Texte, Rect, Filet } kind = Texte;
  bool gras = false;
  bool italique = false;
  Alignement alignement = Alignement::Gauche;
  float x = 0, y = 0, w = 0, h = 0;
  float taille = 8;
  uint32_t couleur = 0;
  uint32_t debut = 0;
  uint32_t longueur = 0;
};

struct Page {
  std::vector<Item> items;
};

void couleur(cairo_t* cr, uint32_t rgb) {
  cairo_set_source_rgb(cr, ((rgb >> 16) & 0xFF) / 255.0, ((rgb >> 8) & 0xFF) / 255.0,
                       (rgb & 0xFF) / 255.0);
}

// The Pango layouts of one drawing context, kept by text and style: a report prints the same
// piece numbers, designations, dates and amounts again and again, and a text laid out once is
// drawn from its layout every other time. Fonts are cached by style.
class Mise {
 public:
  // Layouts kept at most; past it, the cache starts afresh.
  static constexpr size_t kRetenues = 4096;

  explicit Mise(PangoContext* ctx) : ctx_(ctx) {}
  ~Mise() {
    vider();
    for (auto& [key, font] : fonts_) pango_font_description_free(font);
  }
  Mise(const Mise&) = delete;
  Mise& operator=(const Mise&) = delete;

  // The layout of `texte` in `largeur` points (wrapped when > 0), 1 unit = 1 point. It stays
  // valid until the next call.
  PangoLayout* de(const char* texte, int longueur, double taille, bool gras, bool italique,
                  double largeur, Alignement a) {
    int key = static_cast<int>(taille * 10) * 4 + (gras ? 2 : 0) + (italique ? 1 : 0);
    cle_.assign(texte, static_cast<size_t>(longueur));
    cle_ += '\0';
    cle_ += std::to_string(key) + '|' + std::to_string(std::lround(largeur * 1000)) + '|' +
            std::to_string(static_cast<int>(a));
    auto retenue = layouts_.find(cle_);
    if (retenue != layouts_.end()) return retenue->second;
    if (layouts_.size() >= kRetenues) vider();
    PangoLayout* layout = pango_layout_new(ctx_);
    layouts_.emplace(cle_, layout);
    auto it = fonts_.find(key);
    if (it == fonts_.end()) {
      PangoFontDescription* font = pango_font_description_from_string(kPolice);
      pango_font_description_set_size(font, static_cast<int>(taille * PANGO_SCALE));
      pango_font_description_set_weight(font, gras ? PANGO_WEIGHT_BOLD : PANGO_WEIGHT_NORMAL);
      pango_font_description_set_style(font, italique ? PANGO_STYLE_ITALIC : PANGO_STYLE_NORMAL);
      it = fonts_.emplace(key, font).first;
    }
    pango_layout_set_font_description(layout, it->second);
    pango_layout_set_width(layout, largeur > 0 ? static_cast<int>(largeur * PANGO_SCALE) : -1);
    pango_layout_set_wrap(layout, PANGO_WRAP_WORD_CHAR);
    pango_layout_set_alignment(layout, a == Alignement::Droite   ? PANGO_ALIGN_RIGHT
                                       : a == Alignement::Centre ? PANGO_ALIGN_CENTER
                                                                 : PANGO_ALIGN_LEFT);
    pango_layout_set_text(layout, texte, longueur);
    return layout;
  }

 private:
  void vider() {
    for (auto& [cle, layout] : layouts_) g_object_unref(layout);
    layouts_.clear();
  }

  PangoContext* ctx_;
  std::string cle_;
  std::unordered_map<std::string, PangoLayout*> layouts_;
  std::map<int, PangoFontDescription*> fonts_;
};

PangoContext* contexte(cairo_t* cr) {
  PangoContext* ctx = pango_cairo_create_context(cr);
  pango_cairo_context_set_resolution(ctx, 72);
  cairo_font_options_t* options = cairo_font_options_create();
  cairo_font_options_set_hint_metrics(options, CAIRO_HINT_METRICS_OFF);
  cairo_font_options_set_hint_style(options, CAIRO_HINT_STYLE_NONE);
  pango_cairo_context_set_font_options(ctx, options);
  cairo_font_options_destroy(options);
  return ctx;
}

}  // namespace

struct Document::Impl {
  double largeurPage;
  double hauteurPage;
  std::vector<Page> pages;
  double y = 0;
  double debutCorps = 0;
  std::string titre, note, sousTitre, pied;
  std::vector<Colonne> colonnes;
  std::string arena;  // the texts of every item
  cairo_surface_t* mesureSurface = nullptr;
  cairo_t* mesureCr = nullptr;
  PangoContext* mesureCtx = nullptr;
  std::unique_ptr<Mise> mesure;
  std::map<int, double> hauteurLigne;  // one-line height by style

  explicit Impl(bool paysage)
      : largeurPage(paysage ? 841.89 : 595.28), hauteurPage(paysage ? 595.28 : 841.89) {
    // Text is measured on a PDF surface that writes nowhere, so metrics match the output.
    mesureSurface = cairo_pdf_surface_create_for_stream(nullptr, nullptr, largeurPage, hauteurPage);
    mesureCr = cairo_create(mesureSurface);
    mesureCtx = contexte(mesureCr);
    mesure = std::make_unique<Mise>(mesureCtx);
  }
  ~Impl() {
    mesure.reset();
    g_object_unref(mesureCtx);
    cairo_destroy(mesureCr);
    cairo_surface_destroy(mesureSurface);
  }

  double largeurUtile() const { return largeurPage - 2 * kMarge; }
  double bas() const { return hauteurPage - kMarge - 6 * kMm; }

  double mesurer(const std::string& texte, double taille, bool gras, bool italique,
                 double largeur) {
    PangoLayout* layout = mesure->de(texte.data(), static_cast<int>(texte.size()), taille, gras,
                                     italique, largeur, Alignement::Gauche);
    int w = 0;
    int h = 0;
    pango_layout_get_size(layout, &w, &h);
    return static_cast<double>(h) / PANGO_SCALE;
  }

  double hauteur(const std::string& texte, double taille, bool gras, bool italique,
                 double largeur) {
    // A text too short to reach the cell's width even in its widest glyphs takes one line:
    // only the others go through the text layout.
    size_t chars = nombreCaracteres(texte);
    bool saut = texte.find('\n') != std::string::npos;
    if (!saut && static_cast<double>(chars) * taille * 1.2 <= largeur) {
      int key = static_cast<int>(taille * 10) * 4 + (gras ? 2 : 0) + (italique ? 1 : 0);
      auto it = hauteurLigne.find(key);
      if (it == hauteurLigne.end()) {
        it = hauteurLigne.emplace(key, mesurer("Ag", taille, gras, italique, 0)).first;
      }
      return it->second;
    }
    return mesurer(texte, taille, gras, italique, largeur);
  }

  void texte(double x, double yy, double w, const std::string& t, double taille, bool gras,
             bool italique, Alignement a, uint32_t c = 0) {
    Item i;
    i.kind = Item::Texte;
    i.x = static_cast<float>(x);
    i.y = static_cast<float>(yy);
    i.w = static_cast<float>(w);
    i.debut = static_cast<uint32_t>(arena.size());
    i.longueur = static_cast<uint32_t>(t.size());
    arena += t;
    i.taille = static_cast<float>(taille);
    i.gras = gras;
    i.italique = italique;
    i.alignement = a;
    i.couleur = c;
    pages.back().items.push_back(std::move(i));
  }
  void rect(double x, double yy, double w, double h, uint32_t c) {
    Item i;
    i.kind = Item::Rect;
    i.x = static_cast<float>(x);
    i.y = static_cast<float>(yy);
    i.w = static_cast<float>(w);
    i.h = static_cast<float>(h);
    i.couleur = c;
    pages.back().items.push_back(std::move(i));
  }
  void filet(double x, double yy, double w, uint32_t c = kFilet) {
    Item i;
    i.kind = Item::Filet;
    i.x = static_cast<float>(x);
    i.y = static_cast<float>(yy);
    i.w = static_cast<float>(w);
    i.couleur = c;
    pages.back().items.push_back(std::move(i));
  }

  void tetesColonnes() {
    if (colonnes.empty()) return;
    double h = 0;
    double x = kMarge;
    for (const auto& c : colonnes) {
      h = std::max(h, hauteur(c.titre, 7.5, true, false, c.largeur * kMm - 2 * kPadX));
    }
    h += 2 * kPadY;
    rect(kMarge, y, largeurUtile(), h, kGrisTetes);
    for (const auto& c : colonnes) {
      texte(x + kPadX, y + kPadY, c.largeur * kMm - 2 * kPadX, c.titre, 7.5, true, false,
            c.alignement);
      x += c.largeur * kMm;
    }
    filet(kMarge, y + h, largeurUtile());
    y += h + 0.8 * kMm;
  }

  void ouvrirPage() {
    pages.emplace_back();
    y = kMarge;
    double noteW = 90 * kMm;
    texte(kMarge, y, largeurUtile() - noteW, titre, 13, true, false, Alignement::Gauche, 0x1F3A5F);
    texte(largeurPage - kMarge - noteW, y + 3, noteW, note, 8.5, false, false, Alignement::Droite,
          0x333333);
    y += hauteur(titre, 13, true, false, largeurUtile() - noteW) + 1 * kMm;
    if (!sousTitre.empty()) {
      texte(kMarge, y, largeurUtile(), sousTitre, 8, false, true, Alignement::Gauche, 0x333333);
      y += hauteur(sousTitre, 8, false, true, largeurUtile());
    }
    y += 1.5 * kMm;
    filet(kMarge, y, largeurUtile(), 0x1F3A5F);
    y += 2.5 * kMm;
    tetesColonnes();
    debutCorps = y;
  }

  void place(double h) {
    if (pages.empty()) ouvrirPage();
    if (y + h > bas() && y > debutCorps) ouvrirPage();
  }
};

Document::Document(bool paysage) : impl_(std::make_unique<Impl>(paysage)) {}
Document::~Document() = default;

void Document::entete(std::string titre, std::string note, std::string sousTitre) {
  impl_->titre = std::move(titre);
  impl_->note = std::move(note);
  impl_->sousTitre = std::move(sousTitre);
}

void Document::pied(std::string texte) {
  impl_->pied = std::move(texte);
}

void Document::colonnes(std::vector<Colonne> colonnes) {
  impl_->colonnes = std::move(colonnes);
  if (!impl_->pages.empty() && !pageVierge()) return;  // heads come with the next page
  if (!impl_->pages.empty()) {
    impl_->pages.pop_back();  // the empty page is opened again with the new heads
  }
  impl_->ouvrirPage();
}

bool Document::pageVierge() const {
  return impl_->pages.empty() || impl_->y <= impl_->debutCorps;
}

void Document::nouvellePage() {
  if (pageVierge()) {
    if (impl_->pages.empty()) impl_->ouvrirPage();
    return;
  }
  impl_->ouvrirPage();
}

void Document::espace(double mm) {
  if (!pageVierge()) impl_->y += mm * kMm;
}

void Document::ligne(const std::vector<Cellule>& cellules, const Style& style) {
  Impl& d = *impl_;
  if (d.pages.empty()) d.ouvrirPage();
  std::vector<double> xs;
  std::vector<double> ws;
  std::vector<Alignement> as;
  double x = kMarge;
  size_t col = 0;
  for (const auto& c : cellules) {
    double w = 0;
    Alignement a = col < d.colonnes.size() ? d.colonnes[col].alignement : Alignement::Gauche;
    for (int k = 0; k < std::max(1, c.colonnes) && col < d.colonnes.size(); ++k, ++col) {
      w += d.colonnes[col].largeur * kMm;
    }
    if (d.colonnes.empty()) w = d.largeurUtile();
    xs.push_back(x);
    ws.push_back(w);
    as.push_back(c.colonnes > 1 ? Alignement::Gauche : a);
    x += w;
  }
  double h = 0;
  for (size_t i = 0; i < cellules.size(); ++i) {
    double retrait = i == 0 ? style.retrait * kMm : 0;
    h = std::max(h, d.hauteur(cellules[i].texte, style.taille, style.gras, style.italique,
                              ws[i] - 2 * kPadX - retrait));
  }
  h += 2 * kPadY;
  double avant = style.avant * kMm;
  d.place(h + avant);
  if (d.y > d.debutCorps) d.y += avant;
  double total = x - kMarge;
  if (style.fond != Style::kSansFond) d.rect(kMarge, d.y, total, h, style.fond);
  if (style.filetHaut) d.filet(kMarge, d.y, total);
  for (size_t i = 0; i < cellules.size(); ++i) {
    if (cellules[i].texte.empty()) continue;
    double retrait = i == 0 ? style.retrait * kMm : 0;
    d.texte(xs[i] + kPadX + retrait, d.y + kPadY, ws[i] - 2 * kPadX - retrait, cellules[i].texte,
            style.taille, style.gras, style.italique, as[i], style.couleur);
  }
  if (style.filetBas) d.filet(kMarge, d.y + h, total);
  d.y += h;
}

void Document::bandeau(const std::string& texte, const Style& style, double suite) {
  Impl& d = *impl_;
  if (d.pages.empty()) d.ouvrirPage();
  double w = d.largeurUtile() - 2 * kPadX - style.retrait * kMm;
  double h = d.hauteur(texte, style.taille, style.gras, style.italique, w) + 2 * kPadY;
  double avant = style.avant * kMm;
  d.place(h + avant + suite * kMm);
  if (d.y > d.debutCorps) d.y += avant;
  if (style.fond != Style::kSansFond) d.rect(kMarge, d.y, d.largeurUtile(), h, style.fond);
  if (style.filetHaut) d.filet(kMarge, d.y, d.largeurUtile());
  d.texte(kMarge + kPadX + style.retrait * kMm, d.y + kPadY, w, texte, style.taille, style.gras,
          style.italique, Alignement::Gauche, style.couleur);
  if (style.filetBas) d.filet(kMarge, d.y + h, d.largeurUtile());
  d.y += h;
}

int Document::pages() const {
  return static_cast<int>(impl_->pages.size());
}

bool Document::ecrire(const std::filesystem::path& file, std::string& error) {
  Impl& d = *impl_;
  if (d.pages.empty()) d.ouvrirPage();
  std::error_code ec;
  if (file.has_parent_path()) std::filesystem::create_directories(file.parent_path(), ec);
  std::filesystem::path tmp = file;
  tmp += ".part";
  cairo_surface_t* surface = cairo_pdf_surface_create(tmp.c_str(), d.largeurPage, d.hauteurPage);
  if (cairo_surface_status(surface) != CAIRO_STATUS_SUCCESS) {
    error = "impossible de créer " + file.string();
    cairo_surface_destroy(surface);
    return false;
  }
  cairo_pdf_surface_set_metadata(surface, CAIRO_PDF_METADATA_TITLE, d.titre.c_str());
  cairo_pdf_surface_set_metadata(surface, CAIRO_PDF_METADATA_CREATOR, "QUARVO");
  cairo_t* cr = cairo_create(surface);
  PangoContext* ctx = contexte(cr);
  {
    Mise mise(ctx);
    auto ecrireTexte = [&](const char* t, size_t len, double x, double y, double w, double taille,
                           bool gras, bool italique, Alignement a, uint32_t c) {
      PangoLayout* layout = mise.de(t, static_cast<int>(len), taille, gras, italique, w, a);
      couleur(cr, c);
      cairo_move_to(cr, x, y);
      pango_cairo_show_layout(cr, layout);
    };
    int n = static_cast<int>(d.pages.size());
    for (int p = 0; p < n; ++p) {
      for (const auto& i : d.pages[static_cast<size_t>(p)].items) {
        switch (i.kind) {
          case Item::Rect:
            couleur(cr, i.couleur);
            cairo_rectangle(cr, i.x, i.y, i.w, i.h);
            cairo_fill(cr);
            break;
          case Item::Filet:
            couleur(cr, i.couleur);
            cairo_set_line_width(cr, 0.5);
            cairo_move_to(cr, i.x, i.y);
            cairo_line_to(cr, i.x + i.w, i.y);
            cairo_stroke(cr);
            break;
          case Item::Texte:
            ecrireTexte(d.arena.data() + i.debut, i.longueur, i.x, i.y, i.w, i.taille, i.gras,
                        i.italique, i.alignement, i.couleur);
            break;
        }
      }
      // Footer: a rule, the left text, the page number over the total.
      double piedY = d.hauteurPage - kMarge - 3 * kMm;
      couleur(cr, kFilet);
      cairo_set_line_width(cr, 0.5);
      cairo_move_to(cr, kMarge, piedY - 1 * kMm);
      cairo_line_to(cr, kMarge + d.largeurUtile(), piedY - 1 * kMm);
      cairo_stroke(cr);
      double moitie = d.largeurUtile() / 2;
      ecrireTexte(d.pied.data(), d.pied.size(), kMarge, piedY, moitie, 7, false, false,
                  Alignement::Gauche, 0x555555);
      std::string numero = "Page " + std::to_string(p + 1) + " / " + std::to_string(n);
      ecrireTexte(numero.data(), numero.size(), kMarge + moitie, piedY, moitie, 7, false, false,
                  Alignement::Droite, 0x555555);
      cairo_show_page(cr);
    }
  }
  g_object_unref(ctx);
  cairo_destroy(cr);
  cairo_surface_finish(surface);
  cairo_status_t status = cairo_surface_status(surface);
  cairo_surface_destroy(surface);
  if (status != CAIRO_STATUS_SUCCESS) {
    error = "impossible d'écrire " + file.string() + " : " + cairo_status_to_string(status);
    std::filesystem::remove(tmp, ec);
    return false;
  }
  std::filesystem::rename(tmp, file, ec);
  if (ec) {
    error = "impossible d'écrire " + file.string() + " : " + ec.message();
    std::filesystem::remove(tmp, ec);
    return false;
  }
  return true;
}

}  // namespace quarvo::host::report

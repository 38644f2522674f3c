// A printed document of the report engine: pages composed top to bottom, then written as PDF.
//
// Every page carries the same heading (a title line, a right-hand note and a wrapped second
// line such as the selection summary) and a footer (a left text and "Page n / N"); a table's
// column heads are repeated at the top of each page while that table runs. Rows are cells laid
// over the columns (a cell may span several); long texts wrap inside their cell, so a row grows
// rather than losing text. Text goes through Pango with an embedded Unicode font, so accents
// and any other characters print as written. Composition measures text as it goes; the pages
// are kept as a list of drawing items and written in one pass when the total is known.
//
// Not thread-safe; owned by the one print run that composes it.
#pragma once

#include <cstdint>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

namespace quarvo::host::report {

enum class Alignement { Gauche, Centre, Droite };

struct Colonne {
  std::string titre;
  double largeur = 20;  // millimetres
  Alignement alignement = Alignement::Gauche;
};

struct Style {
  static constexpr uint32_t kSansFond = 0xFFFFFFFF;
  bool gras = false;
  bool italique = false;
  double taille = 8;          // points
  uint32_t fond = kSansFond;  // 0xRRGGBB
  uint32_t couleur = 0x000000;
  bool filetHaut = false;
  bool filetBas = false;
  double retrait = 0;  // millimetres, first cell only
  double avant = 0;    // space before the row, millimetres
};

struct Cellule {
  std::string texte;
  int colonnes = 1;  // columns the cell spans
};

class Document {
 public:
  explicit Document(bool paysage);
  ~Document();
  Document(const Document&) = delete;
  Document& operator=(const Document&) = delete;

  // Heading and footer of the pages composed from now on.
  void entete(std::string titre, std::string note, std::string sousTitre);
  void pied(std::string texte);
  // The columns of the table that follows (empty: none); their heads open each page.
  void colonnes(std::vector<Colonne> colonnes);
  // One row over the columns.
  void ligne(const std::vector<Cellule>& cellules, const Style& style);
  // One text over the whole width; kept with at least `suite` millimetres of what follows.
  void bandeau(const std::string& texte, const Style& style, double suite = 14);
  void espace(double mm);
  // Starts a new page unless the current one holds nothing but its heading.
  void nouvellePage();
  bool pageVierge() const;
  int pages() const;
  // Writes the PDF; false with the reason in `error`.
  bool ecrire(const std::filesystem::path& file, std::string& error);

 private:
  struct Impl;
  std::unique_ptr<Impl> impl_;
};

}  // namespace quarvo::host::report

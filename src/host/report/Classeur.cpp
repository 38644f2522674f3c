#include "host/report/Classeur.h"

#include <xlsxwriter.h>

#include <algorithm>
#include <cctype>
#include <fstream>

#include "host/Texte.h"
#include "host/TexteTabule.h"

namespace quarvo::host::report {

namespace fs = std::filesystem;

namespace {

fs::path temporaire(const fs::path& file) {
  fs::path tmp = file;
  tmp += ".part";
  return tmp;
}

void preparerDossier(const fs::path& file) {
  std::error_code ec;
  if (file.has_parent_path()) fs::create_directories(file.parent_path(), ec);
}

bool mettreEnPlace(const fs::path& tmp, const fs::path& file, std::string& error) {
  std::error_code ec;
  fs::rename(tmp, file, ec);
  if (ec) {
    error = "impossible d'écrire " + file.string() + " : " + ec.message();
    fs::remove(tmp, ec);
    return false;
  }
  return true;
}

// Text exchange file: one line per row, cells joined by the separator. A cell never carries
// the separator or a line break, which would shift the columns of the reader.
class ClasseurTexte : public Classeur {
 public:
  ClasseurTexte(fs::path file, FormatEchange format, bool append)
      : file_(std::move(file)), tmp_(temporaire(file_)), format_(std::move(format)) {
    preparerDossier(file_);
    std::error_code ec;
    if (append && fs::exists(file_, ec))
      fs::copy_file(file_, tmp_, fs::copy_options::overwrite_existing, ec);
    out_.open(tmp_, append ? std::ios::binary | std::ios::app : std::ios::binary | std::ios::trunc);
    appended_ = append && fs::file_size(tmp_, ec) > 0;
  }
  void entete(const std::vector<std::string>& names) override {
    if (appended_) return;  // the existing file has its header already
    std::vector<Valeur> cells;
    for (const auto& n : names) cells.push_back(Valeur::chaine(n));
    std::vector<const Valeur*> refs;
    for (const auto& c : cells) refs.push_back(&c);
    ligne(refs);
  }
  void ligne(const std::vector<const Valeur*>& cells) override {
    // A one-character separator follows the exchange format's quoting rule; a longer one is
    // taken as the column boundary and tabs decide the quoting.
    char sep = format_.separateur.size() == 1 ? format_.separateur[0] : '\t';
    std::string line;
    for (size_t i = 0; i < cells.size(); ++i) {
      if (i > 0) line += format_.separateur;
      line += celluleTsv(texteCellule(*cells[i], format_), sep);
    }
    out_ << line << "\r\n";
  }
  bool fermer(std::string& error) override {
    out_.close();
    if (!out_) {
      error = "impossible d'écrire " + file_.string();
      std::error_code ec;
      fs::remove(tmp_, ec);
      return false;
    }
    return mettreEnPlace(tmp_, file_, error);
  }

 private:
  fs::path file_;
  fs::path tmp_;
  FormatEchange format_;
  std::ofstream out_;
  bool appended_ = false;
};

// A real workbook, one sheet.
class ClasseurXlsx : public Classeur {
 public:
  explicit ClasseurXlsx(fs::path file) : file_(std::move(file)), tmp_(temporaire(file_)) {
    tmp_ += ".xlsx";
    preparerDossier(file_);
    // Rows are written in order and flushed as they go, so a large export keeps little memory.
    lxw_workbook_options options{};
    options.constant_memory = LXW_TRUE;
    workbook_ = workbook_new_opt(tmp_.c_str(), &options);
    if (workbook_ == nullptr) return;
    sheet_ = workbook_add_worksheet(workbook_, "Suivi");
    header_ = workbook_add_format(workbook_);
    format_set_bold(header_);
    format_set_bg_color(header_, 0xDCE6F1);
    format_set_bottom(header_, LXW_BORDER_THIN);
    amount_ = workbook_add_format(workbook_);
    format_set_num_format(amount_, "#,##0.00");
    date_ = workbook_add_format(workbook_);
    format_set_num_format(date_, "dd/mm/yyyy");
  }
  ~ClasseurXlsx() override {
    if (workbook_ != nullptr) {
      workbook_close(workbook_);
      std::error_code ec;
      fs::remove(tmp_, ec);
    }
  }
  void entete(const std::vector<std::string>& names) override {
    if (sheet_ == nullptr) return;
    for (size_t c = 0; c < names.size(); ++c) {
      worksheet_write_string(sheet_, row_, static_cast<lxw_col_t>(c), names[c].c_str(), header_);
      largeur(c, names[c].size());
    }
    worksheet_freeze_panes(sheet_, 1, 0);
    ++row_;
  }
  void ligne(const std::vector<const Valeur*>& cells) override {
    if (sheet_ == nullptr) return;
    for (size_t c = 0; c < cells.size(); ++c) {
      auto col = static_cast<lxw_col_t>(c);
      const Valeur& v = *cells[c];
      switch (v.kind()) {
        case Kind::Monnaie:
          worksheet_write_number(sheet_, row_, col, v.asMonnaie().toDouble(), amount_);
          largeur(c, v.asMonnaie().text().size() + 3);
          break;
        case Kind::Entier:
          worksheet_write_number(sheet_, row_, col, static_cast<double>(v.asEntier()), nullptr);
          break;
        case Kind::Double:
        case Kind::Simple:
          worksheet_write_number(sheet_, row_, col,
                                 v.kind() == Kind::Double ? v.asDouble() : v.asSimple(), nullptr);
          break;
        case Kind::Date: {
          const Date& d = v.asDate();
          if (d.empty()) break;
          lxw_datetime dt{d.year(), static_cast<int>(d.month()), static_cast<int>(d.day()), 0, 0,
                          0.0};
          worksheet_write_datetime(sheet_, row_, col, &dt, date_);
          largeur(c, 10);
          break;
        }
        case Kind::Chaine:
          if (!v.asChaine().empty()) {
            worksheet_write_string(sheet_, row_, col, v.asChaine().c_str(), nullptr);
            largeur(c, nombreCaracteres(v.asChaine()));
          }
          break;
      }
    }
    ++row_;
  }
  bool fermer(std::string& error) override {
    if (workbook_ == nullptr) {
      error = "impossible de créer " + file_.string();
      return false;
    }
    for (size_t c = 0; c < widths_.size(); ++c) {
      double w = std::min<double>(60, static_cast<double>(widths_[c]) + 2);
      worksheet_set_column(sheet_, static_cast<lxw_col_t>(c), static_cast<lxw_col_t>(c), w,
                           nullptr);
    }
    lxw_error rc = workbook_close(workbook_);
    workbook_ = nullptr;
    if (rc != LXW_NO_ERROR) {
      error = "impossible d'écrire " + file_.string() + " : " + lxw_strerror(rc);
      std::error_code ec;
      fs::remove(tmp_, ec);
      return false;
    }
    return mettreEnPlace(tmp_, file_, error);
  }

 private:
  void largeur(size_t c, size_t w) {
    if (widths_.size() <= c) widths_.resize(c + 1, 8);
    widths_[c] = std::max(widths_[c], w);
  }

  fs::path file_;
  fs::path tmp_;
  lxw_workbook* workbook_ = nullptr;
  lxw_worksheet* sheet_ = nullptr;
  lxw_format* header_ = nullptr;
  lxw_format* amount_ = nullptr;
  lxw_format* date_ = nullptr;
  lxw_row_t row_ = 0;
  std::vector<size_t> widths_;
};

}  // namespace

bool Classeur::estXlsx(const fs::path& file) {
  std::string ext = file.extension().string();
  std::transform(ext.begin(), ext.end(), ext.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  return ext == ".xlsx";
}

std::unique_ptr<Classeur> Classeur::ouvrir(const fs::path& file, const FormatEchange& format,
                                           bool append) {
  if (estXlsx(file)) return std::make_unique<ClasseurXlsx>(file);
  return std::make_unique<ClasseurTexte>(file, format, append);
}

std::string texteCellule(const Valeur& v, const FormatEchange& format) {
  std::string text;
  switch (v.kind()) {
    case Kind::Monnaie:
      text = valeurArrondie(v.asMonnaie(), 2, '=').text();
      break;
    case Kind::Date:
      text = format.formatDate == "yyyy-mm-dd" ? v.asDate().iso() : v.asDate().text();
      break;
    default:
      text = v.toChaine();
      break;
  }
  return text;
}

}  // namespace quarvo::host::report

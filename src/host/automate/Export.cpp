#include "host/automate/Export.h"

#include <algorithm>

#include "host/automate/Parcours.h"
#include "host/report/Classeur.h"
#include "host/session/Session.h"

namespace quarvo::host {

namespace {

bool chiffre(char c) {
  return c >= '0' && c <= '9';
}

int comparerNaturel(const std::string& a, const std::string& b) {
  // Sorted rows mostly differ in their last sort entries: equal texts are the common case.
  if (a.size() == b.size() && a.compare(b) == 0) return 0;
  size_t i = 0;
  size_t j = 0;
  while (i < a.size() && j < b.size()) {
    if (chiffre(a[i]) && chiffre(b[j])) {
      size_t ei = i;
      size_t ej = j;
      while (ei < a.size() && chiffre(a[ei])) ++ei;
      while (ej < b.size() && chiffre(b[ej])) ++ej;
      // Compare the runs as numbers: leading zeros aside, the longer run is the larger.
      size_t si = i;
      size_t sj = j;
      while (si + 1 < ei && a[si] == '0') ++si;
      while (sj + 1 < ej && b[sj] == '0') ++sj;
      if (ei - si != ej - sj) return ei - si < ej - sj ? -1 : 1;
      int c = a.compare(si, ei - si, b, sj, ej - sj);
      if (c != 0) return c < 0 ? -1 : 1;
      i = ei;
      j = ej;
      continue;
    }
    if (a[i] != b[j])
      return static_cast<unsigned char>(a[i]) < static_cast<unsigned char>(b[j]) ? -1 : 1;
    ++i;
    ++j;
  }
  if (i == a.size() && j == b.size()) return a.compare(b) < 0 ? -1 : a == b ? 0 : 1;
  return i == a.size() ? -1 : 1;
}

}  // namespace

int comparerTri(const Valeur& a, const Valeur& b) {
  if (a.kind() == Kind::Chaine && b.kind() == Kind::Chaine) {
    return comparerNaturel(a.asChaine(), b.asChaine());
  }
  return Valeur::compare(a, b);
}

Export::Export(Evt* creating) : Automate(creating) {
  addBranch("POUR_TOUT", [this](Evt* e) { pour_tout(e); });
}
Export::~Export() = default;

void Export::planTri(const std::string&, std::vector<std::string> entries) {
  sort_.clear();
  std::string key;
  for (auto& entry : entries) {
    auto dot = entry.find('.');
    std::string column = dot == std::string::npos ? entry : entry.substr(dot + 1);
    if (column == "IDENT") {
      key = column;
      continue;
    }
    sort_.push_back(column);
  }
  if (!key.empty()) sort_.push_back(key);
}

Table& Export::courant() {
  if (!cursor_) cursor_ = std::make_unique<Table>(this, nomBase(), nomTable(), "EXPORT");
  return *cursor_;
}

bool Export::ouvrirFichier() {
  report::FormatEchange format;
  Table frmt(this, "$$", "FRMT", "EXPORT_FRMT");
  if (frmt.store().schema().index("CODE") &&
      frmt.chercher(3, "CODE", '=', Valeur::chaine(format_)) == 0) {
    std::string sep = frmt.valeur("SEPARATEUR").toChaine();
    format.separateur = sep.empty() || sep == "TAB" ? "\t" : sep;
    std::string dates = frmt.valeur("FORMAT_DATE").toChaine();
    if (!dates.empty()) format.formatDate = dates;
  } else if (format_ != "EXCEL1") {
    session().ui().incident("Le format d'échange " + format_ +
                            " n'existe pas : l'export est impossible.");
    return false;
  }
  if (file_.empty()) {
    session().ui().incident("Aucun fichier d'export n'est indiqué.");
    return false;
  }
  bool append = mode_.find('S') == std::string::npos;
  out_ = report::Classeur::ouvrir(file_, format, append);
  zonesTrouvees_.clear();
  if (mode_.find('I') != std::string::npos) out_->entete(zones_);
  return true;
}

void Export::pour_tout(Evt*) {
  if (!out_) return;
  if (zonesTrouvees_.size() != zones_.size()) {
    zonesTrouvees_.clear();
    for (const auto& zone : zones_) zonesTrouvees_.push_back({champ(zone), zone});
  }
  // The cells are read where they are, in the fields and in the current row.
  cellules_.clear();
  Table& t = courant();
  for (const auto& zone : zonesTrouvees_) {
    cellules_.push_back(zone.champ != nullptr ? &zone.champ->value() : &t.valeur(zone.colonne));
  }
  out_->ligne(cellules_);
  ++written_;
}

void Export::executer(Evt* evt) {
  EvtParamVal none;
  Evt* e = evt != nullptr ? evt : &none;
  for (const char* label : {"INIT", "DEBUT"}) {
    if (termine()) break;
    raise(label, e);
  }
  if (!termine() && !nomTable().empty()) {
    if (!ouvrirFichier()) {
      erreurMethode(1, e);
      sortir();
      return;
    }
    Table& t = courant();
    t.effacerCriteres();
    const auto& schema = t.store().schema();
    std::vector<std::string> columns;
    for (const auto& c : sort_) {
      if (!schema.index(c) && c.size() > 5 && c.compare(c.size() - 5, 5, "_UNIQ") == 0) {
        columns.push_back(c.substr(0, c.size() - 5) + "_IDENT");
      } else {
        columns.push_back(c);
      }
    }
    for (RowId id : selectionTriee(t, columns, comparerTri)) {
      if (termine()) break;
      if (t.aller(id) != 0) continue;
      raise("POUR_TOUT", e);
    }
    std::string error;
    if (!out_->fermer(error)) {
      session().ui().incident("Export impossible : " + error);
      erreurMethode(1, e);
    }
    out_.reset();
  }
  if (!termine()) raise("FIN", e);
  sortir();
}

}  // namespace quarvo::host

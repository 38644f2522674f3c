#include "host/report/Moteur.h"

#include <algorithm>
#include <map>
#include <optional>
#include <set>

#include "host/Execute.h"
#include "host/automate/Automate.h"
#include "host/automate/Export.h"
#include "host/automate/Parcours.h"
#include "host/table/Table.h"

namespace quarvo::host::report {

namespace {

std::map<std::string, Etat>& registre() {
  static std::map<std::string, Etat> etats;
  return etats;
}

std::vector<std::string> decouper(const std::string& text, const std::string& sep) {
  std::vector<std::string> parts;
  size_t start = 0;
  for (size_t at; (at = text.find(sep, start)) != std::string::npos; start = at + sep.size()) {
    parts.push_back(text.substr(start, at - start));
  }
  parts.push_back(text.substr(start));
  return parts;
}

bool vrai(const Valeur& v) {
  std::string t = v.toChaine();
  return !t.empty() && t != "0";
}

using Sommes = std::map<std::string, Monnaie>;

class Impression {
 public:
  Impression(Automate& a, const Etat& e) : a_(a), etat_(e), doc_(e.paysage) {}

  bool imprimer(const std::filesystem::path& file, std::string& error, int& pages) {
    doc_.entete(evaluer(etat_.titre, nullptr, false), evaluer(etat_.note, nullptr, false),
                evaluer(etat_.sousTitre, nullptr, false));
    doc_.pied(evaluer(etat_.pied, nullptr, false));
    for (const auto& partie : etat_.parties) {
      if (condition(partie.condition)) imprimerPartie(partie);
    }
    pages = doc_.pages();
    return doc_.ecrire(file, error);
  }

 private:
  // A field or "TABLE.COLUMN" of the automaton, else a column of the part's current row.
  Valeur valeur(const std::string& name) {
    auto v = Execute::execute(a_, name);
    if (v) return *v;
    if (table_ != nullptr && table_->store().schema().index(name)) return table_->valeur(name);
    return Valeur();
  }

  std::string texte(const Valeur& v, bool zerosMasques) {
    switch (v.kind()) {
      case Kind::Monnaie:
        if (zerosMasques && v.asMonnaie().isZero()) return {};
        return texteMontant(v.asMonnaie());
      case Kind::Date:
        return v.asDate().text();
      default:
        return v.toChaine();
    }
  }

  std::string evaluer(const std::string& expression, const Sommes* sommes, bool zerosMasques) {
    std::string out;
    if (expression.empty()) return out;
    for (const auto& term : decouper(expression, " & ")) {
      if (term.size() >= 2 && term.front() == '\'' && term.back() == '\'') {
        out += term.substr(1, term.size() - 2);
      } else if (!term.empty() && term.front() == '+') {
        Monnaie m;
        if (sommes != nullptr) {
          auto it = sommes->find(term.substr(1));
          if (it != sommes->end()) m = it->second;
        }
        out += zerosMasques && m.isZero() ? std::string() : texteMontant(m);
      } else {
        out += texte(valeur(term), zerosMasques);
      }
    }
    return out;
  }

  bool condition(const std::string& text) {
    if (text.empty()) return true;
    for (const auto& item : decouper(text, ",")) {
      if (item.empty()) continue;
      auto neq = item.find("!=");
      auto eq = item.find('=');
      bool ok;
      if (neq != std::string::npos) {
        ok = valeur(item.substr(0, neq)).toChaine() != item.substr(neq + 2);
      } else if (eq != std::string::npos) {
        ok = valeur(item.substr(0, eq)).toChaine() == item.substr(eq + 1);
      } else if (item.front() == '!') {
        ok = !vrai(valeur(item.substr(1)));
      } else {
        ok = vrai(valeur(item));
      }
      if (!ok) return false;
    }
    return true;
  }

  void bande(const Bande& b, const Sommes* sommes) {
    if (!condition(b.condition)) return;
    if (b.pleineLargeur) {
      std::string text;
      for (const auto& c : b.cellules) text += evaluer(c, sommes, b.zerosMasques);
      doc_.bandeau(text, b.style);
      return;
    }
    std::vector<Cellule> cells;
    for (size_t i = 0; i < b.cellules.size(); ++i) {
      int span = i < b.colonnes.size() ? b.colonnes[i] : 1;
      cells.push_back({evaluer(b.cellules[i], sommes, b.zerosMasques), span});
    }
    doc_.ligne(cells, b.style);
  }

  static void colonnesSommees(const std::vector<Bande>& bandes, std::set<std::string>& out) {
    for (const auto& b : bandes) {
      for (const auto& cell : b.cellules) {
        for (const auto& term : decouper(cell, " & ")) {
          if (!term.empty() && term.front() == '+') out.insert(term.substr(1));
        }
      }
    }
  }

  // A group that starts on a new page takes the headings of the groups above it along: the
  // groups from level `first` down open here, and the first that asks for a page gets one.
  void sauterSiUnGroupeLeVeut(const Partie& p, size_t first) {
    for (size_t n = first; n < p.niveaux.size(); ++n) {
      if (!p.niveaux[n].saut.empty() && condition(p.niveaux[n].saut)) {
        doc_.nouvellePage();
        return;
      }
    }
  }

  void lever(const std::string& label) {
    EvtParamVal e;
    a_.raise(label, &e);
  }

  void imprimerPartie(const Partie& p) {
    Table* t = a_.tableParContexte(p.table);
    if (t == nullptr) return;
    table_ = t;
    doc_.nouvellePage();
    doc_.colonnes(p.colonnes);
    if (!p.titre.empty()) {
      Style s;
      s.gras = true;
      s.taille = 11;
      s.couleur = 0x1F3A5F;
      doc_.bandeau(evaluer(p.titre, nullptr, false), s, 10);
      doc_.espace(1.5);
    }
    std::set<std::string> sommees;
    colonnesSommees(p.corps, sommees);
    colonnesSommees(p.total, sommees);
    for (const auto& n : p.niveaux) {
      colonnesSommees(n.debut, sommees);
      colonnesSommees(n.fin, sommees);
    }

    t->effacerCriteres();
    if (totauxSeuls(p)) {
      imprimerTotaux(p, *t, sommees);
      table_ = nullptr;
      return;
    }
    std::vector<RowId> order = selectionTriee(*t, p.tri, comparerTri);

    size_t levels = p.niveaux.size();
    std::vector<Sommes> groupes(levels);
    Sommes totalPartie;
    std::vector<std::string> courants(levels);
    std::optional<RowId> precedent;
    auto fermer = [&](size_t from) {
      for (size_t n = levels; n-- > from;) {
        lever(p.prefixe + "FIN" + std::to_string(n + 1) + "_IMPRIME");
        for (const auto& b : p.niveaux[n].fin) bande(b, &groupes[n]);
      }
    };
    for (RowId id : order) {
      if (t->aller(id) != 0) continue;
      size_t change = levels;
      for (size_t n = 0; n < levels; ++n) {
        std::string v = t->valeur(p.niveaux[n].rupture).toChaine();
        if (!precedent || v != courants[n]) {
          change = n;
          break;
        }
      }
      if (precedent && change < levels) {
        t->aller(*precedent);
        fermer(change);
        t->aller(id);
      }
      size_t first = precedent ? change : 0;
      sauterSiUnGroupeLeVeut(p, first);
      for (size_t n = first; n < levels; ++n) {
        courants[n] = t->valeur(p.niveaux[n].rupture).toChaine();
        groupes[n].clear();
        lever(p.prefixe + "DEBUT" + std::to_string(n + 1));
        for (const auto& b : p.niveaux[n].debut) bande(b, nullptr);
      }
      for (const auto& col : sommees) {
        Monnaie m = toMonnaie(t->valeur(col));
        totalPartie[col] += m;
        for (auto& g : groupes) g[col] += m;
      }
      lever(p.prefixe + "CORPS_IMPRIME");
      for (const auto& b : p.corps) bande(b, nullptr);
      precedent = id;
    }
    if (precedent) {
      t->aller(*precedent);
      fermer(0);
    }
    for (const auto& b : p.total) bande(b, &totalPartie);
    table_ = nullptr;
  }

  // A part that prints no row, only the totals of its groups, whose break columns lead its
  // sort order.
  static bool totauxSeuls(const Partie& p) {
    if (!p.corps.empty() || p.niveaux.empty() || p.tri.size() < p.niveaux.size()) return false;
    for (size_t n = 0; n < p.niveaux.size(); ++n) {
      if (p.niveaux[n].rupture != p.tri[n]) return false;
    }
    return true;
  }

  // One group of the deepest level: its sums, and its first and last rows in the part's order.
  struct Groupe {
    Sommes sommes;
    std::vector<Valeur> premierTri;
    std::vector<Valeur> dernierTri;
    RowId premier = 0;
    RowId dernier = 0;
  };

  struct AvantTri {
    bool operator()(const std::vector<Valeur>& a, const std::vector<Valeur>& b) const {
      return comparer(a, b) < 0;
    }
    static int comparer(const std::vector<Valeur>& a, const std::vector<Valeur>& b) {
      for (size_t i = 0; i < a.size() && i < b.size(); ++i) {
        int c = comparerTri(a[i], b[i]);
        if (c != 0) return c;
      }
      return 0;
    }
  };

  // Prints a part of totals only as the walk of its sorted rows would: one pass over the table,
  // in the table's order, gathers each group's sums and its first and last rows (ties in the
  // table's order, as the sort keeps them); the groups then print in order, each heading on
  // its first row and each total on its last. No row is copied and nothing is sorted but the
  // groups. The body label is not raised: there is no body.
  void imprimerTotaux(const Partie& p, Table& t, const std::set<std::string>& sommees) {
    const size_t levels = p.niveaux.size();
    std::map<std::vector<Valeur>, Groupe, AvantTri> groupesTries;
    t.ouvrir();
    while (t.lire(1) == 0) {
      std::vector<Valeur> cle;
      for (size_t n = 0; n < levels; ++n) cle.push_back(t.valeur(p.tri[n]));
      std::vector<Valeur> reste;
      for (size_t k = levels; k < p.tri.size(); ++k) reste.push_back(t.valeur(p.tri[k]));
      auto [it, nouveau] = groupesTries.try_emplace(std::move(cle));
      Groupe& g = it->second;
      if (nouveau || AvantTri::comparer(reste, g.premierTri) < 0) {
        g.premier = t.courantId();
        g.premierTri = reste;
      }
      if (nouveau || AvantTri::comparer(reste, g.dernierTri) >= 0) {
        g.dernier = t.courantId();
        g.dernierTri = std::move(reste);
      }
      for (const auto& col : sommees) g.sommes[col] += toMonnaie(t.valeur(col));
    }

    std::vector<Sommes> groupes(levels);
    Sommes totalPartie;
    std::vector<std::string> courants(levels);
    const Groupe* precedent = nullptr;
    auto fermer = [&](size_t from) {
      for (size_t n = levels; n-- > from;) {
        lever(p.prefixe + "FIN" + std::to_string(n + 1) + "_IMPRIME");
        for (const auto& b : p.niveaux[n].fin) bande(b, &groupes[n]);
      }
    };
    for (const auto& [cle, g] : groupesTries) {
      size_t change = levels;
      for (size_t n = 0; n < levels; ++n) {
        if (!precedent || cle[n].toChaine() != courants[n]) {
          change = n;
          break;
        }
      }
      if (precedent && change < levels) {
        t.aller(precedent->dernier);
        fermer(change);
      }
      t.aller(g.premier);
      size_t first = precedent ? change : 0;
      sauterSiUnGroupeLeVeut(p, first);
      for (size_t n = first; n < levels; ++n) {
        courants[n] = cle[n].toChaine();
        groupes[n].clear();
        lever(p.prefixe + "DEBUT" + std::to_string(n + 1));
        for (const auto& b : p.niveaux[n].debut) bande(b, nullptr);
      }
      for (const auto& [col, m] : g.sommes) {
        totalPartie[col] += m;
        for (auto& s : groupes) s[col] += m;
      }
      precedent = &g;
    }
    if (precedent) {
      t.aller(precedent->dernier);
      fermer(0);
    }
    for (const auto& b : p.total) bande(b, &totalPartie);
  }

  Automate& a_;
  const Etat& etat_;
  Document doc_;
  Table* table_ = nullptr;
};

}  // namespace

void Etat::enregistrer(const Etat& etat) {
  registre()[etat.nom] = etat;
}

const Etat* Etat::trouver(const std::string& nom) {
  auto it = registre().find(nom);
  return it == registre().end() ? nullptr : &it->second;
}

std::string texteMontant(const Monnaie& m) {
  std::string plain = valeurArrondie(m, 2, '=').text();  // "-1234.50"
  bool negative = !plain.empty() && plain[0] == '-';
  if (negative) plain.erase(0, 1);
  auto dot = plain.find('.');
  std::string whole = plain.substr(0, dot);
  std::string decimals = dot == std::string::npos ? "00" : plain.substr(dot + 1);
  std::string grouped;
  for (size_t i = 0; i < whole.size(); ++i) {
    if (i > 0 && (whole.size() - i) % 3 == 0) grouped += "\u00A0";
    grouped += whole[i];
  }
  return (negative ? "-" : "") + grouped + "," + decimals;
}

bool Moteur::imprimer(const std::filesystem::path& file, std::string& error) {
  Impression impression(automate_, etat_);
  return impression.imprimer(file, error, pages_);
}

}  // namespace quarvo::host::report

#include "host/automate/Seletat.h"

#include <cmath>
#include <fstream>

#include "host/Execute.h"
#include "host/session/Session.h"
#include "host/ui/Ecran.h"

namespace quarvo::host {

Seletat::Seletat(Evt* creating)
    : Fenetre_simple(creating),
      vdatemin_(date("VDATEMIN", "Du")),
      vdatemax_(date("VDATEMAX", "Au")),
      vborne_(chaine("VBORNE", "Période")),
      vclassement_(chaine("VCLASSEMENT", "Classement")),
      vclassementLib_(chaine("VCLASSEMENT_LIB")),
      vselection_(chaine("VSELECTION")),
      vjauge_(entier("VJAUGE")),
      vaffaChoix_(chaine("VAFFA_CHOIX", "Affaires", "T")),
      vaffaCode_(chaine("VAFFA_CODE", "Affaire")),
      vafebudIdent_(chaine("VAFEBUD_IDENT", "Budget")),
      vaffaToutes_(chaine("VAFFA_TOUTES", "Affaires", "T")),
      vaffaIdent_(chaine("VAFFA_IDENT")),
      vservChoix_(chaine("VSERV_CHOIX", "Services", "T")),
      vservCode_(chaine("VSERV_CODE", "Service")),
      vcli_(chaine("VCLI", "Client")),
      vrps1_(chaine("VRPS1", "Responsable 1")),
      vrps2_(chaine("VRPS2", "Responsable 2")),
      vcri1_(chaine("VCRI1", "Critère 1")),
      vcri2_(chaine("VCRI2", "Critère 2")),
      vcri3_(chaine("VCRI3", "Critère 3")),
      vcri4_(chaine("VCRI4", "Critère 4")),
      vcri5_(chaine("VCRI5", "Critère 5")),
      vetat_(chaine("VETAT", "États", "T")),
      vclos_(chaine("VCLOS", "Budgets clôturés", "N")),
      vclos2_(chaine("VCLOS2", "Clôturés de l'exercice seulement", "N")),
      vtypeOpt_(chaine("VTYPE_OPT", "Types", "T")),
      vtypeChoix_(chaine("VTYPE_CHOIX", "Type")),
      vsortie_(entier("VSORTIE", "Sortie", 1)),
      vfichier_(chaine("VFICHIER", "Fichier")) {
  nomEcran("SELETAT");
  addBranch("INIT", [this](Evt* e) { init(e); });
  addBranch("AVANT_DEBUT", [this](Evt* e) { avant_debut(e); });
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("DEBUT_ACTIVATION", [this](Evt* e) { debut_activation(e); });
  addBranch("VALID", [this](Evt* e) { valid(e); });
  addBranch("VAFFA_TOUTES", [this](Evt* e) { vaffa_toutes(e); });
  addBranch("VAFFA_CODE_CHOISIR", [this](Evt* e) { vaffa_code_choisir(e); });
  addBranch("BORNE(1,7)", [this](Evt* e) { borne__1__7(e); });
  addBranch("EXPORTER_LISTE_CSV", [this](Evt* e) { exporter_liste_csv(e); });
  addBranch("VALIDATION", [this](Evt* e) { validation(e); });
  addBranch("VCLASSEMENT_LIB_CHOIX", [this](Evt* e) { vclassement_lib_choix(e); });
  addBranch("VCLASSEMENT_LIB_FERME", [this](Evt* e) { vclassement_lib_ferme(e); });
  addBranch("BORNE_DATE", [this](Evt* e) { borne_date(e); });
  addBranch("CONSTRUIRE_VSELECTION", [this](Evt* e) { construire_vselection(e); });
}

const std::vector<std::pair<std::string, std::string>>& Seletat::criteres() {
  static const std::vector<std::pair<std::string, std::string>> list = {
      {"", "Aucun"},           {"AFCLIE", "Client"},        {"AFETAB", "Établissement"},
      {"AFSERV", "Service"},   {"AFRPS1", "Responsable 1"}, {"AFRPS2", "Responsable 2"},
      {"AFCRI1", "Critère 1"}, {"AFCRI2", "Critère 2"},     {"AFCRI3", "Critère 3"},
      {"AFCRI4", "Critère 4"}, {"AFCRI5", "Critère 5"}};
  return list;
}

void Seletat::valid(Evt* evt) {
  EvtParamVal none;
  Evt* e = evt != nullptr ? evt : &none;
  raise("VALIDATION", e);
}

void Seletat::vaffa_toutes(Evt*) {
  if (vaffaToutes_.text() == "T") {
    vaffaCode_.set("");
    vaffaIdent_.set("");
  }
}

void Seletat::vaffa_code_choisir(Evt* evt) {
  // The list starts on the project typed, when there is one.
  EvtParamRef lire{vaffaCode_.value()};
  Field ident("P_AFFAIRE", "", "", 4, Kind::Chaine, Valeur::chaine(""), this);
  appelerProcedure("*1", "AFAFFA", "INTERFACE", "LECTURE_CODE", &lire, -1);
  if (erreurMethode() == 0) {
    if (auto v = Execute::execute(*this, "I_AFAFFA.IDENT")) ident.assign(*v);
  }
  EvtParamRef choix{ref(ident)};
  appelerProcedure("*1", "AFAFFA", "INTERFACE", "CHOIX", &choix, -1);
  int code = erreurMethode();
  if (code == 0) {
    vaffaToutes_.set("U");
    if (auto v = Execute::execute(*this, "I_AFAFFA.CODE")) vaffaCode_.assign(*v);
    vaffaIdent_.assign(ident.value());
  } else if (code == 2) {
    vaffaToutes_.set("T");
    vaffaCode_.set("");
    vaffaIdent_.set("");
  }
  erreurMethode(0, evt);
}

void Seletat::borne__1__7(Evt* evt) {
  borne(numeroBranche(), evt);
}

void Seletat::borne(int numero, Evt* evt) {
  EvtParamRef borne{val(std::to_string(numero)), ref(vdatemin_), ref(vdatemax_)};
  appelerProcedure("*", "COMMUN", "INTERFACE", "BORNE_DATE", &borne, -1);
  erreurMethode(erreurMethode(), evt);
  reafficher("VDATEMIN");
  reafficher("VDATEMAX");
}

void Seletat::exporter_liste_csv(Evt* evt) {
  std::string list = evt != nullptr && evt->nbParams() > 0 ? evt->valeur(0).toChaine() : "LST";
  if (list.empty()) list = "LST";
  auto file = session().ui().choisirFichier("Exporter la liste", "Fichiers CSV (*.csv)|*.csv");
  if (!file || file->empty()) return;
  if (!exporterListeCsv(list, *file)) {
    BoiteDialogue("Attention", "Le fichier " + *file + " n'a pas pu être écrit.", 0, {"$1~OK"});
    erreurMethode(1, evt);
  }
}

bool Seletat::exporterListeCsv(const std::string& list, const std::string& file) {
  const DescListe* d = ecran().description().liste(list);
  if (d == nullptr) return false;
  const ListeEcran& l = ecran().liste(list);
  auto cellule = [](const std::string& text, bool nombre) {
    std::string v = text;
    if (!nombre && !v.empty() && (v[0] == '=' || v[0] == '+' || v[0] == '-' || v[0] == '@')) {
      v = "'" + v;  // text, not a formula
    }
    if (v.find_first_of(";\"\n\r") != std::string::npos) {
      std::string q = "\"";
      for (char c : v) q += c == '"' ? std::string("\"\"") : std::string(1, c);
      v = q + "\"";
    }
    return v;
  };
  std::ofstream out(file, std::ios::binary);
  if (!out) return false;
  for (size_t i = 0; i < d->colonnes.size(); ++i) {
    out << (i == 0 ? "" : ";")
        << cellule(d->colonnes[i].entete.empty() ? d->colonnes[i].nom : d->colonnes[i].entete,
                   false);
  }
  out << "\n";
  for (const auto& row : l.lignes) {
    for (size_t i = 0; i < row.size() && i < d->colonnes.size(); ++i) {
      GenreChamp g = d->colonnes[i].genre;
      bool nombre = g == GenreChamp::Montant || g == GenreChamp::Nombre || g == GenreChamp::Entier;
      out << (i == 0 ? "" : ";") << cellule(row[i], nombre);
    }
    out << "\n";
  }
  return static_cast<bool>(out);
}

void Seletat::vclassement_lib_choix(Evt* evt) {
  std::vector<std::string> items;
  for (const auto& [code, label] : criteres()) items.push_back(label);
  auto chosen = session().ui().choisir("Classement", items);
  if (chosen && *chosen >= 1 && static_cast<size_t>(*chosen) <= criteres().size()) {
    vclassement_.set(criteres()[static_cast<size_t>(*chosen - 1)].first);
  }
  vclassement_lib_ferme(evt);
}

void Seletat::vclassement_lib_ferme(Evt*) {
  std::string code = vclassement_.text();
  std::string label;
  if (!code.empty()) {
    // The suite's label of the family, else its vocabulary entry, else the list's own label.
    Field text("V_LIB_CRITERE", "", "", 4, Kind::Chaine, Valeur::chaine(""), this);
    EvtParamRef lire{val(code + "_V1"), ref(text)};
    appelerProcedure("*", "COMMUN", "INTERFACE", "LIRE_LIBEL", &lire, -1);
    label = erreurMethode() == 0 ? text.text() : "";
    if (label.empty()) {
      EvtParamRef voca{val(code)};
      appelerProcedure("*1", "AFVOCA", "INTERFACE", "LECTURE_CODE", &voca, -1);
      if (erreurMethode() == 0) {
        auto v = Execute::execute(*this, "I_AFVOCA.LABEL");
        if (v) label = v->toChaine();
      }
    }
    if (label.empty()) {
      for (const auto& [c, l] : criteres()) {
        if (c == code) label = l;
      }
    }
  }
  vclassementLib_.set(label);
  reafficher("VCLASSEMENT_LIB");
}

void Seletat::borne_date(Evt* evt) {
  EvtParamRef borne{val(vborne_.text()), ref(vdatemin_), ref(vdatemax_)};
  appelerProcedure("*", "COMMUN", "INTERFACE", "BORNE_DATE", &borne, -1);
  erreurMethode(erreurMethode(), evt);
  reafficher("VDATEMIN");
  reafficher("VDATEMAX");
}

void Seletat::construire_vselection(Evt* evt) {
  std::string parts = evt != nullptr && evt->nbParams() > 0 ? evt->valeur(0).toChaine() : "AEBV";
  vselection_.set(resumeSelection(parts));
}

std::string Seletat::resumeSelection(const std::string& parts) const {
  std::vector<std::string> items;
  for (char part : parts) {
    switch (part) {
      case 'V':
        items.push_back("Période du " + vdatemin_.text() + " au " + vdatemax_.text());
        break;
      case 'A': {
        std::string choix = vaffaChoix_.text();
        std::string text = choix == "T"   ? "Toutes les affaires"
                           : choix == "B" ? "Budget " + vafebudIdent_.text()
                                          : "Affaire " + vaffaCode_.text();
        const std::pair<const Field*, const char*> ranges[] = {
            {&vcli_, "client"},     {&vrps1_, "responsable 1"}, {&vrps2_, "responsable 2"},
            {&vcri1_, "critère 1"}, {&vcri2_, "critère 2"},     {&vcri3_, "critère 3"},
            {&vcri4_, "critère 4"}, {&vcri5_, "critère 5"}};
        for (const auto& [field, name] : ranges) {
          if (!field->text().empty()) text += ", " + std::string(name) + " " + field->text();
        }
        if (vservChoix_.text() == "U") text += ", service " + vservCode_.text();
        if (!vclassement_.text().empty()) {
          std::string lib =
              vclassementLib_.text().empty() ? vclassement_.text() : vclassementLib_.text();
          text += ", classées par " + lib;
        }
        items.push_back(text);
        break;
      }
      case 'E': {
        std::string etat = vetat_.text();
        std::string text = etat == "A"    ? "Budgets anticipés"
                           : etat == "NC" ? "Budgets non clôturés"
                           : etat == "NA" ? "Budgets non anticipés"
                           : etat == "C"  ? "Budgets clôturés"
                                          : "Budgets de tous états";
        if ((etat == "NC" || etat == "NA") && vclos_.text() == "O") {
          text += " et clôturés dans l'exercice";
        }
        if (etat == "C" && vclos2_.text() == "O") text += " dans l'exercice";
        items.push_back(text);
        break;
      }
      case 'B':
        if (vtypeOpt_.text() == "U") items.push_back("Budgets de type " + vtypeChoix_.text());
        break;
      default:
        break;
    }
  }
  std::string out;
  for (const auto& item : items) out += (out.empty() ? "" : " ; ") + item;
  return out;
}

void Seletat::afficherJauge(double done, double total) {
  double percent = total > 0 ? done / total * 100.0 : 100.0;
  vjauge_.set(static_cast<int64_t>(std::lround(percent)));
  rendreVisible("VJAUGE");
  reafficher("VJAUGE");
  if (!jaugeOuverte_) {
    session().ui().attenteTitre("Sélection en cours");
    jaugeOuverte_ = true;
  }
  session().ui().attenteJauge(static_cast<int64_t>(done), static_cast<int64_t>(total));
}

void Seletat::fermerJauge() {
  cacher("VJAUGE");
  if (jaugeOuverte_) session().ui().attenteFin();
  jaugeOuverte_ = false;
}

void Seletat::reafficher(const std::string& control) {
  // The screen draws each field's value as it is: redisplaying only asks that the control be
  // one of the screen's.
  ecran().controle(control);
}

}  // namespace quarvo::host

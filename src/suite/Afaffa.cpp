#include "suite/Afaffa.h"

#include <algorithm>

#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

Afaffa::Afaffa(Evt* evt) : TableInterface(evt) {
  addBranch("CONTROLER_SECAN", [this](Evt* e) { controlerSecan(e); });
  addBranch("CHOIX", [this](Evt* e) { choix(e); });
}

std::string Afaffa::refus(Table& project, const std::string& section, const Date& date) {
  if (section.empty() || project.chercher(3, "CODE", '=', Valeur::chaine(section)) != 0) {
    return "Aucune affaire ne porte le code <" + section + "> !";
  }
  // A database made before projects could be closed has no closing date.
  if (project.store().schema().index("DATE_CLOTURE")) {
    Date closed = toDate(project.valeur("DATE_CLOTURE"));
    if (!closed.empty()) {
      return "L'affaire <" + section + "> est clôturée depuis le " + closed.text() + " !";
    }
  }
  if (date.empty()) return {};
  Date from = toDate(project.valeur("DATE_DEBUT"));
  Date to = toDate(project.valeur("DATE_FIN"));
  if (!from.empty() && date < from) {
    return "La date de la pièce (" + date.text() + ") précède le début de l'affaire <" + section +
           "> (" + from.text() + ") !";
  }
  if (!to.empty() && to < date) {
    return "La date de la pièce (" + date.text() + ") dépasse la fin de l'affaire <" + section +
           "> (" + to.text() + ") !";
  }
  return {};
}

void Afaffa::controlerSecan(Evt* evt) {
  Field& message1 = chaine("P_MESSAGE1");
  Field& message2 = chaine("P_MESSAGE2");
  evt->param(6, message1, 1);
  evt->param(7, message2, 1);
  std::string piece = evt->valeur(1).toChaine();
  std::string section = evt->valeur(3).toChaine();
  Table project(this, nomBase(), "AFAFFA", "CONTROLER_SECAN");
  std::string why = refus(project, section, toDate(evt->valeur(2)));
  if (why.empty()) {
    message1.set("");
    message2.set("");
    erreurMethode(0, evt);
    return;
  }
  std::string heading = "Section analytique " + section;
  message1.set(piece.empty() ? heading : "Pièce " + piece + " : section analytique " + section);
  message2.set(why);
  erreurMethode(1, evt);
}

void Afaffa::choix(Evt* evt) {
  Field ident("P_IDENT", "", "", 4, Kind::Chaine, Valeur::chaine(""), this);
  evt->param(0, ident, 1);
  Table projets(this, "VOVOVA", "AFAFFA", "CHOIX");
  projets.effacerCriteres();
  std::vector<std::pair<std::string, std::string>> offerts;  // code, identifier
  std::vector<std::string> items;
  while (projets.lire(1) == 0) {
    offerts.emplace_back(projets.valeur("CODE").toChaine(), projets.valeur("IDENT").toChaine());
  }
  std::sort(offerts.begin(), offerts.end());
  for (const auto& [code, id] : offerts) {
    projets.chercher(3, "IDENT", '=', Valeur::chaine(id));
    items.push_back(code + "  " + projets.valeur("DESIG").toChaine());
  }
  std::optional<int> chosen;
  if (!items.empty()) chosen = session().ui().choisir("Choix d'une affaire", items);
  if (!chosen) {
    erreurMethode(2, evt);
    return;
  }
  ident.set(offerts[static_cast<size_t>(*chosen - 1)].second);
  lireDans("IDENT", ident.value());
  erreurMethode(0, evt);
}

}  // namespace quarvo::suite

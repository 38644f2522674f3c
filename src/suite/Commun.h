// "COMMUN": the suite's shared utilities as the module calls them.
//
// Rule:
// - "MESS_OK" (number, answer by reference, arguments...): shows message `number` of the
//   catalogue as information, "%1".. replaced by the arguments; answer "1".
// - "MESS_ON" (number, answer by reference, arguments...): asks it as a yes/no question; answer
//   "1" for yes, "2" for no.
// - "MESS_CHOIX" (number, answer by reference, choice label codes...): offers one button per
//   choice (label texts); answer is the 1-based choice.
// - "MESS_ERREUR" (text, answer by reference): shows an error text as it is; answer "1".
// - "LIRE_LIBEL" (code, label by reference): the label catalogue's text; fails when unknown.
// - "FAIT_LABEL" (label, heading by reference): the heading made from a label: the label with
//   its first letter in capitals, followed by " :".
// - "BOITE_AFFICHER_TITRE" (title), "BOITE_AFFICHER_LIBELLE" (text), "BOITE_AFFICHER_JAUGE"
//   (done, total), "BOITE_SORTIR": the waiting box, shown by the session's driver.
// - "IMPORT_CHARGER_TXT", "IMPORT_CONSULTER_ERREURS", "IMPORT_SAUVER_ERREURS": the text-file
//   loader and the import error list; their rule is in ImportTexte.h.
// - "BORNE_DATE" (preset code, first day by reference, last day by reference): the bounds of a
//   period relative to the company's current month "MOIS_ANNEE" of "AFSOCI": "M" that month,
//   "MP" the month before, "T" its quarter, "A" its calendar year, "E" the current fiscal year
//   (first "DATE_DEBUT"/"DATE_FIN" pair), "J" the company's current day (today when today is
//   in the current month, else the month's last day) and "S" its week, Monday to Sunday. The
//   seven period buttons of the selection screens pass their number: 1 "J", 2 "S", 3 "M",
//   4 "MP", 5 "T", 6 "A", 7 "E". Fails, leaving both dates, for another code or when the
//   company or its current month cannot be read.
// A message number missing from the catalogue is shown as "Message <n>" so nothing is silent.
#pragma once

#include "host/automate/Interface2.h"

namespace quarvo::suite {

class Commun : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Commun(host::Evt* evt);

  // The catalogue text of message `number` with its arguments, prefixed by its number.
  static std::string texteMessage(host::Session& s, const std::string& number,
                                  const std::vector<std::string>& args);

 private:
  void message(host::Evt* evt, const std::string& title, bool question);
  void messChoix(host::Evt* evt);
  void messErreur(host::Evt* evt);
  void lireLibel(host::Evt* evt);
  void faitLabel(host::Evt* evt);
};

}  // namespace quarvo::suite

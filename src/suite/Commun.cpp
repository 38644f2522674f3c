#include "suite/Commun.h"

#include "host/session/Session.h"
#include "host/table/Champ.h"
#include "suite/Catalogue.h"
#include "suite/ImportTexte.h"

namespace quarvo::suite {

using namespace host;

namespace {
std::vector<std::string> argsFrom(const Evt* evt, int first) {
  std::vector<std::string> args;
  for (int i = first; i < evt->nbParams(); ++i) args.push_back(evt->valeur(i).toChaine());
  return args;
}

// "BORNE_DATE" (preset code, first day by reference, last day by reference): see Commun.h.
void borneDate(Automate& a, Evt* evt) {
  Field debut("P_DEBUT", "", "", 4, Kind::Date, Valeur::date(Date()), &a);
  Field fin("P_FIN", "", "", 4, Kind::Date, Valeur::date(Date()), &a);
  evt->param(1, debut, 1);
  evt->param(2, fin, 1);
  std::string code = evt->valeur(0).toChaine();
  // The seven period buttons of the selection screens, by number.
  static const char* const boutons[] = {"J", "S", "M", "MP", "T", "A", "E"};
  if (code.size() == 1 && code[0] >= '1' && code[0] <= '7') code = boutons[code[0] - '1'];
  Table societe(&a, "VOVOVA", "AFSOCI", "BORNE_DATE");
  if (societe.chercher(3, "CODE", '=', Valeur::chaine(a.session().societe())) != 0) {
    a.erreurMethode(1, evt);
    return;
  }
  std::string mois = societe.valeur("MOIS_ANNEE").toChaine();
  auto courant = mois.size() == 6 ? Date::parse("01/" + mois.substr(0, 2) + "/" + mois.substr(2, 4))
                                  : std::nullopt;
  if (!courant || courant->empty()) {
    a.erreurMethode(1, evt);
    return;
  }
  Date d = *courant;
  Date from;
  Date to;
  if (code == "J" || code == "S") {
    // The day (or the week, Monday to Sunday) of the company's current date: today when today
    // is in the current month, else the month's last day.
    Date jour = Date::today();
    if (jour < d || jour > d.lastOfMonth()) jour = d.lastOfMonth();
    from = jour;
    to = jour;
    if (code == "S") {
      std::chrono::weekday wd{std::chrono::sys_days(jour.ymd())};
      from = jour.addDays(-static_cast<int>(wd.iso_encoding() - 1));
      to = from.addDays(6);
    }
  } else if (code == "M") {
    from = d;
    to = d.lastOfMonth();
  } else if (code == "MP") {
    from = d.addMonths(-1);
    to = from.lastOfMonth();
  } else if (code == "T") {
    from = Date::of(d.year(), (d.month() - 1) / 3 * 3 + 1, 1);
    to = from.addMonths(2).lastOfMonth();
  } else if (code == "A") {
    from = Date::of(d.year(), 1, 1);
    to = Date::of(d.year(), 12, 31);
  } else if (code == "E") {
    auto starts = splitList(societe.valeur("DATE_DEBUT").toChaine());
    auto ends = splitList(societe.valeur("DATE_FIN").toChaine());
    auto s = starts.empty() ? std::nullopt : Date::parse(starts[0]);
    auto e = ends.empty() ? std::nullopt : Date::parse(ends[0]);
    if (s && e) {
      from = *s;
      to = *e;
    }
  }
  if (from.empty() || to.empty()) {
    a.erreurMethode(1, evt);
    return;
  }
  debut.set(from);
  fin.set(to);
  a.erreurMethode(0, evt);
}

// Writes `answer` into reference parameter `index` of the event, when there is one.
void answer(Automate& a, Evt* evt, int index, const std::string& text) {
  Field& local = a.chaine("V_REPONSE_" + std::to_string(index));
  evt->param(index, local, 1);
  local.set(text);
}
}  // namespace

Commun::Commun(Evt* evt) : Interface2(evt) {
  addBranch("MESS_OK", [this](Evt* e) { message(e, "Information", false); });
  addBranch("MESS_ON", [this](Evt* e) { message(e, "Question", true); });
  addBranch("MESS_CHOIX", [this](Evt* e) { messChoix(e); });
  addBranch("MESS_ERREUR", [this](Evt* e) { messErreur(e); });
  addBranch("LIRE_LIBEL", [this](Evt* e) { lireLibel(e); });
  addBranch("FAIT_LABEL", [this](Evt* e) { faitLabel(e); });
  addBranch("BOITE_AFFICHER_TITRE",
            [this](Evt* e) { session().ui().attenteTitre(e->valeur(0).toChaine()); });
  addBranch("BOITE_AFFICHER_LIBELLE",
            [this](Evt* e) { session().ui().attenteLibelle(e->valeur(0).toChaine()); });
  addBranch("BOITE_AFFICHER_JAUGE", [this](Evt* e) {
    session().ui().attenteJauge(toEntier(e->valeur(0)), toEntier(e->valeur(1)));
  });
  addBranch("BORNE_DATE", [this](Evt* e) { borneDate(*this, e); });
  addBranch("BOITE_SORTIR", [this](Evt*) { session().ui().attenteFin(); });
  addBranch("IMPORT_CHARGER_TXT", [this](Evt* e) { ImportTexte::chargerTxt(*this, e); });
  addBranch("IMPORT_CONSULTER_ERREURS",
            [this](Evt* e) { ImportTexte::consulterErreurs(*this, e); });
  addBranch("IMPORT_SAUVER_ERREURS", [this](Evt* e) { ImportTexte::sauverErreurs(*this, e); });
}

std::string Commun::texteMessage(Session& s, const std::string& number,
                                 const std::vector<std::string>& args) {
  const Catalogue& c = Catalogue::of(s.dataDir() / "messages.tsv");
  std::string text = c.contains(number) ? substitute(c.text(number), args) : "Message " + number;
  return "[" + number + "] " + text;
}

void Commun::message(Evt* evt, const std::string& title, bool question) {
  std::string number = evt->valeur(0).toChaine();
  std::string text = texteMessage(session(), number, argsFrom(evt, 2));
  std::vector<std::string> buttons =
      question ? std::vector<std::string>{"$1~Oui", "$2~Non"} : std::vector<std::string>{"$1~OK"};
  int chosen = BoiteDialogue(title, text, question ? 2 : 1, buttons);
  answer(*this, evt, 1, std::to_string(chosen));
  erreurMethode(0, evt);
}

void Commun::messChoix(Evt* evt) {
  std::string number = evt->valeur(0).toChaine();
  const Catalogue& labels = Catalogue::of(session().dataDir() / "labels.tsv");
  std::vector<std::string> buttons;
  for (int i = 2; i < evt->nbParams(); ++i) {
    std::string code = evt->valeur(i).toChaine();
    std::string text = labels.contains(code) ? labels.text(code) : code;
    buttons.push_back("$" + std::to_string(i - 1) + "~" + text);
  }
  int chosen = BoiteDialogue("Choix", texteMessage(session(), number, {}), 2, buttons);
  answer(*this, evt, 1, std::to_string(chosen));
  erreurMethode(0, evt);
}

void Commun::messErreur(Evt* evt) {
  BoiteDialogue("Erreur", evt->valeur(0).toChaine(), 3, {"$1~OK"});
  answer(*this, evt, 1, "1");
  erreurMethode(0, evt);
}

void Commun::lireLibel(Evt* evt) {
  const Catalogue& labels = Catalogue::of(session().dataDir() / "labels.tsv");
  std::string code = evt->valeur(0).toChaine();
  answer(*this, evt, 1, labels.text(code));
  erreurMethode(labels.contains(code) ? 0 : 1, evt);
}

void Commun::faitLabel(Evt* evt) {
  std::string label = evt->valeur(0).toChaine();
  if (!label.empty() && label[0] >= 'a' && label[0] <= 'z')
    label[0] = static_cast<char>(label[0] - 32);
  answer(*this, evt, 1, label.empty() ? label : label + " :");
  erreurMethode(0, evt);
}

}  // namespace quarvo::suite

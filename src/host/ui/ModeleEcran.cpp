#include "host/ui/ModeleEcran.h"

#include <charconv>
#include <utility>

#include "host/UException.h"
#include "host/automate/Automate.h"
#include "host/automate/Fenetre_simple.h"
#include "host/automate/Registry.h"
#include "host/session/Session.h"
#include "host/ui/Ecran.h"

namespace quarvo::host {

namespace {

// What a text must be to go into a field of `kind`, as a refusal names it.
const char* attendu(Kind kind) {
  switch (kind) {
    case Kind::Entier:
      return "un nombre entier";
    case Kind::Double:
    case Kind::Simple:
      return "un nombre";
    case Kind::Monnaie:
      return "un montant";
    case Kind::Date:
      return "une date (jj/mm/aaaa)";
    case Kind::Chaine:
      break;
  }
  return "un texte";
}

Kind kindDe(GenreChamp genre) {
  switch (genre) {
    case GenreChamp::Entier:
      return Kind::Entier;
    case GenreChamp::Nombre:
      return Kind::Double;
    case GenreChamp::Montant:
      return Kind::Monnaie;
    case GenreChamp::Date:
      return Kind::Date;
    default:
      break;
  }
  return Kind::Chaine;
}

std::string guillemets(const std::string& text) {
  return "« " + text + " »";
}

// The caller's side of an opening: one text field per parameter, passed by reference as a menu
// passes them.
struct ChampsAppelant {
  std::vector<std::unique_ptr<Field>> fields;
  EvtParamRef evt;
  explicit ChampsAppelant(const std::vector<std::string>& params) : evt(arguments(params)) {}

 private:
  std::vector<Arg> arguments(const std::vector<std::string>& params) {
    std::vector<Arg> args;
    for (size_t i = 0; i < params.size(); ++i) {
      fields.push_back(std::make_unique<Field>("ARG" + std::to_string(i), "", "", 4, Kind::Chaine,
                                               Valeur::chaine(params[i]), nullptr));
      args.push_back(fields.back().get());
    }
    return args;
  }
};

}  // namespace

// The session's UI driver while the model lives; runs on the session thread.
class ModeleEcran::Pilote : public UiDriver {
 public:
  explicit Pilote(ModeleEcran& m) : m_(m) {}

  int boiteDialogue(const std::string& title, const std::string& text, int icon,
                    const std::vector<std::string>& buttons) override {
    if (buttons.size() <= 1) {
      m_.messages_.push_back(text);
      if (m_.echo_ != nullptr && m_.echoMessages_)
        m_.echo_->boiteDialogue(title, text, icon, buttons);
      return 1;
    }
    sansEcriture(text);
    EtatDialogue d{EtatDialogue::Genre::Message, title, text, {}, {}};
    for (const auto& b : buttons) d.boutons.push_back(buttonText(b));
    m_.dialogue_ = std::move(d);
    Reponse r = m_.attendreReponse();
    int count = static_cast<int>(buttons.size());
    return r.numero >= 1 && r.numero <= count ? r.numero : count;
  }

  std::optional<std::string> choisirFichier(const std::string& title,
                                            const std::string& filter) override {
    sansEcriture(title);
    m_.dialogue_ = EtatDialogue{EtatDialogue::Genre::Fichier, title, filter, {}, {}};
    Reponse r = m_.attendreReponse();
    return r.texte;
  }

  std::optional<int> choisir(const std::string& title,
                             const std::vector<std::string>& items) override {
    sansEcriture(title);
    m_.dialogue_ = EtatDialogue{EtatDialogue::Genre::Choix, title, {}, {}, items};
    Reponse r = m_.attendreReponse();
    if (r.numero < 1 || static_cast<size_t>(r.numero) > items.size()) return std::nullopt;
    return r.numero;
  }

  void attenteTitre(const std::string& title) override {
    m_.progression_ = EtatProgression{title, {}, 0, 0};
    suivre();
    if (m_.echo_ != nullptr) m_.echo_->attenteTitre(title);
  }
  void attenteLibelle(const std::string& text) override {
    if (!m_.progression_) m_.progression_ = EtatProgression{};
    m_.progression_->texte = text;
    suivre();
    if (m_.echo_ != nullptr) m_.echo_->attenteLibelle(text);
  }
  void attenteJauge(int64_t done, int64_t total) override {
    if (!m_.progression_) m_.progression_ = EtatProgression{};
    m_.progression_->fait = done;
    m_.progression_->total = total;
    suivre();
    if (m_.echo_ != nullptr) m_.echo_->attenteJauge(done, total);
  }
  void attenteFin() override {
    m_.progression_.reset();
    suivre();
    if (m_.echo_ != nullptr) m_.echo_->attenteFin();
  }
  void incident(const std::string& text) override {
    ++m_.incidents_;
    m_.messages_.push_back("Incident : " + text);
    if (m_.echo_ != nullptr && m_.echoMessages_) m_.echo_->incident(text);
  }

 private:
  void suivre() {
    if (m_.suivi_) m_.suivi_(m_.progression_);
  }
  // A person may take minutes to answer: meanwhile no write may hold the database.
  void sansEcriture(const std::string& what) {
    if (m_.session_.db().depth() > 0) {
      throw UException("a question waits for a person while a write transaction is open: " + what);
    }
  }

  ModeleEcran& m_;
};

ModeleEcran::ModeleEcran(Session& session, UiDriver* echo, bool echoMessages)
    : session_(session), echo_(echo), echoMessages_(echoMessages) {
  pilote_ = std::make_unique<Pilote>(*this);
  precedent_ = &session_.remplacerUi(*pilote_);
  session_.setBoucleModale([this](Automate& window) {
    ++boucles_;
    servir([&window] { return window.termine(); });
    noterFermeture(window);
  });
  fil_ = std::thread([this] { boucle(); });
  std::unique_lock lock(m_);
  attendre(lock);
}

ModeleEcran::~ModeleEcran() {
  try {
    fermerTout();
  } catch (...) {
    // Closing is best effort once the command is ending: what a window could not finish is
    // rolled back with its transaction.
  }
  {
    std::lock_guard lock(m_);
    arret_ = true;
  }
  cv_.notify_all();
  fil_.join();
  session_.setBoucleModale(nullptr);
  session_.remplacerUi(*precedent_);
}

// ---- Driver side ----

void ModeleEcran::attendre(std::unique_lock<std::mutex>& lock) {
  cv_.wait(lock, [this] { return pret_; });
  etat_ = publie_;
  champsFermes_ = publieFermes_;
  resultatFerme_ = publieResultat_;
  if (faute_) {
    std::exception_ptr faute = std::exchange(faute_, nullptr);
    lock.unlock();
    std::rethrow_exception(faute);
  }
}

bool ModeleEcran::soumettre(std::function<void()> travail) {
  std::unique_lock lock(m_);
  travail_ = std::move(travail);
  pret_ = false;
  cv_.notify_all();
  attendre(lock);
  return !refuse_;
}

bool ModeleEcran::refuserIci(const std::string& controle, const std::string& texte) {
  etat_.messages.clear();
  etat_.refus = EtatRefus{controle, texte};
  return false;
}

bool ModeleEcran::repondre(const Action& action) {
  if (!etat_.dialogue) return refuserIci("", "Aucune question n'attend de réponse.");
  const EtatDialogue& d = *etat_.dialogue;
  const std::string& a = action.valeur;
  Reponse r;
  auto parmi = [&a](const std::vector<std::string>& options) -> int {
    size_t n = 0;
    auto [end, ec] = std::from_chars(a.data(), a.data() + a.size(), n);
    if (ec == std::errc() && end == a.data() + a.size() && n >= 1 && n <= options.size()) {
      return static_cast<int>(n);
    }
    for (size_t i = 0; i < options.size(); ++i) {
      if (options[i] == a) return static_cast<int>(i) + 1;
    }
    return 0;
  };
  auto liste = [](const std::vector<std::string>& options) {
    std::string out;
    for (size_t i = 0; i < options.size(); ++i) {
      out += (i == 0 ? "" : ", ") + std::to_string(i + 1) + " " + options[i];
    }
    return out;
  };
  switch (d.genre) {
    case EtatDialogue::Genre::Message:
      r.numero = parmi(d.boutons);
      if (r.numero == 0) {
        return refuserIci(
            "", guillemets(a) + " ne répond pas à la question : " + liste(d.boutons) + ".");
      }
      break;
    case EtatDialogue::Genre::Choix:
      if (!a.empty()) {
        r.numero = parmi(d.elements);
        if (r.numero == 0) {
          return refuserIci(
              "", guillemets(a) + " n'est pas dans la liste : " + liste(d.elements) + ".");
        }
      }
      break;
    case EtatDialogue::Genre::Fichier:
      if (!a.empty()) r.texte = a;
      break;
  }
  std::unique_lock lock(m_);
  reponse_ = r;
  pret_ = false;
  cv_.notify_all();
  attendre(lock);
  return !refuse_;
}

ModeleEcran::Ouverture ModeleEcran::ouvrir(const std::string& name,
                                           const std::vector<std::string>& params) {
  if (etat_.dialogue) {
    refuserIci("", "Une question attend sa réponse.");
    return Ouverture::Refusee;
  }
  size_t avant = etat_.fenetres.size();
  soumettre([this, name, params] {
    ouverture_ = Ouverture::Refusee;
    // The caller's fields live as long as the window, since this work ends only when the
    // window has closed.
    ChampsAppelant appelant(params);
    EvtParamRef& evt = appelant.evt;
    AutomatePtr automate = session_.creer(name, &evt);
    if (!automate) {
      ouverture_ = Ouverture::Inconnue;
      return;
    }
    if (!automate->estFenetre()) {
      ouverture_ = Ouverture::PasUnEcran;
      return;
    }
    if (!evt.refus().empty()) {
      int i = evt.refus().front();
      refuser("", "Le paramètre " + std::to_string(i + 1) + " (" +
                      guillemets(params[static_cast<size_t>(i)]) +
                      ") ne convient pas au champ qui le reçoit.");
      return;
    }
    ouverture_ = Ouverture::Ouverte;
    int boucles = boucles_;
    session_.executerAutomate(std::move(automate), &evt);
    session_.executerEnAttente();
    if (boucles_ == boucles) {
      // It ended while opening: what it said is the reason.
      refuser("", messages_.empty() ? "La fenêtre " + name + " s'est fermée en s'ouvrant."
                                    : messages_.back());
    }
  });
  if (ouverture_ == Ouverture::Ouverte && etat_.fenetres.size() <= avant) {
    return Ouverture::Refusee;
  }
  return ouverture_;
}

ModeleEcran::Ouverture ModeleEcran::appeler(const std::string& module, const std::string& label,
                                            const std::vector<std::string>& params) {
  if (etat_.dialogue) {
    refuserIci("", "Une question attend sa réponse.");
    return Ouverture::Refusee;
  }
  if (!Registry::instance().find(module + "-INTERFACE")) return Ouverture::Inconnue;
  size_t avant = etat_.fenetres.size();
  soumettre([this, module, label, params] {
    ChampsAppelant appelant(params);
    EvtParamRef& evt = appelant.evt;
    int boucles = boucles_;
    session_.appelerProcedure(module, label, &evt);
    // The window the label launched opens when the launched work runs.
    session_.executerEnAttente();
    if (boucles_ == boucles) {
      refuser("", messages_.empty() ? label + " n'a ouvert aucune fenêtre." : messages_.back());
    }
  });
  return etat_.fenetres.size() > avant ? Ouverture::Ouverte : Ouverture::Refusee;
}

bool ModeleEcran::agir(const Action& action) {
  if (action.genre == Action::Genre::Repondre) return repondre(action);
  if (etat_.dialogue) {
    return refuserIci(
        "", "Une question attend sa réponse : " + guillemets(etat_.dialogue->titre) + ".");
  }
  if (!action.fenetre.empty() &&
      (etat_.fenetres.empty() || etat_.fenetres.back().ecran != action.fenetre)) {
    return refuserIci("", "La fenêtre " + action.fenetre + " n'est pas la fenêtre active.");
  }
  return soumettre([this, action] { executer(action); });
}

void ModeleEcran::fermerTout() {
  // Each round closes the innermost window or answers a question; a window's close may run
  // handlers that ask or open more, hence rounds, bounded.
  for (int round = 0; round < 256; ++round) {
    if (etat_.dialogue) {
      Action a;
      a.genre = Action::Genre::Repondre;
      const EtatDialogue& d = *etat_.dialogue;
      if (d.genre == EtatDialogue::Genre::Message) a.valeur = std::to_string(d.boutons.size());
      repondre(a);
      continue;
    }
    if (etat_.fenetres.empty()) return;
    size_t avant = etat_.fenetres.size();
    std::string ecran = etat_.fenetres.back().ecran;
    Action fermer;
    fermer.genre = Action::Genre::Fermer;
    agir(fermer);
    while (etat_.dialogue) {
      Action a;
      a.genre = Action::Genre::Repondre;
      if (etat_.dialogue->genre == EtatDialogue::Genre::Message) {
        a.valeur = std::to_string(etat_.dialogue->boutons.size());
      }
      repondre(a);
    }
    if (etat_.fenetres.size() >= avant && etat_.fenetres.back().ecran == ecran) {
      // It answered its own question by staying open: it is ended without being asked again.
      soumettre([this] {
        if (!session_.fenetresModales().empty()) session_.fenetresModales().back()->sortir();
      });
    }
  }
}

// ---- Session thread ----

void ModeleEcran::boucle() {
  Session::Scope scope(session_);
  servir([] { return false; });
}

void ModeleEcran::servir(const std::function<bool()>& fini) {
  while (!fini()) {
    publier();
    std::function<void()> travail;
    {
      std::unique_lock lock(m_);
      cv_.wait(lock, [this] { return travail_ || arret_; });
      if (!travail_) return;
      travail = std::exchange(travail_, nullptr);
    }
    messages_.clear();
    refus_.reset();
    try {
      travail();
    } catch (...) {
      std::lock_guard lock(m_);
      faute_ = std::current_exception();
    }
  }
}

void ModeleEcran::publier() {
  EtatEcrans etat = photographier();
  {
    std::lock_guard lock(m_);
    publie_ = std::move(etat);
    publieFermes_ = fermes_;
    publieResultat_ = resultat_;
    refuse_ = refus_.has_value();
    pret_ = true;
  }
  cv_.notify_all();
}

ModeleEcran::Reponse ModeleEcran::attendreReponse() {
  publier();
  Reponse r;
  {
    std::unique_lock lock(m_);
    cv_.wait(lock, [this] { return reponse_.has_value() || arret_; });
    if (reponse_) r = *std::exchange(reponse_, std::nullopt);
  }
  dialogue_.reset();
  messages_.clear();
  refus_.reset();
  return r;
}

EtatEcrans ModeleEcran::photographier() {
  EtatEcrans etat;
  for (Automate* w : session_.fenetresModales()) {
    EtatFenetre f;
    f.ecran = w->aUnEcran() ? w->nomEcran() : w->nomAutomate();
    if (!w->aUnEcran()) {
      etat.fenetres.push_back(std::move(f));
      continue;
    }
    Ecran& e = w->ecran();
    const DescriptionEcran& d = e.description();
    f.titre = e.titre();
    f.mode = e.mode();
    f.onglet = e.onglet();
    f.focus = e.focus();
    f.nonEnregistre = e.nonEnregistre();
    auto controle = [&e](const std::string& nom, const std::string& libelle) {
      const Controle* c = e.trouver(nom);
      return EtatControle{nom, libelle, c == nullptr || c->actif, c == nullptr || c->visible, {}};
    };
    for (const auto& c : d.champs) {
      EtatControle ec = controle(c.nom, c.libelle);
      if (const Field* field = w->champ(c.nom)) ec.valeur = field->text();
      f.champs.push_back(std::move(ec));
    }
    for (const auto& b : d.boutons) f.boutons.push_back(controle(b.nom, b.libelle));
    for (const auto& t : d.onglets) f.onglets.push_back(controle(t.nom, t.libelle));
    for (const auto& l : d.listes) {
      EtatListe el;
      el.nom = l.nom;
      for (const auto& c : l.colonnes) el.colonnes.push_back({c.nom, c.entete, c.editable});
      if (const ListeEcran* rows = e.trouverListe(l.nom)) {
        el.lignes = rows->lignes;
        el.courante = rows->courante;
      }
      f.listes.push_back(std::move(el));
    }
    etat.fenetres.push_back(std::move(f));
  }
  etat.messages = messages_;
  etat.refus = refus_;
  etat.dialogue = dialogue_;
  etat.progression = progression_;
  return etat;
}

void ModeleEcran::refuser(const std::string& controle, const std::string& texte) {
  refus_ = EtatRefus{controle, texte};
}

void ModeleEcran::executer(const Action& action) {
  const auto& fenetres = session_.fenetresModales();
  if (fenetres.empty()) return refuser("", "Aucune fenêtre n'est ouverte.");
  Automate& window = *fenetres.back();
  std::string focus = window.aUnEcran() ? window.ecran().focus() : std::string();
  size_t messages = messages_.size();
  int incidents = incidents_;
  bool accepte = appliquer(window, action);
  session_.executerEnAttente();
  // A fault of the runtime in what the action ran: the action did not do its work.
  accepte = accepte && incidents_ == incidents;
  if (!accepte && !refus_) {
    // The window's own refusal: where it put the focus, and what it said.
    std::string controle = action.cible;
    if (!window.termine() && window.aUnEcran() && window.ecran().focus() != focus) {
      controle = window.ecran().focus();
    }
    refuser(controle, messages_.size() > messages ? messages_.back()
                                                  : "La fenêtre a refusé " + enLigne(action) + ".");
  }
}

bool ModeleEcran::appliquer(Automate& window, const Action& action) {
  auto* fenetre = dynamic_cast<Fenetre_simple*>(&window);
  if (fenetre == nullptr || !window.aUnEcran()) {
    refuser("", "La fenêtre " + window.nomAutomate() + " ne reçoit pas d'action.");
    return false;
  }
  Ecran& e = window.ecran();
  const DescriptionEcran& d = e.description();
  const std::string& cible = action.cible;
  // A control a person can reach: declared, enabled, visible, on the current tab.
  auto atteint = [&](const std::string& nom, const char* genre) {
    const Controle* c = e.trouver(nom);
    if (c == nullptr) {
      refuser(nom, "L'écran " + d.ecran + " n'a pas de " + genre + " " + nom + ".");
      return false;
    }
    if (e.accessible(nom)) return true;
    std::string onglet;
    if (const DescChamp* f = d.champ(nom)) onglet = f->onglet;
    if (const DescBouton* b = d.bouton(nom)) onglet = b->onglet;
    if (const DescListe* l = d.liste(nom)) onglet = l->onglet;
    std::string raison = !c->visible ? " est caché."
                         : !onglet.empty() && onglet != e.onglet()
                             ? " est sur l'onglet " + onglet + "."
                             : " est inactif.";
    refuser(nom, nom + raison);
    return false;
  };
  auto ligneDe = [&](const ListeEcran& l) {
    if (action.ligne >= 1 && action.ligne <= l.lignes.size()) return true;
    refuser(cible, "La liste " + cible + " n'a pas de ligne " + std::to_string(action.ligne) + ".");
    return false;
  };

  switch (action.genre) {
    case Action::Genre::Saisir: {
      const DescChamp* c = d.champ(cible);
      if (c == nullptr) {
        refuser(cible, "L'écran " + d.ecran + " n'a pas de champ " + cible + ".");
        return false;
      }
      if (!atteint(cible, "champ")) return false;
      if (!c->editable) {
        refuser(cible, cible + " ne se saisit pas.");
        return false;
      }
      Field* field = window.champ(cible);
      if (field == nullptr) throw UException("the window has no field for control " + cible);
      std::string texte = action.valeur;
      if (!c->valeurs.empty()) {
        const ValeurPermise* permise = nullptr;
        for (const auto& v : c->valeurs) {
          if (v.valeur == texte || (!v.libelle.empty() && v.libelle == texte)) permise = &v;
        }
        if (permise == nullptr) {
          std::string valeurs;
          for (const auto& v : c->valeurs) {
            valeurs += (valeurs.empty() ? "" : ", ") + (v.valeur.empty() ? "(vide)" : v.valeur);
          }
          refuser(cible, cible + " : " + guillemets(texte) + " n'est pas une valeur permise (" +
                             valeurs + ").");
          return false;
        }
        texte = permise->valeur;
      }
      auto converti = Valeur::chaine(texte).convertTo(field->kind());
      if (!converti) {
        refuser(cible,
                cible + " : " + guillemets(texte) + " n'est pas " + attendu(field->kind()) + ".");
        return false;
      }
      return fenetre->saisirChamp(*field, *converti, c->evenements);
    }
    case Action::Genre::Cellule: {
      const DescListe* l = d.liste(cible);
      if (l == nullptr || !atteint(cible, "liste")) {
        if (l == nullptr) refuser(cible, "L'écran " + d.ecran + " n'a pas de liste " + cible + ".");
        return false;
      }
      if (!ligneDe(e.liste(cible))) return false;
      const DescColonne* colonne = nullptr;
      size_t n = 0;
      auto [end, ec] =
          std::from_chars(action.colonne.data(), action.colonne.data() + action.colonne.size(), n);
      if (ec == std::errc() && end == action.colonne.data() + action.colonne.size()) {
        if (n >= 1 && n <= l->colonnes.size()) colonne = &l->colonnes[n - 1];
      } else {
        for (const auto& c : l->colonnes) {
          if (c.nom == action.colonne) colonne = &c;
        }
      }
      if (colonne == nullptr) {
        refuser(cible, "La liste " + cible + " n'a pas de colonne " + action.colonne + ".");
        return false;
      }
      if (!colonne->editable || !e.accessible(colonne->nom)) {
        refuser(colonne->nom, "La colonne " + colonne->nom + " ne se saisit pas.");
        return false;
      }
      Kind kind = kindDe(colonne->genre);
      auto converti = Valeur::chaine(action.valeur).convertTo(kind);
      if (!converti) {
        refuser(colonne->nom, colonne->nom + " : " + guillemets(action.valeur) + " n'est pas " +
                                  attendu(kind) + ".");
        return false;
      }
      std::string texte = kind == Kind::Chaine ? action.valeur : converti->toChaine();
      return fenetre->saisirCellule(cible, action.ligne, colonne->nom, texte);
    }
    case Action::Genre::Selectionner:
    case Action::Genre::Supprimer: {
      if (d.liste(cible) == nullptr) {
        refuser(cible, "L'écran " + d.ecran + " n'a pas de liste " + cible + ".");
        return false;
      }
      if (!atteint(cible, "liste") || !ligneDe(e.liste(cible))) return false;
      return action.genre == Action::Genre::Selectionner
                 ? fenetre->selectionnerLigne(cible, action.ligne)
                 : fenetre->supprimerLigne(cible, action.ligne);
    }
    case Action::Genre::Nouvelle:
      if (d.liste(cible) == nullptr) {
        refuser(cible, "L'écran " + d.ecran + " n'a pas de liste " + cible + ".");
        return false;
      }
      return atteint(cible, "liste") && fenetre->nouvelleLigne(cible);
    case Action::Genre::Onglet: {
      if (d.onglet(cible) == nullptr) {
        refuser(cible, "L'écran " + d.ecran + " n'a pas d'onglet " + cible + ".");
        return false;
      }
      if (!atteint(cible, "onglet") || !atteint(d.controleOnglets, "onglet")) return false;
      if (e.onglet() == cible) return true;  // the tab shown already: nothing happens
      return fenetre->demanderOnglet(cible);
    }
    case Action::Genre::Presser:
      if (d.bouton(cible) == nullptr) {
        refuser(cible, "L'écran " + d.ecran + " n'a pas de bouton " + cible + ".");
        return false;
      }
      return atteint(cible, "bouton") && fenetre->presserBouton(cible);
    case Action::Genre::Fermer:
      fenetre->fermer();
      return true;
    case Action::Genre::Repondre:
      break;
  }
  refuser("", "Aucune question n'attend de réponse.");
  return false;
}

void ModeleEcran::noterFermeture(Automate& window) {
  fermes_.clear();
  for (const auto& field : window.champs()) fermes_[field->name()] = field->text();
  resultat_ = window.outcome();
}

}  // namespace quarvo::host

// What the screens show at one moment, as plain data: the stack of open windows (innermost
// last), the last refusal, the messages shown since the last action, the pending dialog and the
// waiting box. The screen model builds it between two actions; any driver draws it. It prints
// as stable text (test transcripts, the terminal) and as JSON (the web page's protocol, whose
// top-level keys are `version`, `windows`, `refusal`, `messages`, `dialog`, `progress`).
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace quarvo::host {

struct EtatControle {
  std::string nom;
  std::string libelle;
  bool actif = true;
  bool visible = true;
  std::string valeur;  // fields only: the field's value as text
};

struct EtatColonne {
  std::string nom;
  std::string entete;
  bool editable = false;
};

struct EtatListe {
  std::string nom;
  std::vector<EtatColonne> colonnes;
  std::vector<std::vector<std::string>> lignes;
  size_t courante = 0;  // from 1; 0 when none
};

struct EtatFenetre {
  std::string ecran;
  std::string titre;
  std::string mode;
  std::string onglet;
  std::string focus;
  std::vector<EtatControle> champs;
  std::vector<EtatControle> boutons;
  std::vector<EtatControle> onglets;
  std::vector<EtatListe> listes;
  bool nonEnregistre = false;
};

struct EtatRefus {
  std::string controle;
  std::string texte;
};

struct EtatDialogue {
  enum class Genre { Message, Choix, Fichier };
  Genre genre = Genre::Message;
  std::string titre;
  std::string texte;
  std::vector<std::string> boutons;   // a message's buttons, as captioned
  std::vector<std::string> elements;  // a choice list's items
};

struct EtatProgression {
  std::string titre;
  std::string texte;
  int64_t fait = 0;
  int64_t total = 0;
};

struct EtatEcrans {
  static constexpr int kVersion = 1;
  std::vector<EtatFenetre> fenetres;
  std::optional<EtatRefus> refus;
  std::vector<std::string> messages;
  std::optional<EtatDialogue> dialogue;
  std::optional<EtatProgression> progression;
};

// Stable text, one line per thing shown, ending with a newline.
std::string enTexte(const EtatEcrans& etat);
// One JSON object on one line, without a newline.
std::string enJson(const EtatEcrans& etat);

}  // namespace quarvo::host

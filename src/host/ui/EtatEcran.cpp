#include "host/ui/EtatEcran.h"

#include <nlohmann/json.hpp>

namespace quarvo::host {

using ojson = nlohmann::ordered_json;

namespace {

std::string etatControle(const EtatControle& c) {
  std::string out;
  if (!c.actif) out += " [disabled]";
  if (!c.visible) out += " [hidden]";
  return out;
}

std::string nommer(const EtatControle& c) {
  return c.libelle.empty() ? c.nom : c.nom + " (" + c.libelle + ")";
}

// A cell or a value on one line: its line breaks shown as "\n".
std::string uneLigne(const std::string& text) {
  std::string out;
  for (char ch : text) {
    if (ch == '\n') {
      out += "\\n";
    } else {
      out += ch;
    }
  }
  return out;
}

const char* genreDialogue(EtatDialogue::Genre g) {
  switch (g) {
    case EtatDialogue::Genre::Choix:
      return "choice";
    case EtatDialogue::Genre::Fichier:
      return "file";
    case EtatDialogue::Genre::Message:
      break;
  }
  return "message";
}

void fenetreEnTexte(const EtatFenetre& f, std::string& out) {
  out += "window " + f.ecran;
  if (!f.titre.empty()) out += " \"" + f.titre + "\"";
  if (!f.mode.empty()) out += " mode " + f.mode;
  if (!f.onglet.empty()) out += " tab " + f.onglet;
  if (!f.focus.empty()) out += " focus " + f.focus;
  if (f.nonEnregistre) out += " unsaved";
  out += "\n";
  for (const auto& c : f.champs) {
    out += "  " + nommer(c) + " = " + uneLigne(c.valeur) + etatControle(c) + "\n";
  }
  auto rangee = [&out](const char* what, const std::vector<EtatControle>& items,
                       const std::string& current) {
    if (items.empty()) return;
    out += std::string("  ") + what + ":";
    for (const auto& c : items) {
      out += " [" + nommer(c) + (c.nom == current ? " *" : "") + etatControle(c) + "]";
    }
    out += "\n";
  };
  rangee("tabs", f.onglets, f.onglet);
  rangee("buttons", f.boutons, "");
  for (const auto& l : f.listes) {
    out += "  list " + l.nom + ":";
    for (const auto& c : l.colonnes) {
      out += " " + c.nom + (c.entete.empty() ? "" : " (" + c.entete + ")") +
             (c.editable ? " [editable]" : "") + ";";
    }
    out += " " + std::to_string(l.lignes.size()) + " rows";
    if (l.courante != 0) out += ", current " + std::to_string(l.courante);
    out += "\n";
    for (size_t i = 0; i < l.lignes.size(); ++i) {
      out += "    " + std::to_string(i + 1) + (i + 1 == l.courante ? "*" : "") + " |";
      for (const auto& cell : l.lignes[i]) out += " " + uneLigne(cell) + " |";
      out += "\n";
    }
  }
}

ojson controleEnJson(const EtatControle& c, bool valeur) {
  ojson j = ojson::object();
  if (valeur) j["value"] = c.valeur;
  j["enabled"] = c.actif;
  j["visible"] = c.visible;
  j["label"] = c.libelle;
  return j;
}

}  // namespace

std::string enTexte(const EtatEcrans& etat) {
  std::string out;
  if (etat.fenetres.empty()) out += "no window open\n";
  for (const auto& f : etat.fenetres) fenetreEnTexte(f, out);
  for (const auto& m : etat.messages) out += "message: " + uneLigne(m) + "\n";
  if (etat.refus) {
    out += "refused" + (etat.refus->controle.empty() ? "" : " on " + etat.refus->controle) + ": " +
           uneLigne(etat.refus->texte) + "\n";
  }
  if (etat.dialogue) {
    const auto& d = *etat.dialogue;
    out += std::string("dialog ") + genreDialogue(d.genre) + " \"" + d.titre +
           "\": " + uneLigne(d.texte);
    for (size_t i = 0; i < d.boutons.size(); ++i) {
      out += " [" + std::to_string(i + 1) + " " + d.boutons[i] + "]";
    }
    for (size_t i = 0; i < d.elements.size(); ++i) {
      out += " (" + std::to_string(i + 1) + " " + d.elements[i] + ")";
    }
    out += "\n";
  }
  if (etat.progression) {
    const auto& p = *etat.progression;
    out += "progress \"" + p.titre + "\" " + uneLigne(p.texte) + " " + std::to_string(p.fait) +
           "/" + std::to_string(p.total) + "\n";
  }
  return out;
}

std::string enJson(const EtatEcrans& etat) {
  ojson j = ojson::object();
  j["version"] = EtatEcrans::kVersion;
  ojson fenetres = ojson::array();
  for (const auto& f : etat.fenetres) {
    ojson w = ojson::object();
    w["screen"] = f.ecran;
    w["title"] = f.titre;
    w["mode"] = f.mode;
    w["tab"] = f.onglet;
    w["focus"] = f.focus;
    ojson fields = ojson::object();
    for (const auto& c : f.champs) fields[c.nom] = controleEnJson(c, true);
    w["fields"] = std::move(fields);
    ojson buttons = ojson::object();
    for (const auto& c : f.boutons) buttons[c.nom] = controleEnJson(c, false);
    w["buttons"] = std::move(buttons);
    ojson tabs = ojson::object();
    for (const auto& c : f.onglets) tabs[c.nom] = controleEnJson(c, false);
    w["tabs"] = std::move(tabs);
    ojson lists = ojson::object();
    for (const auto& l : f.listes) {
      ojson list = ojson::object();
      ojson columns = ojson::array();
      for (const auto& c : l.colonnes) {
        columns.push_back({{"name", c.nom}, {"header", c.entete}, {"editable", c.editable}});
      }
      list["columns"] = std::move(columns);
      list["rows"] = l.lignes;
      list["current"] = l.courante == 0 ? ojson(nullptr) : ojson(l.courante);
      lists[l.nom] = std::move(list);
    }
    w["lists"] = std::move(lists);
    w["unsaved"] = f.nonEnregistre;
    fenetres.push_back(std::move(w));
  }
  j["windows"] = std::move(fenetres);
  j["refusal"] = etat.refus ? ojson{{"control", etat.refus->controle}, {"text", etat.refus->texte}}
                            : ojson(nullptr);
  j["messages"] = etat.messages;
  if (etat.dialogue) {
    const auto& d = *etat.dialogue;
    ojson dialog = {{"kind", genreDialogue(d.genre)}, {"title", d.titre}, {"text", d.texte}};
    if (d.genre == EtatDialogue::Genre::Choix) {
      dialog["items"] = d.elements;
    } else {
      dialog["buttons"] = d.boutons;
    }
    j["dialog"] = std::move(dialog);
  } else {
    j["dialog"] = nullptr;
  }
  j["progress"] = etat.progression ? ojson{{"title", etat.progression->titre},
                                           {"text", etat.progression->texte},
                                           {"done", etat.progression->fait},
                                           {"total", etat.progression->total}}
                                   : ojson(nullptr);
  // Texts that are not valid UTF-8 (a Windows-1252 file name) are replaced, not refused.
  return j.dump(-1, ' ', false, ojson::error_handler_t::replace);
}

}  // namespace quarvo::host

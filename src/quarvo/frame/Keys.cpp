#include "quarvo/frame/Keys.h"

namespace quarvo::frame {

std::string cleCompo(const std::string& aflbudIdent, const std::string& composant,
                     const std::string& piece) {
  return aflbudIdent + "|" + composant + "|" + piece;
}

std::string cleCompo2(const std::string& composant, const std::string& composantIdent) {
  return composant + "|" + composantIdent + "|";
}

std::string cleChainageSource(int64_t type, const std::string& ident) {
  return std::to_string(type) + "|" + ident + "|";
}

std::string numeroLigne(const std::string& headerIdent, const std::string& lineNumber) {
  return headerIdent + "|" + lineNumber;
}

}  // namespace quarvo::frame

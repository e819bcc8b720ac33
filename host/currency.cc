#include "host/currency.h"

#include "host/clock.h"
#include "host/error.h"
#include "host/session.h"
#include "host/snapshot.h"

namespace host {

namespace {

std::string named(std::string_view ident) { return "« " + std::string(ident) + " »"; }

// A text as a message quotes it: a long one is cut, so that a message stays readable.
std::string quoted(std::string_view text) {
  constexpr std::size_t kShown = 24;
  return "« " + std::string(text.substr(0, kShown)) + (text.size() > kShown ? "…" : "") + " »";
}

// The rate rule without its rounding: the product first, then the one division.
Decimal scaled(const Decimal& amount, const Decimal& fromRate, const Decimal& toRate) {
  return amount * toRate / fromRate;
}

}  // namespace

std::string amountText(const Decimal& amount, int decimals) { return amount.toFixed(decimals); }

std::string frenchAmountText(const Decimal& amount, int decimals) {
  std::string plain = amountText(amount, decimals);
  std::size_t digits = plain[0] == '-' ? 1 : 0;
  std::size_t point = plain.find('.');
  std::size_t end = point == std::string::npos ? plain.size() : point;
  std::string out = plain.substr(0, digits);
  for (std::size_t i = digits; i < end; ++i) {
    if (i > digits && (end - i) % 3 == 0) out += ' ';
    out += plain[i];
  }
  if (point != std::string::npos) out += "," + plain.substr(point + 1);
  return out;
}

Decimal typedAmount(std::string_view text, int decimals, std::string_view what) {
  Decimal amount = Valeur::depuisTexte(Genre::Monnaie, text, what).decimal();
  Decimal limit(1);
  for (int i = 0; i < kAmountMaxIntegerDigits; ++i) limit *= Decimal(10);
  if (amount.abs() >= limit)
    throw HostError("Le montant " + quoted(text) + " est trop grand : " + std::to_string(kAmountMaxIntegerDigits) +
                    " chiffres au plus avant la virgule" + (what.empty() ? "" : " (" + std::string(what) + ")"));
  return amount.rounded(decimals);
}

Devises::Devises(Session& session) : session_(session) {}

Jour Devises::dayOrToday(const Jour& day) const { return day ? day : Jour(clock::today()); }

Devises::Facts Devises::facts(std::string_view ident) const {
  if (ident.empty()) throw HostError("monnaie non renseignée");
  Statement& s = session_.base().prepare("SELECT DECIMALES, ZONE_EURO, COURS_FIXE FROM MONNAIE WHERE IDENT = ?");
  s.bind(1, ident);
  if (!s.step()) {
    s.reset();
    throw HostError("monnaie " + named(ident) + " inconnue du dossier");
  }
  Facts f{static_cast<int>(s.integer(0)), s.text(1) == "O", Decimal::fromDouble(s.real(2))};
  s.reset();
  return f;
}

int Devises::decimales(std::string_view ident) const { return facts(ident).decimals; }

bool Devises::estZoneEuro(std::string_view ident) const { return facts(ident).euroZone; }

bool Devises::estReference(std::string_view ident) const {
  facts(ident);  // an unknown code is an error, not a "no"
  return ident == kReference;
}

bool Devises::estCoursFixe(std::string_view ident) const {
  return estReference(ident) || !facts(ident).fixedRate.isZero();
}

Decimal Devises::cours(std::string_view ident, const Jour& day) const {
  Facts f = facts(ident);
  if (ident == kReference) return Decimal(1);
  if (!f.fixedRate.isZero()) return f.fixedRate;
  Jour when = dayOrToday(day);
  if (auto typed = typed_.find({std::string(ident), jourIso(when)}); typed != typed_.end()) return typed->second;
  Statement& s = session_.base().prepare(
      "SELECT COURS FROM MONNAIE_COURS WHERE IDENT = ? AND DTCOURS <= ? ORDER BY DTCOURS DESC LIMIT 1");
  s.bind(1, ident);
  s.bind(2, std::string_view(jourIso(when)));
  bool found = s.step();
  Decimal rate = found ? Decimal::fromDouble(s.real(0)) : Decimal();
  s.reset();
  if (!found) throw HostError("aucun cours de la monnaie " + named(ident) + " au " + jourTexte(when));
  if (rate.sign() <= 0) throw HostError("cours de la monnaie " + named(ident) + " au " + jourTexte(when) + " invalide");
  return rate;
}

std::string Devises::tenue() const {
  Statement& s = session_.base().prepare("SELECT MONNAIE_IDENT FROM PARAM WHERE PNUME = 1");
  bool found = s.step();
  std::string ident = found ? s.text(0) : std::string();
  s.reset();
  if (!found) throw HostError("paramètres du dossier introuvables : monnaie de tenue inconnue");
  return ident;
}

Decimal Devises::convertir(const Decimal& amount, std::string_view from, std::string_view to,
                           const Jour& day) const {
  if (from == to) {
    facts(from);
    return amount;
  }
  return scaled(amount, cours(from, day), cours(to, day));
}

Decimal Devises::arrondir(const Decimal& amount, std::string_view ident) const {
  return Monnaie::valeurArrondie(amount, decimales(ident), "=");
}

Decimal Devises::reprice(const Decimal& amount, const Decimal& fromRate, const Decimal& toRate,
                         std::string_view ident) const {
  return arrondir(scaled(amount, fromRate, toRate), ident);
}

std::string Devises::texte(const Decimal& amount, std::string_view ident) const {
  return amountText(amount, decimales(ident));
}

Decimal Devises::saisi(std::string_view text, std::string_view ident, std::string_view what) const {
  return typedAmount(text, decimales(ident), what);
}

void Devises::saisirCours(std::string_view ident, const Jour& day, const Decimal& rate) {
  if (estCoursFixe(ident)) throw HostError("le cours de la monnaie " + named(ident) + " est fixe");
  if (rate.sign() <= 0)
    throw HostError("cours « " + rate.toString(0) + " » de la monnaie " + named(ident) + " invalide");
  typed_[{std::string(ident), jourIso(dayOrToday(day))}] = rate;
}

void Devises::definirCourante(std::string_view ident, const Jour& day, std::optional<Decimal> rate) {
  Jour when = dayOrToday(day);
  Decimal own = cours(ident, when);
  if (rate && !rate->isZero() && *rate != own) {
    if (estCoursFixe(ident))
      throw HostError("le cours de la monnaie " + named(ident) + " est fixe : " + own.toString(0));
    if (rate->sign() < 0)
      throw HostError("cours « " + rate->toString(0) + " » de la monnaie " + named(ident) + " invalide");
    own = *rate;
  }
  current_ = std::string(ident);
  current_rate_ = own;
  current_day_ = when;
}

std::string Devises::courante() const { return current_ ? *current_ : tenue(); }

Decimal Devises::coursCourant() const { return current_ ? current_rate_ : cours(tenue(), Jour()); }

Jour Devises::dateCourante() const { return current_ ? current_day_ : Jour(clock::today()); }

Decimal Devises::conversion(const Donnee& montant, int sens, const Donnee& date, const Donnee& rate) const {
  std::string keeping = tenue();
  std::string current = courante();
  if (sens != 0 && sens != 1) throw HostError("sens de conversion « " + std::to_string(sens) + " » inconnu");
  if (current == keeping) return arrondir(montant.decimal(), keeping);
  Jour day = date.estVide() ? dateCourante() : date.jour();
  Decimal currentRate = rate.estVide() ? (date.estVide() ? coursCourant() : cours(current, day)) : rate.decimal();
  if (currentRate.sign() <= 0)
    throw HostError("cours « " + currentRate.toString(0) + " » de la monnaie " + named(current) + " invalide");
  // The current currency goes through its own rate (perhaps typed on the document);
  // the keeping currency through the dossier's rate of the day.
  Decimal keepingRate = cours(keeping, day);
  if (sens == 0) return reprice(montant.decimal(), keepingRate, currentRate, current);
  return reprice(montant.decimal(), currentRate, keepingRate, keeping);
}

void Devises::definirBascule(std::string_view source, std::string_view cible) {
  facts(source);
  facts(cible);
  source_ = std::string(source);
  cible_ = std::string(cible);
}

Devises& euro() {
  Session& session = Session::courante();
  std::shared_ptr<Devises>& service = session.devises();
  if (!service) service = std::make_shared<Devises>(session);
  return *service;
}

void Devises::keepState(Snapshot& snapshot) {
  snapshot.keep(current_, current_rate_, current_day_, source_, cible_, typed_);
}

}  // namespace host

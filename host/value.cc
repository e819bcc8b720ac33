#include "host/value.h"

#include <charconv>
#include <cmath>
#include <cstdio>
#include <limits>
#include <stdexcept>

#include "host/automate.h"
#include "host/clock.h"
#include "host/error.h"
#include "host/snapshot.h"
#include "host/text.h"

namespace host {

using namespace std::chrono;

const char* nomGenre(Genre genre) {
  switch (genre) {
    case Genre::Texte: return "texte";
    case Genre::Entier: return "entier";
    case Genre::Double:
    case Genre::Simple: return "nombre";
    case Genre::Date: return "date";
    case Genre::Monnaie: return "montant";
  }
  return "?";
}

std::string jourTexte(const Jour& day) {
  if (!day) return {};
  char buffer[16];
  std::snprintf(buffer, sizeof buffer, "%02u/%02u/%04d", unsigned(day->day()), unsigned(day->month()),
                int(day->year()));
  return buffer;
}

std::string jourIso(const Jour& day) {
  if (!day) return {};
  char buffer[16];
  std::snprintf(buffer, sizeof buffer, "%04d-%02u-%02u", int(day->year()), unsigned(day->month()),
                unsigned(day->day()));
  return buffer;
}

std::string yearMonth(const Jour& day) {
  if (!day) return {};
  char buffer[16];
  std::snprintf(buffer, sizeof buffer, "%04d%02u", int(day->year()), unsigned(day->month()));
  return buffer;
}

namespace {

bool readNumber(std::string_view s, int& out) {
  if (s.empty()) return false;
  auto [end, ec] = std::from_chars(s.data(), s.data() + s.size(), out);
  return ec == std::errc() && end == s.data() + s.size();
}

std::optional<Jour> makeDay(int y, int m, int d) {
  year_month_day day{year(y), month(static_cast<unsigned>(m)), std::chrono::day(static_cast<unsigned>(d))};
  if (m < 1 || m > 12 || d < 1 || !day.ok() || y < 1 || y > 9999) return std::nullopt;
  return Jour(day);
}

}  // namespace

std::optional<Jour> lireJour(std::string_view raw) {
  std::string text = text::trim(raw);
  if (text.empty()) return Jour();
  int y = 0, m = 0, d = 0;
  if (text.size() == 10 && text[4] == '-' && text[7] == '-') {
    if (readNumber(std::string_view(text).substr(0, 4), y) && readNumber(std::string_view(text).substr(5, 2), m) &&
        readNumber(std::string_view(text).substr(8, 2), d))
      return makeDay(y, m, d);
    return std::nullopt;
  }
  if ((text.size() == 8 || text.size() == 6) && text.find_first_not_of("0123456789") == std::string::npos) {
    readNumber(std::string_view(text).substr(0, 2), d);
    readNumber(std::string_view(text).substr(2, 2), m);
    readNumber(std::string_view(text).substr(4), y);
    // Two digits of year, as accountants type them: 00 to 68 are this century, 69
    // to 99 the last one (the usual window of two-digit years).
    if (text.size() == 6) y += y <= 68 ? 2000 : 1900;
    return makeDay(y, m, d);
  }
  std::size_t first = text.find('/');
  std::size_t second = first == std::string::npos ? first : text.find('/', first + 1);
  if (second == std::string::npos) return std::nullopt;
  std::string_view view(text);
  if (!readNumber(view.substr(0, first), d) || !readNumber(view.substr(first + 1, second - first - 1), m) ||
      !readNumber(view.substr(second + 1), y) || view.size() - second - 1 != 4)
    return std::nullopt;
  return makeDay(y, m, d);
}

// ---------------------------------------------------------------------------- Valeur

Valeur Valeur::texte(std::string s) {
  Valeur v;
  v.v_ = std::move(s);
  return v;
}
Valeur Valeur::entier(long long n) {
  Valeur v;
  v.genre_ = Genre::Entier;
  v.v_ = n;
  return v;
}
Valeur Valeur::reel(double d) {
  Valeur v;
  v.genre_ = Genre::Double;
  v.v_ = d;
  return v;
}
Valeur Valeur::simple(float f) {
  Valeur v;
  v.genre_ = Genre::Simple;
  v.v_ = f;
  return v;
}
Valeur Valeur::date(Jour d) {
  Valeur v;
  v.genre_ = Genre::Date;
  v.v_ = d;
  return v;
}
Valeur Valeur::montant(Decimal m) {
  Valeur v;
  v.genre_ = Genre::Monnaie;
  v.v_ = std::move(m);
  return v;
}

Valeur Valeur::vide(Genre genre) {
  switch (genre) {
    case Genre::Texte: return texte("");
    case Genre::Entier: return entier(0);
    case Genre::Double: return reel(0);
    case Genre::Simple: return simple(0);
    case Genre::Date: return date(std::nullopt);
    case Genre::Monnaie: return montant(Decimal());
  }
  return {};
}

namespace {
[[noreturn]] void refuse(std::string_view text, Genre genre, std::string_view what) {
  std::string message = "« " + std::string(text) + " » n'est pas ";
  message += genre == Genre::Date ? "une date" : (genre == Genre::Monnaie ? "un montant" : "un nombre");
  if (!what.empty()) message += " (" + std::string(what) + ")";
  throw HostError(message);
}
[[noreturn]] void refuseTooLarge(std::string_view text, const char* kind, std::string_view what) {
  throw HostError("« " + std::string(text) + " » est trop grand pour " + kind +
                  (what.empty() ? std::string() : " (" + std::string(what) + ")"));
}
}  // namespace

Valeur Valeur::depuisTexte(Genre genre, std::string_view text, std::string_view what) {
  if (genre == Genre::Texte) return texte(std::string(text));
  if (genre == Genre::Date) {
    auto day = lireJour(text);
    if (!day) refuse(text, genre, what);
    return date(*day);
  }
  if (text::trim(text).empty()) return vide(genre);
  auto number = Decimal::parse(text);
  if (!number) refuse(text, genre, what);
  switch (genre) {
    case Genre::Entier:
      if (number->truncated(0) != *number) refuse(text, genre, what);
      try {
        return entier(number->toInteger());
      } catch (const std::overflow_error&) {
        refuseTooLarge(text, "un entier", what);
      }
    case Genre::Double:
    case Genre::Simple: {
      // A number read into a double or a float that cannot hold it is refused, not
      // kept as an infinity that no screen can show.
      double binary = number->toDouble();
      bool fits = genre == Genre::Double ? std::isfinite(binary)
                                         : std::abs(binary) <= std::numeric_limits<float>::max();
      if (!fits) refuseTooLarge(text, "un nombre", what);
      return genre == Genre::Double ? reel(binary) : simple(static_cast<float>(binary));
    }
    default: return montant(*number);
  }
}

std::string Valeur::chaine() const {
  switch (genre_) {
    case Genre::Texte: return std::get<std::string>(v_);
    case Genre::Entier: return std::to_string(std::get<long long>(v_));
    case Genre::Double: return Decimal::fromDouble(std::get<double>(v_)).toString(0);
    case Genre::Simple: return Decimal::fromFloat(std::get<float>(v_)).toString(0);
    case Genre::Date: return jourTexte(std::get<Jour>(v_));
    case Genre::Monnaie: return std::get<Decimal>(v_).toString(2);
  }
  return {};
}

std::string Valeur::stockage() const {
  if (genre_ == Genre::Date) return jourIso(std::get<Jour>(v_));
  if (genre_ == Genre::Monnaie) return std::get<Decimal>(v_).toString(0);
  return chaine();
}

Decimal Valeur::decimal() const {
  switch (genre_) {
    case Genre::Texte: return depuisTexte(Genre::Monnaie, std::get<std::string>(v_)).decimal();
    case Genre::Entier: return Decimal(std::get<long long>(v_));
    case Genre::Double: return Decimal::fromDouble(std::get<double>(v_));
    case Genre::Simple: return Decimal::fromFloat(std::get<float>(v_));
    case Genre::Date: {
      const Jour& day = std::get<Jour>(v_);
      return day ? Decimal(sys_days(*day).time_since_epoch().count()) : Decimal();
    }
    case Genre::Monnaie: return std::get<Decimal>(v_);
  }
  return {};
}

long long Valeur::entier() const {
  if (genre_ == Genre::Entier) return std::get<long long>(v_);
  return decimal().toInteger();
}

double Valeur::reel() const {
  if (genre_ == Genre::Double) return std::get<double>(v_);
  // A float widened bit for bit would carry its binary noise (19.6f is
  // 19.600000381...): it goes through its shortest decimal text instead.
  if (genre_ == Genre::Simple) return decimal().toDouble();
  return decimal().toDouble();
}

Jour Valeur::jour() const {
  if (genre_ == Genre::Date) return std::get<Jour>(v_);
  if (genre_ == Genre::Texte) return depuisTexte(Genre::Date, std::get<std::string>(v_)).jour();
  throw HostError("un " + std::string(nomGenre(genre_)) + " n'est pas une date");
}

bool Valeur::estVide() const {
  switch (genre_) {
    case Genre::Texte: return std::get<std::string>(v_).empty();
    case Genre::Date: return !std::get<Jour>(v_).has_value();
    default: return decimal().isZero();
  }
}

Valeur Valeur::vers(Genre genre, std::string_view what) const {
  if (genre == genre_) return *this;
  switch (genre) {
    case Genre::Texte: return texte(genre_ == Genre::Date ? jourTexte(jour()) : chaine());
    case Genre::Date:
      if (genre_ == Genre::Texte) return depuisTexte(Genre::Date, std::get<std::string>(v_), what);
      throw HostError("un " + std::string(nomGenre(genre_)) + " ne peut devenir une date" +
                      (what.empty() ? "" : " (" + std::string(what) + ")"));
    default:
      if (genre_ == Genre::Texte) return depuisTexte(genre, std::get<std::string>(v_), what);
      if (genre_ == Genre::Date) throw HostError("une date n'est pas un nombre (" + std::string(what) + ")");
      switch (genre) {
        case Genre::Entier: return entier(decimal().toInteger());
        case Genre::Double: return reel(reel());
        case Genre::Simple: return simple(static_cast<float>(reel()));
        default: return montant(decimal());
      }
  }
}

int comparer(const Valeur& a, const Valeur& b) {
  auto sign = [](auto x, auto y) { return x < y ? -1 : (y < x ? 1 : 0); };
  if (a.genre() == Genre::Date || b.genre() == Genre::Date) {
    Jour x = a.jour(), y = b.jour();
    if (!x || !y) return sign(x.has_value(), y.has_value());
    return sign(sys_days(*x), sys_days(*y));
  }
  if (a.genre() == Genre::Texte && b.genre() == Genre::Texte) return sign(a.chaine(), b.chaine());
  return sign(a.decimal(), b.decimal());
}

// ---------------------------------------------------------------------------- Donnee

Donnee::Donnee(Genre genre, const char* nom, const char* libelle, const char* tiers, int acces, Automate* owner)
    : genre_(genre),
      nom_(nom ? nom : ""),
      libelle_(libelle ? libelle : ""),
      tiers_(tiers ? tiers : ""),
      acces_(acces),
      owner_(owner),
      own_(Valeur::vide(genre)) {
  if (owner_) owner_->declarerVariable(this);
}

Donnee::Donnee(Valeur valeur) : genre_(valeur.genre()), own_(std::move(valeur)) {}

Donnee::~Donnee() {
  if (owner_) owner_->oublierVariable(this);
}

std::string Donnee::designation() const { return nom_.empty() ? std::string("valeur") : nom_; }

Valeur Donnee::valeur() const {
  if (bound_) return bound_->valeur().vers(genre(), designation());
  return lire();
}

void Donnee::affecter(const Valeur& v) {
  if (bound_) {
    bound_->affecter(v);
    return;
  }
  ecrire(v.vers(genre(), designation()));
}

void Donnee::affecterTexte(std::string_view text) { affecter(Valeur::depuisTexte(genre(), text, designation())); }

Donnee& Donnee::operator=(const Donnee& other) {
  if (this != &other) affecter(other.valeur());
  return *this;
}

Donnee& Donnee::operator=(const Valeur& v) {
  affecter(v);
  return *this;
}

Donnee& Donnee::operator=(std::string_view text) {
  affecterTexte(text);
  return *this;
}

std::string Donnee::operator()(long from, long to) const { return text::substring(chaine(), from, to); }
std::size_t Donnee::position(std::string_view needle) const { return text::position(chaine(), needle); }
std::string Donnee::droite(long count) const { return text::right(chaine(), count); }
std::size_t Donnee::longueur() const { return text::length(chaine()); }

void Donnee::lier(Donnee& target) {
  for (Donnee* p = &target; p; p = p->bound_)
    if (p == this) throw HostError("liaison circulaire de " + designation());
  bound_ = &target;
}

std::string operator+(const Donnee& a, std::string_view b) { return a.chaine() + std::string(b); }
std::string operator+(std::string_view a, const Donnee& b) { return std::string(a) + b.chaine(); }
std::string operator+(const Donnee& a, const char* b) { return a.chaine() + b; }
std::string operator+(const char* a, const Donnee& b) { return a + b.chaine(); }
std::string operator+(const Donnee& a, const std::string& b) { return a.chaine() + b; }
std::string operator+(const std::string& a, const Donnee& b) { return a + b.chaine(); }
std::string operator+(const Donnee& a, const Donnee& b) { return a.chaine() + b.chaine(); }

// ---------------------------------------------------------------------------- Date, Monnaie

long Date::jDate(std::string_view text) {
  auto day = lireJour(text);
  if (!day || !*day) throw HostError("« " + std::string(text) + " » n'est pas une date");
  return static_cast<long>(sys_days(**day).time_since_epoch().count());
}

long Date::finMois(long day) {
  year_month_day d{sys_days(days(day))};
  year_month_day_last last{d.year(), month_day_last(d.month())};
  return static_cast<long>(sys_days(last).time_since_epoch().count());
}

Valeur Date::dJour(long day) { return Valeur::date(year_month_day{sys_days(days(day))}); }

std::string Date::eDate(std::string_view text, std::string_view separator) {
  year_month_day d{sys_days(days(jDate(text)))};
  char out[32];
  std::snprintf(out, sizeof out, "%02u%.*s%02u%.*s%04d", static_cast<unsigned>(d.day()),
                static_cast<int>(separator.size()), separator.data(), static_cast<unsigned>(d.month()),
                static_cast<int>(separator.size()), separator.data(), static_cast<int>(d.year()));
  return out;
}

long Date::eDate() const {
  Jour day = jour();
  if (!day) throw HostError("la date " + nom() + " est vide");
  return static_cast<long>(sys_days(*day).time_since_epoch().count());
}

Valeur Date::dateCourante() { return Valeur::date(clock::today()); }
std::string Date::heureCourante() { return clock::timeOfDay(); }

Decimal Monnaie::valeurArrondie(const Decimal& value, int decimals, std::string_view mode) {
  if (mode == "=") return value.rounded(decimals);
  if (mode == "-") return value.truncated(decimals);
  if (mode == "+") {
    Decimal cut = value.truncated(decimals);
    if (cut == value) return cut;
    Decimal step = Decimal(1);
    for (int i = 0; i < decimals; ++i) step /= Decimal(10);
    return value.sign() < 0 ? cut - step : cut + step;
  }
  throw HostError("mode d'arrondi inconnu « " + std::string(mode) + " »");
}

void Donnee::keepState(Snapshot& snapshot) {
  snapshot.keep(own_, bound_);
}

}  // namespace host

// Values of the host: the named variables of an automaton (Chaine, Entier, Double,
// Simple, Date, Monnaie), literals, and fields of a table, which all read like one.
//
// A Valeur is one value of one kind. A Donnee is a named place holding a Valeur:
// an automaton's variable, a literal, or (Champ, in table.h) a field of a table's
// record buffer. Writing converts to the place's kind and refuses, with a HostError
// naming the place, a text that is not a number or a date.
//
// A Donnee may be bound to another one (Evt::param with mode 1): from then on it
// reads and writes the other's value, so a callee's result lands in the caller's
// variable. The bound-to value must outlive the binding.
#pragma once

#include <chrono>
#include <optional>
#include <string>
#include <string_view>
#include <variant>

#include "host/decimal.h"

namespace host {

class Automate;
class Snapshot;

enum class Genre { Texte, Entier, Double, Simple, Date, Monnaie };
const char* nomGenre(Genre genre);

using Jour = std::optional<std::chrono::year_month_day>;

// Text forms of dates: "DD/MM/YYYY" for people, "YYYY-MM-DD" for storage.
std::string jourTexte(const Jour& day);
std::string jourIso(const Jour& day);
// The year and month of a day, "YYYYMM": the form counters and closed periods are
// kept in, and compared as text. "" for the empty date.
std::string yearMonth(const Jour& day);
// Reads "DD/MM/YYYY", "D/M/YYYY", "DDMMYYYY", "DDMMYY" (00-68: 20YY, 69-99: 19YY) or
// "YYYY-MM-DD"; "" is the empty date.
// Returns nothing for any other text and for an impossible day (31/02/2024).
std::optional<Jour> lireJour(std::string_view text);

class Valeur {
 public:
  Valeur() : genre_(Genre::Texte), v_(std::string()) {}
  static Valeur texte(std::string s);
  static Valeur entier(long long n);
  static Valeur reel(double d);
  static Valeur simple(float f);
  static Valeur date(Jour d);
  static Valeur montant(Decimal m);
  // The value of kind `genre` written as `text` (user input or storage).
  // Throws HostError when the text is not of that kind; `what` names the place.
  static Valeur depuisTexte(Genre genre, std::string_view text, std::string_view what = "");
  // The empty value of a kind: "", 0, empty date.
  static Valeur vide(Genre genre);

  Genre genre() const { return genre_; }
  std::string chaine() const;    // for people: dates DD/MM/YYYY, money with 2+ decimals
  std::string stockage() const;  // for the database: dates ISO
  Decimal decimal() const;       // numbers as they are, text parsed ("" is 0)
  long long entier() const;
  double reel() const;
  Jour jour() const;
  bool estVide() const;  // empty text or date, zero number
  Valeur vers(Genre genre, std::string_view what = "") const;

 private:
  Genre genre_;
  std::variant<std::string, long long, double, float, Jour, Decimal> v_;
};

// Orders two values: dates as dates (the empty date first), numbers as numbers,
// text by bytes. A text compared with a number or a date is read as one.
int comparer(const Valeur& a, const Valeur& b);

class Donnee {
 public:
  // A variable: name, label, third text, access kind, owning automaton (may be null).
  Donnee(Genre genre, const char* nom, const char* libelle, const char* tiers, int acces, Automate* owner);
  // A literal.
  explicit Donnee(Valeur valeur);
  Donnee(const Donnee&) = delete;
  virtual ~Donnee();

  const std::string& nom() const { return nom_; }
  const std::string& libelle() const { return libelle_; }
  const std::string& tiers() const { return tiers_; }
  int acces() const { return acces_; }
  // A field learns its kind from the dictionary when its table is bound.
  virtual Genre genre() const { return genre_; }

  Valeur valeur() const;
  // Writes `v` converted to this place's kind.
  void affecter(const Valeur& v);
  // Writes user or stored text; throws HostError when it is not of this kind.
  void affecterTexte(std::string_view text);

  std::string chaine() const { return valeur().chaine(); }
  Decimal decimal() const { return valeur().decimal(); }
  long long entier() const { return valeur().entier(); }
  double reel() const { return valeur().reel(); }
  Jour jour() const { return valeur().jour(); }
  bool estVide() const { return valeur().estVide(); }
  explicit operator bool() const { return !estVide(); }

  Donnee& operator=(const Donnee& other);
  Donnee& operator=(const Valeur& v);
  Donnee& operator=(std::string_view text);
  Donnee& operator=(const std::string& text) { return *this = std::string_view(text); }
  Donnee& operator=(const char* text) { return *this = std::string_view(text); }
  Donnee& operator=(int n) { return *this = Valeur::entier(n); }
  Donnee& operator=(long long n) { return *this = Valeur::entier(n); }
  Donnee& operator=(const Decimal& m) { return *this = Valeur::montant(m); }

  bool operator==(std::string_view text) const { return chaine() == text; }
  bool operator==(const char* text) const { return chaine() == text; }
  bool operator==(const std::string& text) const { return chaine() == text; }
  bool operator==(int n) const { return decimal() == Decimal(n); }
  bool operator<(int n) const { return decimal() < Decimal(n); }
  bool operator==(const Donnee& o) const { return comparer(valeur(), o.valeur()) == 0; }
  bool operator<(const Donnee& o) const { return comparer(valeur(), o.valeur()) < 0; }
  bool operator>(const Donnee& o) const { return comparer(valeur(), o.valeur()) > 0; }
  bool operator<=(const Donnee& o) const { return comparer(valeur(), o.valeur()) <= 0; }
  bool operator>=(const Donnee& o) const { return comparer(valeur(), o.valeur()) >= 0; }

  // Text operations, in characters, positions from 1.
  std::string operator()(long from, long to) const;
  std::size_t position(std::string_view needle) const;
  std::string droite(long count) const;
  std::size_t longueur() const;

  // Reads and writes go to `target` from now on (reference parameter).
  // Keeps the value and the binding for a failed action to put back.
  void keepState(Snapshot& snapshot);

  void lier(Donnee& target);
  void delier() { bound_ = nullptr; }
  bool estLiee() const { return bound_ != nullptr; }

 protected:
  virtual Valeur lire() const { return own_; }
  virtual void ecrire(Valeur v) { own_ = std::move(v); }
  std::string designation() const;  // how errors name this place

 private:
  Genre genre_;
  std::string nom_, libelle_, tiers_;
  int acces_ = 0;
  Automate* owner_ = nullptr;
  Valeur own_;
  Donnee* bound_ = nullptr;
};

std::string operator+(const Donnee& a, std::string_view b);
std::string operator+(std::string_view a, const Donnee& b);
std::string operator+(const Donnee& a, const char* b);
std::string operator+(const char* a, const Donnee& b);
std::string operator+(const Donnee& a, const std::string& b);
std::string operator+(const std::string& a, const Donnee& b);
std::string operator+(const Donnee& a, const Donnee& b);

#define HOST_VALUE_TYPE(Class, kind)                                                        \
  class Class : public Donnee {                                                             \
   public:                                                                                  \
    Class(const char* nom, const char* libelle, const char* tiers, int acces, Automate* o) \
        : Donnee(kind, nom, libelle, tiers, acces, o) {}                                    \
    using Donnee::operator=;                                                                \
    Class& operator=(const Class& other) {                                                  \
      Donnee::operator=(other);                                                             \
      return *this;                                                                         \
    }

HOST_VALUE_TYPE(Chaine, Genre::Texte)
  // A library-global variable of a group: (name, label, third, access, group, owner).
  Chaine(const char* nom, const char* libelle, const char* tiers, int acces, const char* groupe, Automate* o)
      : Donnee(Genre::Texte, nom, libelle, tiers, acces, o), groupe_(groupe ? groupe : "") {}
  const std::string& groupe() const { return groupe_; }
  // A text literal: Chaine("MIRVAE-ACCES1").
  explicit Chaine(std::string_view text = "") : Donnee(Valeur::texte(std::string(text))) {}

 private:
  std::string groupe_;
};

HOST_VALUE_TYPE(Entier, Genre::Entier)
  explicit Entier(long long n = 0) : Donnee(Valeur::entier(n)) {}
};

HOST_VALUE_TYPE(Double, Genre::Double)
  explicit Double(double d = 0) : Donnee(Valeur::reel(d)) {}
};

HOST_VALUE_TYPE(Simple, Genre::Simple)
  explicit Simple(float f = 0) : Donnee(Valeur::simple(f)) {}
};

HOST_VALUE_TYPE(Date, Genre::Date)
  explicit Date(Jour d = std::nullopt) : Donnee(Valeur::date(d)) {}
  // Day numbers count days from 01/01/1970. jDate reads a date text.
  static long jDate(std::string_view text);
  static long finMois(long day);  // the last day of that day's month
  static Valeur dJour(long day);  // the date of a day number
  // A date text (ISO, as requests write dates, or DD/MM/YYYY) written day, month and
  // year apart by `separator` ("2024-03-01", "/" gives "01/03/2024"). Throws
  // HostError when the text is not a date.
  static std::string eDate(std::string_view text, std::string_view separator);
  long eDate() const;             // this date's day number; throws when empty
  static Valeur dateCourante();   // today, from the host clock
  static std::string heureCourante();
};

HOST_VALUE_TYPE(Monnaie, Genre::Monnaie)
  explicit Monnaie(const Decimal& m = Decimal()) : Donnee(Valeur::montant(m)) {}
  // Rounds to `decimals`: mode "=" to the nearest (ties away from zero),
  // "+" away from zero, "-" towards zero. Throws HostError for another mode.
  static Decimal valeurArrondie(const Decimal& value, int decimals, std::string_view mode);
};

#undef HOST_VALUE_TYPE

}  // namespace host

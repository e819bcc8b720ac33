// The currency service of a session: what the dossier knows of its currencies, the
// current currency of the document in front of the user, and the conversion pair of
// the currency switch.
//
// The dossier keeps, per currency, its number of decimals, its membership of the euro
// zone and its fixed parity (MONNAIE), and the dated rates of the floating ones
// (MONNAIE_COURS). Every rate is in units of the currency for one unit of the
// reference currency EUR, whose rate is 1; an amount goes from A to B as
// amount × rate(B) / rate(A). Arithmetic is exact: a rate read as a binary double
// enters through its shortest decimal text, and nothing is rounded unless arrondir()
// is asked.
//
// A currency code the dossier does not know, a floating currency with no rate on or
// before the day asked, and a rate of zero or below are HostErrors naming the currency.
// An empty day stands for today (host clock).
#pragma once

#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "host/decimal.h"
#include "host/value.h"

namespace host {

class Session;
class Snapshot;

// ---- an amount in a currency of `decimals` decimals (Devises::decimales)
// The most integer digits an amount may have: the ledger's amounts hold 15 digits
// before the point, and anything longer is a slip of the keyboard, not an amount.
constexpr int kAmountMaxIntegerDigits = 15;
// The amount as people see it: exactly `decimals` decimals, rounded to the nearest,
// ties away from zero (JPY "1500", EUR "1500.00").
std::string amountText(const Decimal& amount, int decimals);
// The same amount as a French reader writes it on paper: thousands apart by a blank,
// a decimal comma ("-1 234,50").
std::string frenchAmountText(const Decimal& amount, int decimals);
// The amount a person typed, as the screen then holds and shows it: rounded to
// `decimals` like amountText, so that what is kept is what was seen. An empty text
// is 0. HostError naming `what` for a text that is not an amount, and for one with
// more than kAmountMaxIntegerDigits integer digits.
Decimal typedAmount(std::string_view text, int decimals, std::string_view what);

class Devises {
 public:
  static constexpr std::string_view kReference = "EUR";

  // `session` must outlive the service; every reading goes through its database.
  explicit Devises(Session& session);
  Devises(const Devises&) = delete;
  Devises& operator=(const Devises&) = delete;

  // ---- what the dossier knows
  int decimales(std::string_view ident) const;
  bool estZoneEuro(std::string_view ident) const;
  bool estReference(std::string_view ident) const;
  // The reference currency and the currencies with a fixed parity: their rate never
  // changes and may not be typed.
  bool estCoursFixe(std::string_view ident) const;
  // The rate in force on `day`: the fixed parity; else a rate typed in this session
  // for that day (saisirCours); else the latest MONNAIE_COURS row dated on or before it.
  Decimal cours(std::string_view ident, const Jour& day) const;
  // The keeping currency of the dossier (PARAM.MONNAIE_IDENT).
  std::string tenue() const;

  // ---- arithmetic
  // `amount` of currency `from` in currency `to` at the rates of `day`; not rounded.
  Decimal convertir(const Decimal& amount, std::string_view from, std::string_view to, const Jour& day) const;
  // Rounded to the decimals of `ident`, to the nearest, ties away from zero.
  Decimal arrondir(const Decimal& amount, std::string_view ident) const;
  // `amount` at rate `fromRate` re-priced at rate `toRate`, as every road that moves an
  // amount between rates does it (a copied operation, the currency switch, the ledger's
  // valuation): amount × toRate ÷ fromRate, rounded once, as arrondir, to the decimals
  // of `ident`, the currency it ends in. The one division comes after the product, so
  // that no decimal is cut before the rounding: 0.25 from rate 3 to rate 1.5 is 0.125,
  // hence 0.13, where dividing first would have made it 0.12. `fromRate` must not be 0.
  Decimal reprice(const Decimal& amount, const Decimal& fromRate, const Decimal& toRate, std::string_view ident) const;
  // amountText and typedAmount with the decimals of `ident`.
  std::string texte(const Decimal& amount, std::string_view ident) const;
  Decimal saisi(std::string_view text, std::string_view ident, std::string_view what) const;

  // A rate the user typed for a floating currency on a day; later lookups of that day
  // in this session take it. Refused for a fixed-rate currency and for a rate <= 0.
  void saisirCours(std::string_view ident, const Jour& day, const Decimal& rate);

  // ---- the current currency: the one the document on screen is entered in
  // Makes `ident` current at `day` with `rate`, or with its rate of that day when
  // `rate` is absent or zero. A fixed-rate currency only takes its own rate.
  void definirCourante(std::string_view ident, const Jour& day, std::optional<Decimal> rate = std::nullopt);
  // Until one is set, the keeping currency at its rate of today.
  std::string courante() const;
  Decimal coursCourant() const;
  Jour dateCourante() const;

  // An amount of the keeping currency in the current currency (sens 0), or of the
  // current currency in the keeping currency (sens 1), rounded to the decimals of the
  // currency it ends in. An empty day and a zero rate take those of the current
  // currency. This is the form the screens use: conversion(V_SOLDE, 0, Date(), Double(0)).
  Decimal conversion(const Donnee& montant, int sens, const Donnee& date, const Donnee& rate) const;

  // ---- the conversion pair of the currency switch: entry currency -> accounting currency
  void definirBascule(std::string_view source, std::string_view cible);
  const std::string& source() const { return source_; }
  const std::string& cible() const { return cible_; }

  // Keeps the current currency, the conversion pair and the typed rates for a failed
  // action to put back.
  void keepState(Snapshot& snapshot);

 private:
  struct Facts {
    int decimals;
    bool euroZone;
    Decimal fixedRate;  // zero for a floating currency
  };
  Facts facts(std::string_view ident) const;
  Jour dayOrToday(const Jour& day) const;

  Session& session_;
  std::optional<std::string> current_;
  Decimal current_rate_;
  Jour current_day_;
  std::string source_, cible_;
  // Rates typed in this session: (currency, ISO day) -> rate.
  std::map<std::pair<std::string, std::string>, Decimal> typed_;
};

// The currency service of the running session, made on first use.
Devises& euro();

}  // namespace host

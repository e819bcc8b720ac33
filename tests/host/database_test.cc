// Opening a dossier: each failure says what happened, whatever the file, the disk or
// another process does.
#include "host/database.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sched.h>
#include <sqlite3.h>
#include <sys/mount.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <functional>

#include "host/error.h"
#include "registry/dossier.h"
#include "tests/support/fixture.h"

namespace {

using host::Database;
using host::HostError;

// What opening `path` says: the message of its HostError, or "ouvert".
std::string opening(const std::string& path) {
  try {
    Database::ouvrir(path);
    return "ouvert";
  } catch (const HostError& e) {
    return e.what();
  }
}

// Runs `body` in a child process, which may change its user or its mounts without
// touching the tests', and returns the text it gave ("" when it died).
std::string inChild(const std::function<std::string()>& body) {
  int channel[2];
  if (::pipe(channel) != 0) return "pipe";
  pid_t child = ::fork();
  if (child == 0) {
    ::close(channel[0]);
    std::string text;
    try {
      text = body();
    } catch (const std::exception& e) {
      text = e.what();
    }
    [[maybe_unused]] auto written = ::write(channel[1], text.data(), text.size());
    ::_exit(0);
  }
  ::close(channel[1]);
  std::string text;
  char buffer[512];
  for (ssize_t n; (n = ::read(channel[0], buffer, sizeof buffer)) > 0;) text.append(buffer, static_cast<std::size_t>(n));
  ::close(channel[0]);
  ::waitpid(child, nullptr, 0);
  return text;
}

class OpeningTest : public ::testing::Test {
 protected:
  void SetUp() override {
    dossier_ = testing_support::cheminTemporaire("mirvae-ouvrir");
    registry::creerDossier(dossier_, false, testing_support::jourDeTest());
  }
  void TearDown() override {
    for (const auto& path : {dossier_, other_})
      for (const char* suffix : {"", "-wal", "-shm", "-journal"}) std::filesystem::remove_all(path + suffix);
  }
  std::string dossier_, other_ = testing_support::cheminTemporaire("mirvae-autre");
};

TEST_F(OpeningTest, AFileThatIsNotADossierOfThisVersionIsNamedSo) {
  struct Case {
    const char* name;
    std::function<void(const std::string&)> make;
    std::string said;
  } cases[] = {
      {"missing", [](const std::string&) {}, "dossier « " + other_ + " » introuvable"},
      {"text", [](const std::string& p) { std::ofstream(p) << "mes notes\n"; }, "« " + other_ + " » n'est pas un dossier"},
      {"empty", [](const std::string& p) { std::ofstream{p}; }, "« " + other_ + " » n'est pas un dossier"},
      {"directory", [](const std::string& p) { std::filesystem::create_directory(p); },
       "« " + other_ + " » n'est pas un dossier"},
      {"another database",
       [](const std::string& p) { Database::creer(p)->exec("CREATE TABLE NOTES (TEXTE TEXT)"); },
       "« " + other_ + " » n'est pas un dossier"},
      {"another version",
       [this](const std::string& p) {
         std::filesystem::copy_file(dossier_, p);
         Database::creer(p)->exec("UPDATE DOSSIER_INFO SET VALEUR = '7' WHERE CLE = 'schema_version'");
       },
       "le dossier « " + other_ + " » est de la version 7 du schéma ; ce programme lit la version 2"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    std::filesystem::remove_all(other_);
    c.make(other_);
    EXPECT_EQ(opening(other_), c.said);
  }
  EXPECT_EQ(opening(dossier_), "ouvert");
}

// A dossier made by the program before the last schema change is brought up to date
// when it is opened, and keeps its operations.
TEST_F(OpeningTest, ADossierOfThePreviousSchemaIsBroughtUpToDate) {
  Database::creer(dossier_)->exec(
      "INSERT INTO MIRVAE (IDENT, TYPE) VALUES ('00000001', 'FC'); ALTER TABLE MOUVE DROP COLUMN DTLET; "
      "ALTER TABLE ECHEA DROP COLUMN RELET; DROP INDEX MIRVAE_COMPTE; DROP INDEX MIRVAE_PIECE; "
      "UPDATE DOSSIER_INFO SET VALEUR = '1' WHERE CLE = 'schema_version'");
  EXPECT_EQ(opening(dossier_), "le dossier « " + dossier_ + " » est de la version 1 du schéma ; ce programme lit la version 2");
  auto db = registry::ouvrirDossier(dossier_);
  const std::pair<const char*, const char*> after[] = {
      {"SELECT VALEUR FROM DOSSIER_INFO WHERE CLE = 'schema_version'", "2"},
      {"SELECT count(DTLET) FROM MOUVE", "0"},
      {"SELECT count(RELET) FROM ECHEA", "0"},
      {"SELECT IDENT FROM MIRVAE INDEXED BY MIRVAE_COMPTE WHERE TYPE = 'FC'", "00000001"},
      {"SELECT IDENT FROM MIRVAE INDEXED BY MIRVAE_PIECE WHERE TYPE = 'FC'", "00000001"},
  };
  for (const auto& [query, expected] : after) {
    host::Statement& s = db->prepare(query);
    EXPECT_TRUE(s.step()) << query;
    EXPECT_EQ(s.text(0), expected) << query;
    s.reset();
  }
}

// Waits the ten seconds a unit of work waits for another process.
TEST_F(OpeningTest, ADossierLockedByAnotherProcessIsSaidToBeLocked) {
  sqlite3* holder = nullptr;
  ASSERT_EQ(sqlite3_open(dossier_.c_str(), &holder), SQLITE_OK);
  ASSERT_EQ(sqlite3_exec(holder, "PRAGMA locking_mode = EXCLUSIVE; BEGIN EXCLUSIVE", nullptr, nullptr, nullptr),
            SQLITE_OK);
  EXPECT_EQ(opening(dossier_), "le dossier « " + dossier_ +
                                   " » ne peut être ouvert : il est verrouillé par un autre programme, qui ne l'a "
                                   "pas libéré en 10 secondes");
  sqlite3_close(holder);
  EXPECT_EQ(opening(dossier_), "ouvert");
}

TEST_F(OpeningTest, ADossierThatCannotBeWrittenIsSaidToBeReadOnly) {
  std::filesystem::permissions(dossier_, std::filesystem::perms::owner_read | std::filesystem::perms::group_read |
                                             std::filesystem::perms::others_read);
  std::string said = inChild([&] {
    // The superuser writes whatever the rights say: the child becomes nobody.
    if (::geteuid() == 0 && (::setgid(65534) != 0 || ::setuid(65534) != 0)) return std::string("setuid");
    return opening(dossier_);
  });
  EXPECT_EQ(said, "le dossier « " + dossier_ +
                      " » ne peut être ouvert : le fichier ou son système de fichiers est en lecture seule");
}

// A full disk and a read-only file system, for real: a small file system of the
// child's own, mounted where only the child sees it.
TEST_F(OpeningTest, AFullDiskAndAReadOnlyFileSystemAreSaidSo) {
  std::filesystem::create_directory(other_);
  std::string said = inChild([&] {
    if (::unshare(CLONE_NEWNS) != 0 || ::mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) != 0 ||
        ::mount("tmpfs", other_.c_str(), "tmpfs", 0, "size=1m") != 0)
      return std::string("skip");
    std::string copy = other_ + "/dossier.db";
    std::filesystem::copy_file(dossier_, copy);
    {
      std::ofstream fill(other_ + "/fill", std::ios::binary);
      std::string block(4096, '\0');
      while (fill.write(block.data(), static_cast<std::streamsize>(block.size())) && fill.flush()) {
      }
    }
    std::string out = opening(copy) + "\n";
    try {
      registry::creerDossier(other_ + "/nouveau.db", false, testing_support::jourDeTest());
      out += "créé";
    } catch (const HostError& e) {
      out += e.what();
    }
    if (::mount("tmpfs", other_.c_str(), "tmpfs", MS_REMOUNT | MS_RDONLY, nullptr) != 0) return out + "\nremount";
    return out + "\n" + opening(copy);
  });
  if (said == "skip") GTEST_SKIP() << "no mount namespace of our own here";
  EXPECT_EQ(said, "le dossier « " + other_ + "/dossier.db » ne peut être ouvert : le disque est plein\n" +
                      "le dossier « " + other_ + "/nouveau.db » ne peut être créé : base de données : le disque est plein\n" +
                      "le dossier « " + other_ + "/dossier.db » ne peut être ouvert : le fichier ou son système de "
                      "fichiers est en lecture seule");
}

}  // namespace

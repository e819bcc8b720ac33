#!/usr/bin/env bash
# Sets up what the project needs on a fresh Debian machine, builds, and runs either
# the demo or the tests.
#
#   ./project.sh demo [ARGS...]   build, then run `mirvae demo ARGS...`
#   ./project.sh test             build normally and under ASan+UBSan, run every test in both,
#                                 and fuzz the script, amount and date readers for a short while
#   ./project.sh fuzz [SECONDS]   build the fuzz target with clang and run it (default 25 s)
#   ./project.sh build            build the normal tree only (build/)
#   ./project.sh bench [NAME...]  build, then run the benchmarks (bench/README.md): posting, list, memory, action, print
set -euo pipefail
cd "$(dirname "$0")"

packages=(build-essential cmake ninja-build pkg-config libsqlite3-dev sqlite3 libboost-dev libcli11-dev
          libgtest-dev libgmock-dev libbenchmark-dev hledger clang libclang-rt-14-dev
          libcairo2-dev libpango1.0-dev fonts-dejavu-core poppler-utils
          libcpp-httplib-dev nlohmann-json3-dev chromium chromium-driver python3-selenium)

install_missing() {
  local missing=()
  for p in "${packages[@]}"; do
    dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing+=("$p")
  done
  if [ ${#missing[@]} -gt 0 ]; then
    echo "Installing: ${missing[*]}"
    local sudo=""
    [ "$(id -u)" -eq 0 ] || sudo="sudo"
    $sudo apt-get update -qq
    DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y -qq "${missing[@]}" >/dev/null
  fi
}

build() {  # build DIR [extra cmake args]
  local dir=$1
  shift
  cmake -S . -B "$dir" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo "$@" >/dev/null
  cmake --build "$dir" -j "$(nproc)"
}

# Fuzzes the readers of what people write (session scripts, amounts, dates) under
# libFuzzer with ASan and UBSan, from the seeds in tests/fuzz. What it finds new goes
# to a scratch folder; a crash leaves its input in build-fuzz/ and fails the run.
fuzz() {  # fuzz SECONDS
  build build-fuzz -DCMAKE_CXX_COMPILER=clang++ -DMIRVAE_FUZZ=ON
  local found
  found=$(mktemp -d)
  local status=0
  ./build-fuzz/mirvae_fuzz -max_total_time="$1" -timeout=10 -print_final_stats=0 \
    -dict=tests/fuzz/script.dict -artifact_prefix=build-fuzz/ "$found" tests/fuzz/seeds \
    >build-fuzz/fuzz.log 2>&1 || status=$?
  rm -rf "$found"
  grep -E '^(#[0-9]+[[:space:]]+INITED|Done )' build-fuzz/fuzz.log || true
  if [ "$status" -ne 0 ]; then
    tail -n 60 build-fuzz/fuzz.log
    echo "fuzz: failed (build-fuzz/fuzz.log)" >&2
    return "$status"
  fi
}

command=${1:-demo}
shift || true
install_missing
case "$command" in
  demo)
    build build
    exec ./build/mirvae demo "$@"
    ;;
  build)
    build build
    ;;
  bench)
    build build
    names=("$@")
    [ ${#names[@]} -gt 0 ] || names=(posting list memory action print)
    for name in "${names[@]}"; do
      echo "== ${name}_bench"
      ./build/bench/"${name}"_bench
    done
    ;;
  test)
    build build
    (cd build && ctest --output-on-failure -j "$(nproc)")
    fuzz 25
    build build-asan -DMIRVAE_SANITIZE=ON -DMIRVAE_BENCH=OFF
    (cd build-asan && ASAN_OPTIONS=detect_leaks=1 UBSAN_OPTIONS=print_stacktrace=1 ctest --output-on-failure -j "$(nproc)")
    ;;
  fuzz)
    fuzz "${1:-25}"
    ;;
  *)
    echo "usage: $0 demo|test|build|bench|fuzz" >&2
    exit 2
    ;;
esac

#!/bin/sh
# Reports what is wrong with the style of our files and changes nothing:
#
#   check-style.sh format      formatting and obvious mistakes, in seconds
#   check-style.sh analysis    static analysis of the C++ code, in minutes
set -eu
cd "$(dirname "$0")/.."

scripts/install-packages.sh style
if [ "$1" = format ]; then
  git ls-files '*.cpp' '*.h' | xargs clang-format --dry-run -Werror
  git ls-files '*.sh' .ci/run | xargs shellcheck
  git ls-files '*.py' | xargs pyflakes3
  git ls-files '*.py' | xargs pycodestyle --max-line-length=100
else
  scripts/build.sh release
  # Twelve sources at a time, as most of the time goes into the headers that they share. The path
  # analysis skips included sources unless the file that includes them is named UnifiedSource*.
  rm -rf build/analysis
  mkdir -p build/analysis
  git ls-files 'app/*.cpp' 'history/*.cpp' 'eventlog/*.cpp' 'inventory/*.cpp' 'products/*.cpp' \
    'report/*.cpp' 'reader/*.cpp' 'platform/*.cpp' ':!platform/windows' ':!*/main.cpp' |
    awk '{ file = "build/analysis/UnifiedSource" int((NR - 1) / 12) ".cpp"
           printf "#include \"%s\"\n", $0 > file }'
  # The shallow mode of the path analysis takes a third of the time, and skips calls of calls.
  printf '%s\n' app/main.cpp reader/main.cpp build/analysis/*.cpp |
    xargs -P "$(nproc)" -n 1 clang-tidy -p build/release --quiet \
      --checks=-bugprone-suspicious-include \
      --extra-arg=-Wno-unknown-warning-option --extra-arg=-fno-caret-diagnostics --extra-arg=-Xclang \
      --extra-arg=-analyzer-config --extra-arg=-Xclang --extra-arg=mode=shallow
fi

// Sets one key of a profile file: set_key FILE SECTION KEY VALUE.
#include "platform/profile_file.h"

int main(int argc, char** argv) {
  return argc == 5 && WriteProfileValue(argv[1], argv[2], argv[3], argv[4]) ? 0 : 1;
}

// Sets one key of a profile file by GLib's key file: set_key_glib FILE SECTION KEY VALUE.
#include <glib.h>

int main(int argc, char** argv) {
  if (argc != 5) {
    return 1;
  }
  GKeyFile* file = g_key_file_new();
  const bool isLoaded =
      g_key_file_load_from_file(file, argv[1], G_KEY_FILE_KEEP_COMMENTS, nullptr) != 0;
  g_key_file_set_value(file, argv[2], argv[3], argv[4]);
  const bool isSaved = isLoaded && g_key_file_save_to_file(file, argv[1], nullptr) != 0;
  g_key_file_free(file);
  return isSaved ? 0 : 1;
}

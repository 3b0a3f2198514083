#include <gtk/gtk.h>

#include "base/paths.h"
#include "base/utf.h"
#include "platform/folder_picker.h"

namespace kestrune::platform {
namespace {

class GtkFolderPicker : public FolderPicker {
 public:
  std::u16string BrowseForFolder(NativeWindow owner, std::u16string_view title) override {
    // Without a display there is nothing to pick with.
    if (!gtk_init_check(nullptr, nullptr)) return {};
    GtkWidget* dialog = gtk_file_chooser_dialog_new(
        EncodeUtf8(title).c_str(), owner != nullptr ? GTK_WINDOW(owner) : nullptr,
        GTK_FILE_CHOOSER_ACTION_SELECT_FOLDER, "_Cancel", GTK_RESPONSE_CANCEL, "_Select",
        GTK_RESPONSE_ACCEPT, nullptr);
    GtkFileChooser* chooser = GTK_FILE_CHOOSER(dialog);
    // Only folders of the file system, and the user may make a new one, as the Windows picker
    // allows.
    gtk_file_chooser_set_local_only(chooser, TRUE);
    gtk_file_chooser_set_create_folders(chooser, TRUE);
    // It opens on the desktop, as the Windows picker does, rather than on recent files.
    const gchar* desktop = g_get_user_special_dir(G_USER_DIRECTORY_DESKTOP);
    gtk_file_chooser_set_current_folder(chooser, desktop != nullptr ? desktop : g_get_home_dir());
    std::u16string chosen;
    if (gtk_dialog_run(GTK_DIALOG(dialog)) == GTK_RESPONSE_ACCEPT) {
      if (gchar* name = gtk_file_chooser_get_filename(chooser)) {
        chosen = TextFromPath(name);
        g_free(name);
      }
    }
    gtk_widget_destroy(dialog);
    while (gtk_events_pending()) gtk_main_iteration();
    return chosen;
  }
};

}  // namespace

std::unique_ptr<FolderPicker> MakeSystemFolderPicker() {
  return std::make_unique<GtkFolderPicker>();
}

}  // namespace kestrune::platform

#include "console/widgets/form_fields.h"

#include "console/widgets/message_dialog.h"

namespace Tarnel {

bool IsFieldKey(int key, int (*kind)(int), std::string_view others) {
  constexpr int LAST_CHARACTER = 127;
  if (IsEditingKey(key)) {
    return true;
  }
  return key > 0 && key <= LAST_CHARACTER &&
         (kind(key) != 0 || others.find(static_cast<char>(key)) != std::string_view::npos);
}

void RefuseField(Frame* form, ItemList* list, int selectionIndex, InputItem& field, int titleId,
                 int bodyId) {
  // A field that has the focus already gets it anew, too.
  field.SetFocused(false);
  list->SelectItem(selectionIndex);
  Window::SetCursorVisible(true);
  MessageDialog(form, titleId, bodyId).Exec();
  list->Repaint();
}

}  // namespace Tarnel

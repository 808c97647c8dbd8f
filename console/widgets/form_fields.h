#pragma once

#include <string_view>

#include "console/screen/frame.h"
#include "console/widgets/input_item.h"
#include "console/widgets/item_list.h"

// What forms have in common.
namespace Tarnel {

// An editing key, or a character of the kind (isdigit and its like) or among the others.
bool IsFieldKey(int key, int (*kind)(int), std::string_view others);

// Moves the focus to the field that is at fault, tells what is wrong with it and asks for it anew:
// the next character replaces what it holds. The texts are the catalogue's.
void RefuseField(Frame* form, ItemList* list, int selectionIndex, InputItem& field, int titleId,
                 int bodyId);

}  // namespace Tarnel

#pragma once

#include <string>
#include <string_view>

namespace dovrel {

// The stored visual-order DOS Hebrew field in the order people read it, as
// code page 1255 text, trimmed. A field with a Hebrew letter is turned by
// ICU's inverse bidirectional algorithm on a right-to-left paragraph, numbers
// kept as left-to-right runs and brackets mirrored back; a field without a
// Hebrew letter is already in reading order and keeps its stored order.
// Unlike LogicalText, nothing is dropped or moved apart: "רח' הרצל 45" and
// 'דיבלים 8 מ"מ' come back as they were typed.
std::string ReadingOrderText(std::string_view dosField);

} // namespace dovrel

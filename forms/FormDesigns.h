#pragma once

#include "platform/ControlDesign.h"

#include <cstdint>
#include <string>
#include <vector>

namespace dovrel {

// How the company chooser and the account details window look at design
// time, for the front ends: every control with its kind, caption and place,
// in twips and in tab order. The layouts run right to left: a caption label
// stands to the right of the field it names.

// The company chooser "frmOpenDir": drive list, directory tree, scan button,
// company list, status label, Cancel and OK.
constexpr int32_t kOpenDirWidth = 4920;
constexpr int32_t kOpenDirHeight = 6480;
// The form captions as UTF-8 (the designs' own texts are code page 1255).
constexpr const char* kOpenDirCaptionUtf8 = "בחירת מחיצה ראשית";
const std::vector<ControlDesign>& OpenDirDesign();

// The account details window "frmAccDetails": three boxes, each with its
// caption label and its copy button. The buttons form one control array
// "cmdCopyText"; each is named with its index, "cmdCopyText(0)" to
// "cmdCopyText(2)".
constexpr int32_t kAccDetailsWidth = 5520;
constexpr int32_t kAccDetailsHeight = 3420;
constexpr const char* kAccDetailsCaptionUtf8 = "פרטי כרטיס";
const std::vector<ControlDesign>& AccDetailsDesign();

// The name of the element at index of a control array: "name(index)".
std::string ArrayElementName(const std::string& name, int32_t index);

} // namespace dovrel

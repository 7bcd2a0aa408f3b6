// The commands a Tangent I/O item offers in its context menu, and the data formats its item
// type carries.
#pragma once

#include "com/ComGuid.h"

#include <array>
#include <string_view>

namespace tio {

// Runs the select-resource dialog.
inline constexpr GUID kSelectResourceCommand =
    qv::com::ParseGuid("A117026A-AD51-4C63-8341-085C842D9F23");
// Runs the explain-error dialog.
inline constexpr GUID kExplainErrorCommand =
    qv::com::ParseGuid("CBB26BAB-B605-4BC7-BE58-98DDC98C9F70");

// The data formats of the item type; kept with the type, read by nothing in the module.
inline constexpr std::array<std::u16string_view, 3> kDataFormats = {
    u"TangentIO/Alias", u"TangentIO/Resource", u"TangentIO/ResourceTree"};

// The programs behind the dialogs and the drop, in the module's program folder.
inline constexpr std::u16string_view kPropertiesProgram = u"TIOPropertyMain.gx";
inline constexpr std::u16string_view kSelectResourceProgram = u"TIOSelectResourceDialog.gx";
inline constexpr std::u16string_view kExplainErrorProgram = u"TIOExplainErrorDialog.gx";
inline constexpr std::u16string_view kDragAndDropProgram = u"TIODragAndDrop.gx";

} // namespace tio

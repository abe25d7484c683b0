// The enumerations of the layout definitions as the type library publishes them: what kind of cell
// a Cellinfo is, the bits of its Flags, and whether its texts are translated. The values are part
// of the stored forms and of the script text (".CType = 5"), so they never change.
#pragma once

#include <cstdint>

namespace xal {

enum cellTypes : int32_t {
  ctText = 0,
  ctData = 1,
  ctYesNo = 2,
  ctScript = 3,
  ctLink = 4,
  ctList = 5,
  ctLList = 6,
  ctDLink = 7,
  ctCombo = 8,
  ctCheck = 9,
  ctMemo = 10,
  ctStruct = 11,
  ctCurData = 12,
  ctCurCode = 13,
  ctMLink = 14,
  ctFile = 15,
  ctComboFind = 16,
  ctComboValues = 17,
  ctRefCurData = 18,
  ctURL = 19,
  ctNNLink = 20,
  ctNNData = 21,
  ctFolder = 22,
};

// Bit values for Cellinfo.Flags.
enum cellFlags : int32_t {
  cfNone = 0,
  cfReCalc = 1,
};

enum cellTrans : int32_t {
  ctrNone = 0,
  ctrOnRead = 1,
  ctrOnRW = 2,
};

}  // namespace xal

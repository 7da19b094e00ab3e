#pragma once

#include <cstddef>
#include <cstdint>

// The native list-view, header, combo-box and list-box queries that outside
// automation tools send to a window, and the structures they pass, laid out
// as a 64-bit Windows process holds them. Characters are 16-bit. The numbers
// are named after the native constants but not as them: a Windows build sees
// those as macros beside these.
namespace automation::native
{

// The kind query's wParam, sent with the registered message "AUTL_MESSAGE".
constexpr std::uintptr_t kKindQuery = 100;
constexpr char16_t kKindMessageName[] = u"AUTL_MESSAGE";

// List view
constexpr unsigned kLvmGetItemCount = 0x1004;
constexpr unsigned kLvmGetItemRect = 0x100E;
constexpr unsigned kLvmGetHeader = 0x101F;
constexpr unsigned kLvmGetTopIndex = 0x1027;
constexpr unsigned kLvmGetItemState = 0x102C;
constexpr unsigned kLvmGetSelectedCount = 0x1032;
constexpr unsigned kLvmGetSubItemRect = 0x1038;
constexpr unsigned kLvmGetItemW = 0x104B;
constexpr unsigned kLvmColumnCountQuery = 0x1050;
constexpr unsigned kLvmZeroItemQuery = 0x1051;
constexpr unsigned kLvmZeroQuery = 0x1052;
constexpr unsigned kLvmGetColumnW = 0x105F;

// Header
constexpr unsigned kHdmGetItemCount = 0x1200;
constexpr unsigned kHdmGetItemRect = 0x1207;
constexpr unsigned kHdmGetItemW = 0x120B;

// Combo box
constexpr unsigned kCbGetCount = 0x146;
constexpr unsigned kCbGetCurSel = 0x147;
constexpr unsigned kCbGetLbText = 0x148;
constexpr unsigned kCbGetLbTextLen = 0x149;
constexpr unsigned kCbGetDroppedState = 0x157;
constexpr unsigned kCbFindStringExact = 0x158;
constexpr unsigned kCbGetComboBoxInfo = 0x164;

// List box
constexpr unsigned kLbGetCurSel = 0x188;
constexpr unsigned kLbGetText = 0x189;
constexpr unsigned kLbGetTextLen = 0x18A;
constexpr unsigned kLbGetCount = 0x18B;
constexpr unsigned kLbGetTopIndex = 0x18E;
constexpr unsigned kLbGetItemRect = 0x198;
constexpr unsigned kLbFindStringExact = 0x1A2;

// LVITEMW.mask
constexpr unsigned kLvifText = 0x1;
constexpr unsigned kLvifImage = 0x2;
constexpr unsigned kLvifParam = 0x4;
constexpr unsigned kLvifState = 0x8;
constexpr unsigned kLvifDiSetItem = 0x1000;
constexpr unsigned kLvifPassthrough = 0x8000;

// LVITEMW.state
constexpr unsigned kLvisFocused = 0x1;
constexpr unsigned kLvisSelected = 0x2;
constexpr unsigned kLvisCut = 0x4;
constexpr unsigned kLvisDropHilited = 0x8;

// LVCOLUMNW.mask
constexpr unsigned kLvcfFmt = 0x1;
constexpr unsigned kLvcfWidth = 0x2;
constexpr unsigned kLvcfText = 0x4;

// HDITEMW.mask
constexpr unsigned kHdiWidth = 0x1;
constexpr unsigned kHdiText = 0x2;
constexpr unsigned kHdiFormat = 0x4;
constexpr unsigned kHdiImage = 0x20;

// COMBOBOXINFO.stateButton while the popup is shown.
constexpr std::uint32_t kStateSystemPressed = 0x8;

struct RECT
{
    std::int32_t left;
    std::int32_t top;
    std::int32_t right;
    std::int32_t bottom;
};

struct LVITEMW
{
    std::uint32_t mask;
    std::int32_t iItem;
    std::int32_t iSubItem;
    std::uint32_t state;
    std::uint32_t stateMask;
    char16_t* pszText;
    std::int32_t cchTextMax;
    std::int32_t iImage;
    std::intptr_t lParam;
    std::int32_t iIndent;
    std::int32_t iGroupId;
    std::uint32_t cColumns;
    std::uint32_t* puColumns;
    std::int32_t* piColFmt;
    std::int32_t iGroup;
};

struct LVCOLUMNW
{
    std::uint32_t mask;
    std::int32_t fmt;
    std::int32_t cx;
    char16_t* pszText;
    std::int32_t cchTextMax;
    std::int32_t iSubItem;
    std::int32_t iImage;
    std::int32_t iOrder;
    std::int32_t cxMin;
    std::int32_t cxDefault;
    std::int32_t cxIdeal;
};

struct HDITEMW
{
    std::uint32_t mask;
    std::int32_t cxy;
    char16_t* pszText;
    void* hbm;
    std::int32_t cchTextMax;
    std::int32_t fmt;
    std::intptr_t lParam;
    std::int32_t iImage;
    std::int32_t iOrder;
    std::uint32_t type;
    void* pvFilter;
    std::uint32_t state;
};

struct COMBOBOXINFO
{
    std::uint32_t cbSize;
    RECT rcItem;
    RECT rcButton;
    std::uint32_t stateButton;
    std::uintptr_t hwndCombo;
    std::uintptr_t hwndItem;
    std::uintptr_t hwndList;
};

// The sizes tools pass; a change of layout would make every answer wrong.
static_assert(sizeof(RECT) == 16);
static_assert(sizeof(LVITEMW) == 88 && offsetof(LVITEMW, pszText) == 24 && offsetof(LVITEMW, lParam) == 40);
static_assert(sizeof(LVCOLUMNW) == 56 && offsetof(LVCOLUMNW, pszText) == 16);
static_assert(sizeof(HDITEMW) == 72 && offsetof(HDITEMW, pszText) == 8 && offsetof(HDITEMW, fmt) == 28);
static_assert(sizeof(COMBOBOXINFO) == 64 && offsetof(COMBOBOXINFO, hwndCombo) == 40);

} // namespace automation::native

#include "installer/windows/SelectionPage.h"

#include <algorithm>

#include "installer/windows/Painting.h"
#include "installer/windows/WizardMetrics.h"
#include "platform/utf8.h"

namespace HV {

namespace {

constexpr int kBoxOff = 130;
constexpr int kBoxOn = 131;
constexpr int kPictureTop = 4;
constexpr DWORD kCheckStyle = 0x5001010B;
constexpr DWORD kDisabledCheckStyle = 0x5801010B;
constexpr std::size_t kLongestControlName = 255;
constexpr unsigned kLabelFormat = DT_VCENTER | DT_SINGLELINE;
constexpr UINT kAtOnce = RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW;

// What the system calls a check box: at most this much of the product's name, and no half character.
std::wstring ControlName(const std::string& displayName) {
    std::wstring name = platform::WideFromUtf8(displayName).substr(0, kLongestControlName);
    if (!name.empty() && IS_HIGH_SURROGATE(name.back())) {
        name.pop_back();
    }
    return name;
}

// A check box means the same at each click, so the second one of a double click counts: no quick click is lost.
bool IsToggle(WPARAM command) {
    const int identifier = LOWORD(command);
    return identifier >= kFirstCheckControl && identifier <= kLastCheckControl &&
           (IsPress(command) || HIWORD(command) == BN_DOUBLECLICKED);
}

void SendCheck(HWND control, bool checked) {
    ::SendMessageW(control, BM_SETCHECK, checked ? BST_CHECKED : BST_UNCHECKED, 0);
}

}  // namespace

void DrawCheckButton(const ProductCheckButton& button, const DRAWITEMSTRUCT& item) {
    static const HBITMAP off = LoadOwnBitmap(kBoxOff);
    static const HBITMAP on = LoadOwnBitmap(kBoxOn);
    const bool enabled = IsEnabled(item);
    ::FillRect(item.hDC, &item.rcItem, button.background);
    // A control that its owner draws answers this with unchecked, always; the record knows.
    const bool checked = ::SendMessageW(item.hwndItem, BM_GETCHECK, 0, 0) == BST_CHECKED || button.checked;
    DrawBitmap(item.hDC, checked ? on : off, item.rcItem.left, item.rcItem.top + kPictureTop);
    RECT label = item.rcItem;
    label.left = CheckBoxLabelLeft(item.rcItem);
    ::SetBkColor(item.hDC, ColorOf(WizardMetrics::PageColor));
    DrawColoredText(item.hDC, button.displayName, label, WizardMetrics::Instance().BodyFont, kLabelFormat,
                    enabled ? WizardMetrics::TextColor : WizardMetrics::DisabledTextColor);
}

SelectionPage::SelectionPage(WinWizardController& controller)
    : brush_(Gdiplus::Color(OpaqueOf(WizardMetrics::PageColor))), controller_(controller) {}

ATL::CWndClassInfo& SelectionPage::GetWndClassInfo() {
    static ATL::CWndClassInfo info;
    return info;
}

BOOL SelectionPage::ProcessWindowMessage(HWND, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) {
    switch (message) {
        case WM_CREATE:
            OnCreate();
            return TRUE;
        case WM_ERASEBKGND:
            // Nothing: the page shows the main window's colour, which has been painted before it.
            result = TRUE;
            return TRUE;
        case WM_PAINT:
            OnPaint();
            return TRUE;
        case WM_DRAWITEM:
            // NOLINTNEXTLINE(performance-no-int-to-ptr): messages carry pointers as numbers.
            result = OnDrawItem(*reinterpret_cast<const DRAWITEMSTRUCT*>(lParam)) ? TRUE : FALSE;
            return result != FALSE;
        case WM_COMMAND:
            OnCommand(wParam);
            return TRUE;
        default:
            return FALSE;
    }
}

void SelectionPage::OnCreate() {
    const RECT client = GetClientRect();
    const LONG top = client.top + 30;
    const LONG bottom = top + WizardMetrics::ButtonHeight;
    const RECT deselect{client.left, top, client.left + 70, bottom};
    const RECT select{deselect.right + 10, top, deselect.right + 80, bottom};
    deselectAllButton_.owner = this;
    selectAllButton_.owner = this;
    MakeButton(deselectAllButton_, m_hWnd, "Deselect All", kDeselectAllControl, deselect);
    MakeButton(selectAllButton_, m_hWnd, "Select All", kSelectAllControl, select);

    const int boxes = std::min(kCheckBoxes, static_cast<int>(items_.size()));
    for (int index = 0; index < boxes; ++index) {
        MakeCheckButton(static_cast<std::size_t>(index), CheckBoxPlace(index, client, bottom + 25));
    }
    SendMessageToDescendants(WM_SETFONT, reinterpret_cast<WPARAM>(WizardMetrics::Instance().BodyFont), FALSE);
}

void SelectionPage::MakeCheckButton(std::size_t index, const RECT& place) {
    const ProductItem& item = items_[index];
    ProductCheckButton button;
    button.displayName = item.displayName;
    button.checked = item.checked;
    button.background = WizardMetrics::Instance().PageBrush;
    button.handle =
        MakeButtonControl(m_hWnd, ControlName(item.displayName), kFirstCheckControl + static_cast<int>(index), place,
                          item.enabled ? kCheckStyle : kDisabledCheckStyle);
    SendCheck(button.handle, item.checked);
    checkButtons_.push_back(button);
}

void SelectionPage::OnPaint() const {
    const PaintDevice device(m_hWnd);
    RECT heading = GetClientRect();
    heading.bottom = heading.top + 25;
    DrawPageText(device, "Select which plugins you want to install.", heading, WizardMetrics::Instance().BodyFont,
                 DT_WORDBREAK);
}

bool SelectionPage::OnDrawItem(const DRAWITEMSTRUCT& item) const {
    const auto identifier = static_cast<int>(item.CtlID);
    if (identifier == kDeselectAllControl || identifier == kSelectAllControl) {
        DrawButton(identifier == kDeselectAllControl ? deselectAllButton_ : selectAllButton_, item);
        return true;
    }
    // A box that is just being made is painted once it is known here.
    const auto index = static_cast<std::size_t>(identifier - kFirstCheckControl);
    if (identifier < kFirstCheckControl || identifier > kLastCheckControl || index >= checkButtons_.size()) {
        return false;
    }
    DrawCheckButton(checkButtons_[index], item);
    return true;
}

void SelectionPage::OnCommand(WPARAM command) {
    const int identifier = LOWORD(command);
    if (IsToggle(command)) {
        Toggle(identifier);
    } else if (IsPress(command) && (identifier == kDeselectAllControl || identifier == kSelectAllControl)) {
        CheckAll(identifier == kSelectAllControl);
    }
}

void SelectionPage::CheckAll(bool checked) {
    const std::size_t both = std::min(items_.size(), checkButtons_.size());
    for (std::size_t index = 0; index < both; ++index) {
        // What cannot be installed here stays unchecked, whichever button is pressed.
        if (items_[index].enabled) {
            items_[index].checked = checked;
            checkButtons_[index].checked = checked;
            SendCheck(checkButtons_[index].handle, checked);
            ::RedrawWindow(checkButtons_[index].handle, nullptr, nullptr, kAtOnce);
        }
    }
}

void SelectionPage::Toggle(int identifier) {
    const auto index = static_cast<std::size_t>(identifier - kFirstCheckControl);
    if (index >= items_.size() || index >= checkButtons_.size() || !items_[index].enabled) {
        return;
    }
    items_[index].checked = !items_[index].checked;
    ProductCheckButton& button = checkButtons_[index];
    button.checked = items_[index].checked;
    SendCheck(button.handle, button.checked);
    ::SendMessageW(button.handle, WM_SETREDRAW, TRUE, 0);
    // Neither message has a control that its owner draws painted on every system; this does.
    ::InvalidateRect(button.handle, nullptr, TRUE);
}

}  // namespace HV

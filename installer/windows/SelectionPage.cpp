#include "installer/windows/SelectionPage.h"

#include <algorithm>

#include "installer/WizardArithmetic.h"
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

bool IsCheckControl(int identifier) {
    return identifier >= kFirstCheckControl && identifier <= kLastCheckControl;
}

// A check box means the same at each click, so the second one of a double click counts: no quick click is lost.
bool IsToggle(WPARAM command) {
    return IsCheckControl(LOWORD(command)) && (IsPress(command) || HIWORD(command) == BN_DOUBLECLICKED);
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
    SetFontOfControls();
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

void SelectionPage::OnPaint(HDC device) const {
    RECT heading = GetClientRect();
    heading.bottom = heading.top + 25;
    DrawPageText(device, "Select which plugins you want to install.", heading, WizardMetrics::Instance().BodyFont,
                 DT_WORDBREAK);
}

const CustomButton* SelectionPage::ButtonForId(int identifier) const {
    switch (identifier) {
        case kDeselectAllControl:
            return &deselectAllButton_;
        case kSelectAllControl:
            return &selectAllButton_;
        default:
            return nullptr;
    }
}

bool SelectionPage::OnDrawItem(const DRAWITEMSTRUCT& item) const {
    // A box that is just being made is painted once it is known here.
    const std::size_t index = item.CtlID - kFirstCheckControl;
    if (!IsCheckControl(static_cast<int>(item.CtlID)) || index >= checkButtons_.size()) {
        return WizardWindow::OnDrawItem(item);
    }
    DrawCheckButton(checkButtons_[index], item);
    return true;
}

void SelectionPage::OnCommand(WPARAM command) {
    if (IsToggle(command)) {
        Toggle(LOWORD(command));
    } else {
        WizardWindow::OnCommand(command);
    }
}

void SelectionPage::OnPress(int identifier) {
    if (ButtonForId(identifier) != nullptr) {
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

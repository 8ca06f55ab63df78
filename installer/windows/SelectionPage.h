#pragma once

#include <string>
#include <vector>

#include "installer/ProductItems.h"
#include "installer/windows/CustomButton.h"
#include "installer/windows/WizardWindow.h"

namespace HV {

class WinWizardController;

/// The identifiers of the controls that the page serves by itself.
enum SelectionControl : int {
    kDeselectAllControl = 1130,
    kSelectAllControl = 1131,
    kFirstCheckControl = 1144,
    // More than there are ever check boxes: a press of one that does not exist is ignored.
    kLastCheckControl = 1164,
};

/// One check box on the screen.
struct ProductCheckButton {
    HWND handle = nullptr;
    std::string displayName;      // a copy of the item's, UTF-8
    bool checked = false;         // kept equal to the item's: the control itself keeps no state
    HBRUSH background = nullptr;  // not owned
};

/// Draws a check box as the platform asks for it.
void DrawCheckButton(const ProductCheckButton& button, const DRAWITEMSTRUCT& item);

/// The page with the products to choose from.
///
/// It has check boxes for the first twelve items. Further ones keep the state that they came with: they are installed
/// if they came checked.
class SelectionPage : public WizardWindow<SelectionPage>, public CustomButtonOwner {
public:
    /// `controller` is not owned.
    explicit SelectionPage(WinWizardController& controller);

    ~SelectionPage() override = default;

    /// The page's own colour: corners of buttons blend into it.
    Gdiplus::Brush* BackgroundBrush() override { return &brush_; }

    /// One more product. To be called before the window is made.
    void AddItem(const ProductItem& item) { items_.push_back(item); }

    /// The choice as it stands; see ProductItems.h. It counts all items, those without a check box too.
    [[nodiscard]] int CheckedCount() const { return HV::CheckedCount(items_); }
    [[nodiscard]] std::vector<std::string> UncheckedIdentifiers() const { return HV::UncheckedIdentifiers(items_); }

    [[nodiscard]] const std::vector<ProductItem>& Items() const { return items_; }
    [[nodiscard]] const std::vector<ProductCheckButton>& CheckButtons() const { return checkButtons_; }

private:
    friend WizardWindow;

    void OnCreate();
    void MakeCheckButton(std::size_t index, const RECT& place);
    void OnPaint(HDC device) const;
    [[nodiscard]] const CustomButton* ButtonForId(int identifier) const;
    [[nodiscard]] bool OnDrawItem(const DRAWITEMSTRUCT& item) const;
    void OnCommand(WPARAM command);
    void OnPress(int identifier);
    void CheckAll(bool checked);
    void Toggle(int identifier);

    Gdiplus::SolidBrush brush_;
    WinWizardController& controller_;
    std::vector<ProductItem> items_;
    std::vector<ProductCheckButton> checkButtons_;  // by the index of their item
    CustomButton deselectAllButton_;
    CustomButton selectAllButton_;
};

}  // namespace HV

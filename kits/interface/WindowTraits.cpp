#include "WindowTraits.h"

#include "PopUpHost.h"

#include <algorithm>

bool WindowTraits::IsModal() const {
    return feel == B_MODAL_APP_WINDOW_FEEL || feel == B_MODAL_SUBSET_WINDOW_FEEL ||
           feel == B_MODAL_ALL_WINDOW_FEEL;
}

bool WindowTraits::IsFloating() const {
    return feel == B_FLOATING_APP_WINDOW_FEEL || feel == B_FLOATING_SUBSET_WINDOW_FEEL ||
           feel == B_FLOATING_ALL_WINDOW_FEEL;
}

bool WindowTraits::IsPopUp() const {
    return feel == kPopUpWindowFeel;
}

window_type WindowTraits::Type() const {
    if (look == B_TITLED_WINDOW_LOOK && feel == B_NORMAL_WINDOW_FEEL) {
        return B_TITLED_WINDOW;
    }
    if (look == B_DOCUMENT_WINDOW_LOOK && feel == B_NORMAL_WINDOW_FEEL) {
        return B_DOCUMENT_WINDOW;
    }
    if (look == B_MODAL_WINDOW_LOOK && feel == B_MODAL_APP_WINDOW_FEEL) {
        return B_MODAL_WINDOW;
    }
    if (look == B_FLOATING_WINDOW_LOOK && feel == B_FLOATING_APP_WINDOW_FEEL) {
        return B_FLOATING_WINDOW;
    }
    if (look == B_BORDERED_WINDOW_LOOK && feel == B_NORMAL_WINDOW_FEEL) {
        return B_BORDERED_WINDOW;
    }
    return B_UNTYPED_WINDOW;
}

bool WindowTraits::SetType(window_type type) {
    switch (type) {
    case B_UNTYPED_WINDOW:
    case B_TITLED_WINDOW:
        look = B_TITLED_WINDOW_LOOK;
        feel = B_NORMAL_WINDOW_FEEL;
        return true;
    case B_DOCUMENT_WINDOW:
        look = B_DOCUMENT_WINDOW_LOOK;
        feel = B_NORMAL_WINDOW_FEEL;
        return true;
    case B_MODAL_WINDOW:
        look = B_MODAL_WINDOW_LOOK;
        feel = B_MODAL_APP_WINDOW_FEEL;
        return true;
    case B_FLOATING_WINDOW:
        look = B_FLOATING_WINDOW_LOOK;
        feel = B_FLOATING_APP_WINDOW_FEEL;
        return true;
    case B_BORDERED_WINDOW:
        look = B_BORDERED_WINDOW_LOOK;
        feel = B_NORMAL_WINDOW_FEEL;
        return true;
    }
    return false;
}

host::WindowOptions WindowTraits::Options(const WindowGeometry& geometry) const {
    host::WindowOptions options;
    options.title = title;
    if (IsPopUp()) {
        options.kind = host::WindowKind::popup;
    } else if (look == B_NO_BORDER_WINDOW_LOOK) {
        options.kind = host::WindowKind::borderless;
    } else if (IsModal() || look == B_MODAL_WINDOW_LOOK) {
        options.kind = host::WindowKind::modal;
    } else if (IsFloating() || look == B_FLOATING_WINDOW_LOOK) {
        options.kind = host::WindowKind::floating;
    } else if (look == B_BORDERED_WINDOW_LOOK) {
        options.kind = host::WindowKind::bordered;
    } else {
        options.kind = look == B_DOCUMENT_WINDOW_LOOK ? host::WindowKind::document : host::WindowKind::titled;
    }
    const bool fixedWidth = (flags & (B_NOT_RESIZABLE | B_NOT_H_RESIZABLE)) != 0;
    const bool fixedHeight = (flags & (B_NOT_RESIZABLE | B_NOT_V_RESIZABLE)) != 0;
    options.movable = (flags & B_NOT_MOVABLE) == 0;
    options.closable = (flags & B_NOT_CLOSABLE) == 0;
    options.resizable = !fixedWidth || !fixedHeight;
    options.zoomable = (flags & B_NOT_ZOOMABLE) == 0;
    options.minimizable = (flags & B_NOT_MINIMIZABLE) == 0;
    options.takes_focus = (flags & B_AVOID_FOCUS) == 0 && !IsPopUp();
    options.stays_on_top = feel == B_FLOATING_ALL_WINDOW_FEEL || feel == B_MODAL_ALL_WINDOW_FEEL;
    options.modal_to_program = feel == B_MODAL_APP_WINDOW_FEEL || feel == B_MODAL_ALL_WINDOW_FEEL;
    if (IsPopUp()) {
        return options;
    }
    // No display knows of larger windows.
    const auto pixels = [](float extent) { return static_cast<int>(std::min(extent, 32766.0F)) + 1; };
    const WindowGeometry::Limits& limits = geometry.SizeLimits();
    const BRect& frame = geometry.Frame();
    options.least = {pixels(fixedWidth ? frame.Width() : limits.minWidth),
                     pixels(fixedHeight ? frame.Height() : limits.minHeight)};
    options.most = {pixels(fixedWidth ? frame.Width() : limits.maxWidth),
                    pixels(fixedHeight ? frame.Height() : limits.maxHeight)};
    return options;
}

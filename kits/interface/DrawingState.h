// DrawingState: how a view draws; what BView::PushState() saves.
#pragma once

#include "Painter.h"

#include <Font.h>

#include <optional>

// Two coordinate systems appear here. Drawing coordinates are what drawing methods are given; view
// coordinates are those of BView::Bounds(). They differ by the origins and scales of this state and all below
// it on the stack.
struct DrawingState {
    rgb_color high = make_color(0, 0, 0);
    rgb_color low = make_color(255, 255, 255);
    drawing_mode mode = B_OP_COPY;
    source_alpha alphaSource = B_PIXEL_ALPHA;
    alpha_function alphaFunction = B_ALPHA_OVERLAY;
    float penSize = 1.0F;
    BPoint penLocation;
    cap_mode lineCap = B_BUTT_CAP;
    join_mode lineJoin = B_MITER_JOIN;
    float miterLimit = B_DEFAULT_MITER_LIMIT;
    BFont font;
    bool forceFontAliasing = false;

    BPoint origin; // in drawing coordinates of the state below
    float scale = 1.0F;
    BPoint baseOrigin; // of all states below, in view coordinates
    float baseScale = 1.0F;

    // In view coordinates: what ConstrainClippingRegion() set in this state, and in those below it.
    std::optional<BRegion> clip;
    std::optional<BRegion> baseClip;

    // The state on top of this one after a push.
    DrawingState Pushed() const;

    float CombinedScale() const { return baseScale * scale; }
    BPoint ToView(BPoint drawing) const;
    BRect ToView(const BRect& drawing) const;
    BPoint FromView(BPoint view) const;
    // A region given in drawing coordinates.
    BRegion ToView(const BRegion& drawing) const;
    // Nothing when neither this state nor those below limit drawing.
    std::optional<BRegion> CombinedClip() const;
};

#include "gui/ColumnListView/CLVEasyItem.h"

#include "gui/ColumnListView/ColumnListView.h"
#include "gui/ColumnListView/TruncatedString.h"
#include "gui/ColumnListView/UpperCaseText.h"

#include <Bitmap.h>
#include <Font.h>
#include <Region.h>

#include <algorithm>
#include <cmath>
#include <string.h>
#include <string>

namespace {

constexpr BRect kNoRect(-1, -1, -1, -1);
constexpr rgb_color kSelectedGround = {178, 178, 178, 255};
constexpr rgb_color kGround = {255, 255, 255, 255};

// From the cell's left edge to its text, and what a shortened text leaves free on both sides together.
constexpr float kTextIndent = 2;
constexpr float kTextMargin = 4;
// How far a letter's shape may reach to the left of its place, and how many before it it may be joined with.
constexpr float kLetterOverlap = 2;
constexpr size_t kJoinedLetters = 2;

// How many bytes, whole characters of UTF-8, both texts begin with.
size_t CommonPrefix(const std::string& a, const std::string& b) {
    const auto difference = std::mismatch(a.begin(), a.end(), b.begin(), b.end());
    auto length = static_cast<size_t>(difference.first - a.begin());
    const auto continues = [](const std::string& text, size_t at) {
        return at < text.size() && (static_cast<uint8>(text[at]) & 0xC0) == 0x80;
    };
    while (length > 0 && (continues(a, length) || continues(b, length))) {
        --length;
    }
    return length;
}

// How many bytes of a text look the same whatever follows them.
size_t SettledPrefix(const std::string& text, size_t prefix) {
    const bool ascii = std::all_of(text.begin(), text.end(), [](char byte) { return (byte & 0x80) == 0; });
    // Other scripts join and order their letters as a whole.
    return ascii ? prefix - std::min(prefix, kJoinedLetters) : 0;
}

// A text is shortened by bytes; half a character before the ellipsis is not to be seen.
void RemoveHalfCharacter(std::string& shortened, const std::string& text) {
    const auto difference = std::mismatch(shortened.begin(), shortened.end(), text.begin(), text.end());
    const auto kept = static_cast<size_t>(difference.first - shortened.begin());
    const size_t whole = CommonPrefix(shortened, text);
    shortened.erase(whole, kept - whole);
}

bool MeetsVertically(BRect cell, BRect bounds) {
    return cell.top <= bounds.bottom && cell.bottom >= bounds.top;
}

} // namespace

// Small, because there are many: what only drawn cells need is made when they are.
struct CLVEasyItem::Cell {
    enum class Kind : uint8 { Empty, Text, TruncatableText, Picture };
    struct Picture {
        std::unique_ptr<BBitmap> copy;
        const BBitmap* bitmap;
        float offset;
    };
    struct Drawn {
        BRect frame = kNoRect;
        std::string shortened;
    };

    // Where the cell was drawn stays remembered.
    void Clear() {
        kind = Kind::Empty;
        shorten = false;
        text.reset();
        picture.reset();
        if (drawn != nullptr) {
            drawn->shortened.clear();
        }
    }
    bool HoldsText() const { return kind == Kind::Text || kind == Kind::TruncatableText; }
    bool WasDrawn() const { return drawn != nullptr && drawn->frame != kNoRect; }
    Drawn& Remembered() {
        if (drawn == nullptr) {
            drawn = std::make_unique<Drawn>();
        }
        return *drawn;
    }

    Kind kind = Kind::Empty;
    // Before it is drawn again.
    bool shorten = false;
    std::unique_ptr<char[]> text;
    std::unique_ptr<Picture> picture;
    std::unique_ptr<Drawn> drawn;
};

CLVEasyItem::CLVEasyItem(uint32 level, bool superitem, bool expanded, float minheight)
    : CLVListItem(level, superitem, expanded, minheight) {}

CLVEasyItem::~CLVEasyItem() = default;

CLVEasyItem::Cell* CLVEasyItem::CellFor(int column_index) {
    if (column_index < 0) {
        return nullptr;
    }
    const auto index = static_cast<size_t>(column_index);
    if (index >= mCells.size()) {
        mCells.resize(index + 1);
    }
    return &mCells[index];
}

const CLVEasyItem::Cell* CLVEasyItem::FindCell(int column_index) const {
    const bool known = column_index >= 0 && static_cast<size_t>(column_index) < mCells.size();
    return known ? &mCells[static_cast<size_t>(column_index)] : nullptr;
}

CLVEasyItem::Cell* CLVEasyItem::FindCell(int column_index) {
    return const_cast<Cell*>(static_cast<const CLVEasyItem*>(this)->FindCell(column_index));
}

void CLVEasyItem::SetColumnContent(int column_index, const char* text, bool truncate) {
    Cell* const cell = CellFor(column_index);
    if (cell == nullptr) {
        return;
    }
    if (text == nullptr || text[0] == 0) {
        cell->Clear();
        return;
    }
    // Copied before the old one goes: it may be this cell's own.
    const size_t size = strlen(text) + 1;
    auto copy = std::make_unique<char[]>(size);
    memcpy(copy.get(), text, size);
    cell->Clear();
    cell->text = std::move(copy);
    cell->kind = truncate ? Cell::Kind::TruncatableText : Cell::Kind::Text;
    cell->shorten = truncate;
}

void CLVEasyItem::SetColumnContent(int column_index, const BBitmap* bitmap, float horizontal_offset,
                                   bool copy) {
    Cell* const cell = CellFor(column_index);
    if (cell == nullptr) {
        return;
    }
    if (bitmap == nullptr) {
        cell->Clear();
        return;
    }
    auto picture = std::make_unique<Cell::Picture>();
    picture->copy = copy ? std::make_unique<BBitmap>(bitmap) : nullptr;
    picture->bitmap = copy ? picture->copy.get() : bitmap;
    picture->offset = std::round(horizontal_offset);
    cell->Clear();
    cell->picture = std::move(picture);
    cell->kind = Cell::Kind::Picture;
}

const char* CLVEasyItem::GetColumnContentText(int column_index) const {
    const Cell* const cell = FindCell(column_index);
    return cell != nullptr && cell->HoldsText() ? cell->text.get() : nullptr;
}

const BBitmap* CLVEasyItem::GetColumnContentBitmap(int column_index) const {
    const Cell* const cell = FindCell(column_index);
    return cell != nullptr && cell->picture != nullptr ? cell->picture->bitmap : nullptr;
}

void CLVEasyItem::Update(BView* owner, const BFont* font) {
    CLVListItem::Update(owner, font);
    mTextOffset = CenteredBaseline();
}

void CLVEasyItem::DrawItemColumn(BView* owner, BRect column_rect, int32 column_index, bool complete) {
    owner->SetLowColor(IsSelected() ? kSelectedGround : kGround);
    owner->SetDrawingMode(B_OP_COPY);
    if (IsSelected() || complete) {
        owner->FillRect(column_rect, B_SOLID_LOW);
    }
    Cell* const cell = FindCell(column_index);
    if (cell == nullptr || cell->kind == Cell::Kind::Empty) {
        return;
    }
    BRegion inside(column_rect);
    owner->ConstrainClippingRegion(&inside);
    cell->Remembered().frame = column_rect;
    if (cell->HoldsText()) {
        DrawText(owner, column_rect, *cell);
    } else {
        const BRect bounds = cell->picture->bitmap->Bounds();
        const BRect target =
            bounds.OffsetToCopy(column_rect.left + cell->picture->offset,
                                column_rect.top + std::ceil((column_rect.Height() - bounds.Height()) / 2));
        owner->SetDrawingMode(B_OP_OVER);
        owner->DrawBitmap(cell->picture->bitmap, bounds, target);
        owner->SetDrawingMode(B_OP_COPY);
    }
    owner->ConstrainClippingRegion(nullptr);
}

void CLVEasyItem::DrawText(BView* owner, BRect rect, Cell& cell) const {
    if (cell.shorten) {
        TruncateText(cell, rect, rect.Width());
        cell.shorten = false;
    }
    owner->SetHighColor(0, 0, 0);
    const bool shortened = cell.kind == Cell::Kind::TruncatableText;
    owner->DrawString(shortened ? cell.drawn->shortened.c_str() : cell.text.get(),
                      BPoint(rect.left + kTextIndent, rect.top + mTextOffset));
}

BRect CLVEasyItem::TruncateText(Cell& cell, BRect frame, float column_width) {
    std::string shortened(strlen(cell.text.get()) + 3, 0);
    GetTruncatedString(cell.text.get(), shortened.data(), column_width - kTextMargin);
    shortened.resize(strlen(shortened.c_str()));
    RemoveHalfCharacter(shortened, cell.text.get());
    Cell::Drawn& drawn = cell.Remembered();
    if (shortened == drawn.shortened) {
        return kNoRect;
    }
    const size_t same = CommonPrefix(shortened, drawn.shortened);
    drawn.shortened = std::move(shortened);
    if (frame == kNoRect) {
        return kNoRect;
    }
    const float prefix = be_plain_font->StringWidth(drawn.shortened.c_str(),
                                                    static_cast<int32>(SettledPrefix(drawn.shortened, same)));
    frame.left += std::max(0.0F, std::floor(kTextIndent + prefix) - kLetterOverlap);
    return frame;
}

void CLVEasyItem::MoveCells(Cell& resized, float column_width) {
    BRect& frame = resized.drawn->frame;
    const float growth = column_width - frame.Width();
    for (Cell& cell : mCells) {
        if (&cell != &resized && cell.WasDrawn() && cell.drawn->frame.left >= frame.left) {
            cell.drawn->frame.OffsetBy(growth, 0);
        }
    }
    frame.right += growth;
}

void CLVEasyItem::ColumnWidthChanged(int32 column_index, float column_width, ColumnListView* owner) {
    Cell* const cell = FindCell(column_index);
    if (cell == nullptr) {
        return;
    }
    if (cell->WasDrawn()) {
        MoveCells(*cell, column_width);
    }
    if (cell->kind != Cell::Kind::TruncatableText) {
        return;
    }
    if (!cell->WasDrawn() || !MeetsVertically(cell->drawn->frame, owner->Bounds())) {
        cell->shorten = true;
        return;
    }
    // Not the remembered frame: that of a cell beside one that was never drawn does not follow it.
    const BRect frame = ItemColumnFrame(column_index, owner);
    cell->shorten = false;
    const BRect changed = TruncateText(*cell, frame, column_width);
    if (changed != kNoRect && changed.IsValid()) {
        owner->Invalidate(changed);
    }
}

void CLVEasyItem::FrameChanged(int32 column_index, BRect new_frame, ColumnListView* owner) {
    Cell* const cell = FindCell(column_index);
    if (cell == nullptr || cell->kind != Cell::Kind::TruncatableText ||
        new_frame == cell->Remembered().frame) {
        return;
    }
    cell->drawn->frame = new_frame;
    if (new_frame == kNoRect || !new_frame.Intersects(owner->Bounds())) {
        cell->shorten = true;
        return;
    }
    cell->shorten = false;
    const BRect changed = TruncateText(*cell, new_frame, new_frame.Width());
    if (changed != kNoRect && changed.IsValid()) {
        owner->Invalidate(changed);
    }
}

int CLVEasyItem::CompareItems(const CLVListItem* a, const CLVListItem* b, long column_index) {
    const auto* const first = dynamic_cast<const CLVEasyItem*>(a);
    const auto* const second = dynamic_cast<const CLVEasyItem*>(b);
    if (first == nullptr || second == nullptr) {
        return 0;
    }
    const char* const firstText = first->GetColumnContentText(static_cast<int>(column_index));
    const char* const secondText = second->GetColumnContentText(static_cast<int>(column_index));
    return firstText == nullptr || secondText == nullptr ? 0 : CompareInUpperCase(firstText, secondText);
}

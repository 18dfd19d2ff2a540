// The display: windows, their pixels, input, pointers, screens and drags.
//
// Thread rule: the functions and the calls of WindowPeer may be made by any thread unless they say otherwise.
// What they ask for is carried out later, in the order of the calls, by the main thread, which runs
// run_display(). Listeners are called on the main thread and must return at once: they take no lock that is
// held while anything is waited for.
// Units: logical pixels, whole ones but for the pointer; device pixels where it says so. Rectangles are given
// by their left top corner and size, so an empty one has size 0. Screen coordinates have their origin at the
// left top corner of the screen area.
#pragma once

#include "host/api/raster.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace host {

struct Position {
    int x = 0;
    int y = 0;
    bool operator==(const Position&) const = default;
};

struct Size {
    int width = 0;
    int height = 0;
    bool operator==(const Size&) const = default;
};

struct Area {
    int left = 0;
    int top = 0;
    int width = 0;
    int height = 0;
    bool operator==(const Area&) const = default;
};

struct PointerPosition {
    double x = 0;
    double y = 0;
};

// The widths of what the window manager draws around the content.
struct FrameMargins {
    int left = 0;
    int top = 0;
    int right = 0;
    int bottom = 0;
    bool operator==(const FrameMargins&) const = default;
};

// Bits of WindowInput::buttons.
enum : std::uint32_t { primary_button = 1, secondary_button = 2, tertiary_button = 4 };
// Bits of WindowInput::modifiers.
enum : std::uint32_t {
    shift_modifier = 1,
    control_modifier = 2,
    alt_modifier = 4,
    super_modifier = 8,
    caps_lock_modifier = 16
};

// What a key means beside the text that it makes.
enum class KeyName : std::uint8_t {
    none, // a key that only makes text, or one without use here
    backspace,
    tab,
    enter,
    escape,
    left,
    right,
    up,
    down,
    insert,
    del,
    home,
    end,
    page_up,
    page_down,
    function, // KeyInput::function_number
    print,
    scroll_lock,
    pause,
    menu,
    shift,
    control,
    alt,
    super,
    caps_lock
};

struct PointerInput {
    enum class Kind : std::uint8_t { pressed, moved, released, left };
    Kind kind = Kind::moved;
    PointerPosition where; // from the left top corner of the content
    PointerPosition on_screen;
    std::uint32_t buttons = 0; // held after the event; of `released` without the one let go
    std::uint32_t modifiers = 0;
    int clicks = 1;        // of `pressed`: 2 for the second press of a double click, and so on
    std::int64_t when = 0; // microseconds, uptime_nanoseconds() / 1000
    // Pop-ups are shown, and the pointer is outside of all of them. Only the bottom one is told.
    bool outside_popups = false;
};

struct WheelInput {
    PointerPosition where;
    double across = 0; // lines; positive to the right
    double down = 0;
    std::uint32_t modifiers = 0;
    std::int64_t when = 0;
};

struct KeyInput {
    bool pressed = true;
    bool repeated = false;
    KeyName name = KeyName::none;
    int function_number = 0; // 1 .. 35
    std::string text;        // UTF-8 of the key with all its modifiers; may be empty
    std::string plain_text;  // what the key's cap says: one character without modifiers, lower case
    std::uint32_t code = 0;  // the key's number, the same on every layout
    std::uint32_t modifiers = 0;
    std::int64_t when = 0;
};

// What is dragged, or lies on the clipboard: bytes by MIME type, the preferred one first.
struct DataFormats {
    std::vector<std::pair<std::string, std::string>> formats;
    // Null when there is none of that type.
    const std::string* find(std::string_view type) const;
    void set(std::string_view type, std::string bytes);
};

struct DragInput {
    enum class Kind : std::uint8_t { entered, moved, left, dropped };
    Kind kind = Kind::moved;
    PointerPosition where;
    PointerPosition on_screen;
    std::uint32_t buttons = 0;
    std::uint32_t modifiers = 0;
    // The same object for all events of one drag; of its types the three below. Null for `left`, and for a
    // drag that this process has begun.
    std::shared_ptr<const DataFormats> data;
    bool own = false; // begun by this process
    std::int64_t when = 0;
};

enum class WindowState : std::uint8_t { normal, minimized, maximized };

// The MIME types that are read from drags of other programs. A message of the kits, flattened, is preferred
// to all others.
inline constexpr std::string_view message_type = "application/x-vnd.bekits-message";
inline constexpr std::string_view uri_list_type = "text/uri-list";
inline constexpr std::string_view text_type = "text/plain";

// Receives what happens to a window. Kept alive by the window's peer; never called after
// WindowPeer::close() has been carried out, but still while it is on its way.
class WindowListener {
  public:
    virtual ~WindowListener() = default;
    // The content's place and size, as the desktop has made them, after the first `wishes` calls of
    // set_area() were carried out. Also when a wish of our own was fulfilled.
    virtual void area_changed(Area content, std::uint64_t wishes) = 0;
    // Device pixels for one logical pixel.
    virtual void scale_changed(double scale) = 0;
    virtual void margins_changed(FrameMargins margins) = 0;
    virtual void activated(bool active) = 0;
    virtual void state_changed(WindowState state) = 0;
    virtual void close_requested() = 0;
    virtual void pointer(const PointerInput& input) = 0;
    virtual void wheel(const WheelInput& input) = 0;
    virtual void key(const KeyInput& input) = 0;
    // Text that an input method has finished.
    virtual void text_committed(const std::string& text) = 0;
    // Text that an input method is working on, with its caret (bytes from its beginning), to be shown where
    // it will be inserted; empty when there is none any more.
    virtual void text_composed(const std::string& text, int caret) = 0;
    virtual void drag(const DragInput& input) = 0;
    // A drag that start_drag() began is over; `accepted` when somebody took the data.
    virtual void drag_ended(bool accepted) = 0;
    // Only for the bottom one of the shown pop-ups.
    virtual void popups_dismissed() = 0;
    virtual void screens_changed() = 0;
    // Time for set_pulse().
    virtual void pulse() = 0;
};

enum class WindowKind : std::uint8_t {
    titled,
    document,
    bordered,   // a border, but no title
    borderless, // nothing around the content, still placed and raised by the window manager
    floating,   // small title, above the program's other windows
    modal,      // a dialogue above `parent`
    popup       // see show(); no border, not managed
};

struct WindowOptions {
    std::string title;
    WindowKind kind = WindowKind::titled;
    bool movable = true;
    bool closable = true;
    bool resizable = true;
    bool zoomable = true;
    bool minimizable = true;
    bool takes_focus = true;
    bool stays_on_top = false;
    bool modal_to_program = false; // the program's other windows get no input meanwhile
    Size least{1, 1};
    Size most{32767, 32767};
    bool operator==(const WindowOptions&) const = default;
};

// The shapes that a pointer can have. `custom` is a picture of Cursor's own.
enum class CursorShape : std::uint8_t {
    arrow,
    text,
    hand,
    grabbing,
    grab,
    cross,
    wait,
    progress,
    forbidden,
    size_horizontal,
    size_vertical,
    size_down,
    size_up,
    move,
    copy,
    link,
    help,
    menu,
    blank,
    custom
};

struct Picture {
    int width = 0;
    int height = 0;
    std::vector<std::uint32_t> pixels; // 0xAARRGGBB, colours not multiplied by alpha
};

struct Cursor {
    CursorShape shape = CursorShape::arrow;
    Picture picture; // of `custom`
    Position hot_spot;
};

struct DragContents {
    DataFormats data;
    Picture picture; // empty: an outline of `outline`
    Size outline;
    Position hot_spot; // where in the picture or outline the pointer is
};

// Device pixels: half open, right and bottom are outside.
struct DeviceRect {
    int left = 0;
    int top = 0;
    int right = 0;
    int bottom = 0;
};

// A window on the display, from make_window() until close().
class WindowPeer {
  public:
    virtual ~WindowPeer() = default;

    virtual void set_options(const WindowOptions& options) = 0;
    // The content's place; the window manager's frame goes around it.
    virtual void set_area(Area content) = 0;
    // With `popup` as kind: above everything, the pointer and the keyboard belong to the program's pop-ups
    // from now on, the newest on top. Whatever is pressed, moved or let go outside of all of them goes to the
    // bottom one, marked outside_popups, and to no other window; keys go to the newest.
    virtual void show() = 0;
    virtual void hide() = 0;
    virtual void minimize(bool minimized) = 0;
    // Fills the screen as the window manager does it, or gives that up.
    virtual void maximize(bool maximized) = 0;
    // To the front and, unless it takes no focus, active.
    virtual void activate() = 0;
    // Behind all other windows, or right behind that one, which comes to the front.
    virtual void send_behind(const std::shared_ptr<WindowPeer>& other) = 0;
    // Has the listener hear a pulse every so many microseconds; 0 for none, which costs nothing.
    virtual void set_pulse(std::int64_t interval) = 0;
    // Above that window, as its dialogue. Null for none.
    virtual void set_parent(const std::shared_ptr<WindowPeer>& parent) = 0;
    virtual void set_cursor(const Cursor& cursor) = 0;
    // Whether an input method may work here, and where its caret stands in the content.
    virtual void set_text_input(bool wanted, Area caret) = 0;
    // From the press of a button in this window on, with one held. drag_ended() follows in any case.
    virtual void start_drag(DragContents contents) = 0;
    // Makes the window's picture show these pixels: 0xffRRGGBB rows of `stride` pixels, of a picture of
    // `size` device pixels, of which the rectangles have changed. Copies before it returns; taken to the
    // screen once a frame, together with all that has changed until then. A picture of another size than the
    // last one must be given whole.
    virtual void present(const std::uint32_t* pixels, std::size_t stride, Size size,
                         const std::vector<DeviceRect>& changed) = 0;
    // Waits until what was presented before has been taken to the screen, for 100 ms at most. Not on the main
    // thread.
    virtual void wait_for_present() = 0;
    // The window disappears, its listener is let go. Everything else is without effect afterwards.
    virtual void close() = 0;
};

// The desktop's leave for this program to bring a window to the front, as it is handed to programs that the
// user starts (xdg-activation, startup notification). For the next activate(); empty for none.
void take_activation_token(const std::string& token);

// The window is hidden at first. Without a display it is never seen and its listener is never called.
std::shared_ptr<WindowPeer> make_window(const WindowOptions& options, Area content,
                                        std::shared_ptr<WindowListener> listener);

// The pointer and keys as last heard of by any window of the program. Never waits.
struct LiveInput {
    PointerPosition on_screen;
    std::uint32_t buttons = 0;
    std::uint32_t modifiers = 0;
};
LiveInput live_input();

struct ScreenFacts {
    std::string name;
    Area area;
    Area usable; // without the desktop's panels
    double scale = 1.0;
    int depth = 32;
    double refresh_rate = 60.0;
};
// The main screen first; empty without a display.
std::vector<ScreenFacts> screens();

// Lets this program open windows. On the main thread, before anything measures text; further calls have no
// effect. False when there is no display: `problem` then says why, in one line.
[[nodiscard]] bool connect_display(std::string* problem);
bool display_connected();
// Declares that the program may call connect_display() later; until then text that is measured on the main
// thread connects, too, where there is a display. Any time, also before main().
void expect_display();

// Runs the display's events on the main thread until end_display_loop(), which any thread may call, also
// before. May be called again after it has returned.
void run_display();
void end_display_loop();
// Both are called on the main thread. The session asks for what must outlive the program to be saved, because
// it may end now: or go on, when it is only saved as a whole or the user thinks better of it.
void set_save_handler(std::function<void()> handler);
// The session ends, and the program with it.
void set_quit_handler(std::function<void()> handler);
// Called on the main thread, in the middle of run_display(), when the display has gone: its server has ended,
// or a window manager has cut the program off. The process ends with a line on standard error and exit status
// 1 as the handler returns.
void set_loss_handler(std::function<void()> handler);
// Runs it on the main thread soon, in order with everything else that is asked for.
void run_on_main_thread(std::function<void()> task);

} // namespace host

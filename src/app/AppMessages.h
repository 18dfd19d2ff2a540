// Every message code of the application, with the fields, the sender and the handler of its messages. Windows
// reach the application by posting these to brindle_app; it never replies. Where no field is named there is
// none.
#pragma once

#include <SupportDefs.h>

enum : uint32 {
    // Reserved. Forwarded to the application by the find and indexer windows; acted upon by nobody.
    MSG_FORWARD_101 = 101,

    // Reserved. Forwarded to the application by all three windows; acted upon by nobody.
    MSG_FORWARD_102 = 102,

    // To the application, which opens the playlist window or brings it to the front. Forwarded by all three
    // windows. No menu sends it: it comes from other programs.
    MSG_OPEN_PLAYLIST_WINDOW = 103,

    // From the playlist window's "Close" item, to the application, which closes that window. The playlist
    // window adds pointer "winptr", itself, as it forwards the message; the application does not read it.
    MSG_PLAYLIST_WINDOW_CLOSED = 104,

    // From the "Find song..." items and the application's start, to the application, which opens the find
    // window or brings it to the front. Forwarded by the playlist and indexer windows.
    MSG_OPEN_FIND_WINDOW = 105,

    // From the find window's "Close" item, to the application, which closes that window, and quits when there
    // is no indexer window. The find window adds pointer "winptr", itself, as it forwards the message; the
    // application does not read it.
    MSG_FIND_WINDOW_CLOSED = 106,

    // From the "File indexer, disks..." items and the application's start, to the application, which opens
    // the indexer window or brings it to the front. Forwarded by all three windows.
    MSG_OPEN_INDEX_WINDOW = 107,

    // From the indexer window's "Close" item, forwarded to the application, which closes that window, and
    // quits when there is no find window.
    MSG_INDEX_WINDOW_CLOSED = 108,

    // From the find window's search field, to the find window, which runs the search.
    MSG_SEARCH_NOW = 700,

    // From the playlist's edit menu, to the playlist.
    MSG_EDIT_INFO = 705,
    MSG_MOVE_TO_TRASH = 706,
    MSG_REMOVE_FROM_LIST = 707,
    MSG_SELECT_ALL_ROWS = 708,

    // From the indexer window's list "volumelist" when its selection changes, to the indexer window, which
    // updates the buttons.
    MSG_INDEX_SELECTION = 709,

    // From the indexer window's buttons "Status", "Strip", "Stop" and "Index", to the indexer window, which
    // starts the job on the selected volume or cancels it. A volume's row also keeps its job's state in these
    // values.
    MSG_INDEX_STATUS = 710,
    MSG_INDEX_STRIP = 711,
    MSG_INDEX_STOP = 712,
    MSG_INDEX_START = 713,
};

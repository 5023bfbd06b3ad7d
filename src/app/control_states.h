#pragma once
// Which of the main window's controls a user can reach, derived from the
// window's data alone; the window applies them (EnableControls).

namespace quorvel {

struct ControlInputs {
    bool listFromUser = false;    // "File list from..." = "User"
    bool foldersFromUser = false; // "Folders from..." = "User"
    bool busy = false;            // a run is under way
    bool support = false;         // "Trace": support mode
    bool recordEdited = false;
    int selected = -1; // list index, -1 for none
    int count = 0;     // entries of the list
};

struct ControlStates {
    bool recordFields = false; // the record editor and the location frames
    bool fileList = false;     // the list of files itself (not during a run)
    bool fileMenu = false;     // "&New...", "&Open...", "&Save..." visible
    bool fileMenuEnabled = false;
    bool getFileList = false; // "Get" of the file list
    bool clearFiles = false;  // "Clear" of the file list
    bool newEntry = false, moveUp = false, moveDown = false, deleteEntry = false;
    bool saveRecord = false, saveVisible = false;
    bool userFolders = false; // the data and user folder fields
    bool processAll = false, processFile = false, cancel = false, close = false;
    bool supportControls = false; // shown only in support mode

    bool operator==(const ControlStates&) const = default;
};

// During a run the list and everything that would change it mid-walk stay
// still; "Cancel" is the only run button.
ControlStates DeriveControlStates(const ControlInputs& in);

} // namespace quorvel

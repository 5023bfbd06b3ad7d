#include "app/control_states.h"

namespace quorvel {

ControlStates DeriveControlStates(const ControlInputs& in) {
    const bool editable = in.listFromUser;
    const bool idle = !in.busy;
    const bool selected = in.selected >= 0;
    ControlStates s;
    // Without a selection there is no record the fields could go into.
    s.recordFields = editable && idle && selected;
    s.fileList = idle;
    s.fileMenu = editable;
    s.fileMenuEnabled = idle;
    s.getFileList = !editable && idle;
    s.clearFiles = idle;
    // New entries go before the selection, or at the end of an empty list or
    // one with nothing selected.
    s.newEntry = editable && idle;
    s.moveUp = in.selected > 0 && editable && idle;
    s.moveDown = selected && editable && in.selected < in.count - 1 && idle;
    s.deleteEntry = selected && editable && idle;
    s.saveRecord = editable && in.recordEdited && idle;
    s.saveVisible = in.support;
    s.userFolders = in.foldersFromUser;
    s.processAll = in.count > 0 && idle;
    s.processFile = selected && idle;
    s.cancel = in.busy;
    s.close = idle;
    s.supportControls = in.support;
    return s;
}

} // namespace quorvel

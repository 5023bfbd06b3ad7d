#include "app/control_states.h"

namespace quorvel {

ControlStates DeriveControlStates(const ControlInputs& in) {
    const bool editable = in.listFromUser;
    const bool idle = !in.busy;
    const bool selected = in.selected >= 0;
    ControlStates s;
    s.recordFields = editable && idle;
    s.fileList = idle;
    s.fileMenu = editable;
    s.fileMenuEnabled = idle;
    s.getFileList = !editable && idle;
    s.clearFiles = idle;
    s.newEntry = selected && editable && idle;
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

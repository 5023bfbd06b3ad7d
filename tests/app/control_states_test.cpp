// Which controls the window offers, from its data alone.

#include "app/control_states.h"

#include <gtest/gtest.h>

namespace quorvel {
namespace {

// The record commands: "New", up, down, "Delete", "Process file".
struct Commands {
    bool newEntry, up, down, remove, processFile;
    bool operator==(const Commands&) const = default;
};

Commands CommandsOf(const ControlStates& s) {
    return {s.newEntry, s.moveUp, s.moveDown, s.deleteEntry, s.processFile};
}

TEST(ControlStates, RecordCommandsFollowTheSelectionInAListTheUserKeeps) {
    struct Case {
        int selected;
        Commands expected;
    };
    // "New" adds to an empty list or one with nothing selected too.
    const Case cases[] = {{-1, {true, false, false, false, false}},
                          {0, {true, false, true, true, true}},
                          {1, {true, true, true, true, true}},
                          {2, {true, true, false, true, true}}};
    for (const Case& c : cases) {
        ControlInputs in{.listFromUser = true, .selected = c.selected, .count = 3};
        const ControlStates s = DeriveControlStates(in);
        EXPECT_EQ(CommandsOf(s), c.expected) << c.selected;
        EXPECT_TRUE(s.processAll && s.fileMenu && !s.getFileList);
        // Without a selection there is no record to edit.
        EXPECT_EQ(s.recordFields, c.selected >= 0) << c.selected;
    }
    EXPECT_TRUE(DeriveControlStates({.listFromUser = true}).newEntry); // an empty list
    // The only entry can move neither way.
    const ControlStates only =
        DeriveControlStates({.listFromUser = true, .selected = 0, .count = 1});
    EXPECT_FALSE(only.moveUp || only.moveDown);
}

TEST(ControlStates, AListFromTheAdministratorLocksItsRecordsButStillRuns) {
    const ControlStates s = DeriveControlStates({.selected = 1, .count = 3});
    EXPECT_EQ(CommandsOf(s), (Commands{false, false, false, false, true}));
    EXPECT_FALSE(s.recordFields || s.fileMenu || s.saveRecord || s.userFolders);
    EXPECT_TRUE(s.getFileList && s.processAll);
    EXPECT_TRUE(DeriveControlStates({.foldersFromUser = true}).userFolders);
    EXPECT_FALSE(DeriveControlStates({}).processAll); // an empty list
}

TEST(ControlStates, DuringARunOnlyCancelIsOfferedAndTheListStaysStill) {
    const ControlStates s = DeriveControlStates(
        {.listFromUser = true, .busy = true, .recordEdited = true, .selected = 1, .count = 3});
    EXPECT_EQ(CommandsOf(s), (Commands{false, false, false, false, false}));
    EXPECT_TRUE(s.cancel);
    EXPECT_FALSE(s.processAll || s.close || s.fileList || s.recordFields || s.saveRecord ||
                 s.fileMenuEnabled || s.clearFiles);
    const ControlStates idle = DeriveControlStates({.listFromUser = true, .count = 3});
    EXPECT_TRUE(idle.close && idle.fileList && idle.fileMenuEnabled && !idle.cancel);
}

TEST(ControlStates, SupportModeShowsTheAdministrativeControlsAndSaveAfterAnEdit) {
    EXPECT_FALSE(DeriveControlStates({.listFromUser = true}).supportControls);
    const ControlStates support = DeriveControlStates({.listFromUser = true, .support = true});
    EXPECT_TRUE(support.supportControls && support.saveVisible && !support.saveRecord);
    EXPECT_TRUE(DeriveControlStates({.listFromUser = true, .support = true, .recordEdited = true})
                    .saveRecord);
}

} // namespace
} // namespace quorvel

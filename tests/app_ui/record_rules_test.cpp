// The record fields and their mutual rules, and how edits reach the records.

#include "window_fixture.h"

#include <QDir>

namespace quorvel::testing {
namespace {

class RecordRulesTest : public WindowTest {
protected:
    void SetUp() override {
        UserMaintainsList();
        WriteList({Line("A", "a.csv"), Line("B", "b.csv")});
        Start();
        Select(0);
    }
    int Download() { return C().Opt_Download->CheckedIndex(); }
    int Upload() { return C().Opt_Upload->CheckedIndex(); }
    int Method() { return C().Opt_MethodID->CheckedIndex(); }
    void ChooseType(int typeId) {
        C().Cmb_TypeID->setCurrentIndex(C().Cmb_TypeID->findData(typeId));
    }
};

TEST_F(RecordRulesTest, AlwaysInOneDirectionExcludesAlwaysInTheOther) {
    C().Opt_Upload->Button(kUploadAlways)->click();
    C().Opt_Download->Button(kDownloadAlways)->click();
    EXPECT_EQ(Download(), kDownloadAlways);
    EXPECT_EQ(Upload(), kUploadNever);

    C().Opt_Upload->Button(kUploadAlways)->click();
    EXPECT_EQ(Upload(), kUploadAlways);
    EXPECT_EQ(Download(), kDownloadNever);
}

TEST_F(RecordRulesTest, ZippedFilesAlwaysTravelWhole) {
    C().Opt_MethodID->Button(kMethodCompleteFile)->click();
    C().Chk_Zip->setChecked(true);
    C().Opt_MethodID->Button(kMethodOnlyNewData)->click();
    EXPECT_FALSE(C().Chk_Zip->isChecked());

    C().Chk_Zip->click();
    EXPECT_TRUE(C().Chk_Zip->isChecked());
    EXPECT_EQ(Method(), kMethodCompleteFile);
}

TEST_F(RecordRulesTest, DataTypeChoosesTheMethod) {
    ASSERT_EQ(C().Cmb_TypeID->count(), 9);
    EXPECT_EQ(C().Cmb_TypeID->itemText(0), "[no date]");
    C().Chk_Zip->setChecked(true);
    ChooseType(4);
    EXPECT_EQ(Method(), kMethodOnlyNewData);
    // Only new data never travels zipped.
    EXPECT_FALSE(C().Chk_Zip->isChecked());
    ChooseType(0);
    EXPECT_EQ(Method(), kMethodCompleteFile);
}

TEST_F(RecordRulesTest, ShowingARecordIsNoEdit) {
    Select(1);
    EXPECT_FALSE(window->Flags().RecordEdited);
    EXPECT_FALSE(window->Files().ListChanged);
    EXPECT_FALSE(C().Cmd_DoFile[4]->isEnabled());
}

TEST_F(RecordRulesTest, EditsReachTheRecordWhenAnotherEntryIsSelected) {
    C().Txt_Name->setText("Rain gauge");
    EXPECT_EQ(C().Lst_Files->item(0)->text(), "Rain gauge");
    C().Txt_FileName->setText("sub/rain.csv");
    C().Opt_AdminLocationID->Button(kLocationUser)->click();
    C().Opt_UserLocationID->Button(kLocationOther)->click();
    C().Txt_Folder->setText("logs");
    C().Txt_FileDate->setText("1 Nov 2024");
    C().Chk_Active->setChecked(false);
    ChooseType(2);
    EXPECT_TRUE(window->Flags().RecordEdited);
    EXPECT_TRUE(window->Files().ListChanged);
    // Not stored yet.
    EXPECT_EQ(window->Files().At(0).Name, "A");

    Select(1);
    const FileRecord& r = window->Files().At(0);
    EXPECT_EQ(r.Name, "Rain gauge");
    EXPECT_EQ(r.FileName, "sub/rain.csv");
    EXPECT_EQ(r.AdminLocationID, kLocationUser);
    EXPECT_EQ(r.UserLocationID, kLocationOther);
    EXPECT_EQ(r.Folder, "logs");
    EXPECT_EQ(r.FileDate, "1 Nov 2024");
    EXPECT_EQ(r.Active, 0);
    EXPECT_EQ(r.TypeID, 2);
    EXPECT_EQ(r.MethodID, kMethodOnlyNewData);
    // The fields now show the second record, unedited.
    EXPECT_EQ(C().Txt_Name->text(), "B");
    EXPECT_FALSE(window->Flags().RecordEdited);

    Select(0);
    EXPECT_EQ(C().Txt_Folder->text(), "logs");
    EXPECT_EQ(C().Opt_UserLocationID->CheckedIndex(), kLocationOther);
}

TEST_F(RecordRulesTest, FileNameFromTheChooserSetsTheUserLocation) {
    C().Txt_UserFolder->setText("Farm1");
    AnswerDialogs({home.File("Farm1/site.csv")});
    C().Cmd_LocateFile->click();
    EXPECT_EQ(dialogsShown, 1);
    EXPECT_EQ(C().Txt_FileName->text(), "site.csv");
    EXPECT_EQ(C().Opt_UserLocationID->CheckedIndex(), kLocationUser);
    EXPECT_TRUE(C().Txt_Folder->text().isEmpty());

    AnswerDialogs({"/elsewhere/x.dat"});
    C().Cmd_LocateFile->click();
    EXPECT_EQ(C().Opt_UserLocationID->CheckedIndex(), kLocationOther);
    EXPECT_EQ(C().Txt_Folder->text(), QDir::toNativeSeparators("/elsewhere"));

    // A cancelled dialog changes nothing and shows nothing.
    AnswerDialogs({});
    C().Cmd_LocateFile->click();
    EXPECT_EQ(C().Txt_FileName->text(), "x.dat");
    EXPECT_TRUE(ports.prompter.shown.empty());
}

} // namespace
} // namespace quorvel::testing

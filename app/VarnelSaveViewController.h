#pragma once

#include <memory>
#include <string_view>

#include "app/SaveControl.h"
#include "platform/Clock.h"
#include "platform/DeviceFiles.h"
#include "platform/Resources.h"
#include "platform/ui/UserInterface.h"

namespace varnel {

/// The screen that saves a snapshot: it lists what will be saved, takes a description and writes the file.
class VarnelSaveViewController final : public ModalController,
                                       public TableViewDelegate,
                                       public TextFieldDelegate {
 public:
  /// What the screen may ask of its host. Everything outlives the screen.
  struct Host {
    UserInterface& userInterface;
    const Resources& resources;
    DeviceFiles& files;
    const Clock& clock;
    SaveControl& saveControl;
  };

  /// A screen for these save contents, as they are now: what changes later is not saved. Null, with a line in
  /// the log, when the interface resource cannot be read.
  static std::shared_ptr<VarnelSaveViewController> initWithSaveHistory(const Host& host,
                                                                       const Value& saveHistory);

  /// The outlets; null where the interface resource has none.
  TableView* saveContentTable() const { return _saveContentTable; }
  void setSaveContentTable(TableView* table) { _saveContentTable = table; }
  TextField* saveDescription() const { return _saveDescription; }
  void setSaveDescription(TextField* field) { _saveDescription = field; }

  /// Writes the snapshot file, says so when that fails, and has the screen closed either way.
  void savePressed();
  /// Has the screen closed.
  void cancelPressed();
  /// Hides the keyboard.
  void backgroundTouched();

  ModalScreen& screen() override { return *_screen; }
  void viewDidLoad() override;
  void viewWillAppear(Animation animation) override;

  bool textFieldShouldReturn(TextField& field) override;

  std::size_t numberOfSectionsInTableView(TableView& table) override;
  std::size_t tableView_numberOfRowsInSection(TableView& table, std::size_t section) override;
  std::unique_ptr<TableCell> tableView_cellForRowAtIndexPath(TableView& table,
                                                             const IndexPath& path) override;
  void tableView_didSelectRowAtIndexPath(TableView& table, const std::optional<IndexPath>& path) override;

 private:
  VarnelSaveViewController(const Host& host, const Value& saveHistory);
  void load(const ScreenLayout& layout);
  void perform(std::string_view action);

  Host _host;
  Value _saveHistory;
  Time _timeStamp;
  std::unique_ptr<ModalScreen> _screen;
  TableView* _saveContentTable = nullptr;
  TextField* _saveDescription = nullptr;
};

}  // namespace varnel

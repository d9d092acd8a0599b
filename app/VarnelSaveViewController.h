#pragma once

#include <memory>
#include <string_view>

#include "app/SaveControl.h"
#include "platform/Clock.h"
#include "platform/DeviceFiles.h"
#include "platform/Resources.h"
#include "platform/ui/UserInterface.h"

namespace varnel {

/// The screen that saves a snapshot. It lists what is going to be saved, takes a description, and writes the
/// file.
class VarnelSaveViewController final : public ModalController,
                                       public TableViewDelegate,
                                       public TextFieldDelegate {
 public:
  /// What the screen needs from its host. Every object in it must outlive the screen.
  struct Host {
    UserInterface& userInterface;
    const Resources& resources;
    DeviceFiles& files;
    const Clock& clock;
    SaveControl& saveControl;
  };

  /// Makes a screen for the save contents as they are now; later changes are not saved. Null when the
  /// interface resource cannot be read; a log line then says so.
  static std::shared_ptr<VarnelSaveViewController> initWithSaveHistory(const Host& host,
                                                                       const Value& saveHistory);

  /// The outlets; null for those that the interface resource does not have.
  TableView* saveContentTable() const { return _saveContentTable; }
  void setSaveContentTable(TableView* table) { _saveContentTable = table; }
  TextField* saveDescription() const { return _saveDescription; }
  void setSaveDescription(TextField* field) { _saveDescription = field; }

  /// Writes the snapshot file, reports a failure, and closes the screen in both cases.
  void savePressed();
  /// Closes the screen.
  void cancelPressed();
  /// Hides the on-screen keyboard.
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

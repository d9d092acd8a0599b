#include "app/VarnelSaveViewController.h"

#include <utility>

#include "app/Snapshot.h"
#include "base/Dictionary.h"
#include "base/Log.h"

namespace varnel {

namespace {

constexpr std::string_view interfaceResource = "VarnelSaveViewController";
constexpr std::string_view cellIdentifier = "SaveHistoryContentCell";
constexpr double cellFontSize = 13;

std::string_view descriptionOf(const Value& entry) {
  const Dictionary* entries = entry.dictionary();
  const std::string* text = entries ? entries->get("Description").string() : nullptr;
  return text ? std::string_view(*text) : std::string_view();
}

}  // namespace

std::shared_ptr<VarnelSaveViewController> VarnelSaveViewController::initWithSaveHistory(
    const Host& host, const Value& saveHistory) {
  const auto layout = ScreenLayout::fromResource(host.resources.propertyList(interfaceResource));
  if (!layout) {
    logError("Could not load the interface resource %s", interfaceResource);
    return nullptr;
  }
  std::shared_ptr<VarnelSaveViewController> controller(new VarnelSaveViewController(host, saveHistory));
  controller->load(*layout);
  return controller;
}

// The entries share their sections with the live display. The copy must not change with it, so it needs its
// own sections.
VarnelSaveViewController::VarnelSaveViewController(const Host& host, const Value& saveHistory)
    : _host(host), _saveHistory(saveHistory.deepCopy()), _timeStamp(host.clock.now()) {}

void VarnelSaveViewController::load(const ScreenLayout& layout) {
  _screen = _host.userInterface.makeModalScreen(layout, [this](std::string_view action) { perform(action); });
  _saveContentTable = _screen->table("saveContentTable");
  _saveDescription = _screen->textField("saveDescription");
  if (_saveContentTable) _saveContentTable->setDelegate(this);
}

void VarnelSaveViewController::perform(std::string_view action) {
  static constexpr std::pair<std::string_view, void (VarnelSaveViewController::*)()> operations[] = {
      {"savePressed:", &VarnelSaveViewController::savePressed},
      {"cancelPressed:", &VarnelSaveViewController::cancelPressed},
      {"backgroundTouched:", &VarnelSaveViewController::backgroundTouched},
  };
  for (const auto& [name, operation] : operations) {
    if (name == action) (this->*operation)();
  }
}

void VarnelSaveViewController::viewDidLoad() {
  if (_saveDescription) _saveDescription->setDelegate(this);
  ModalController::viewDidLoad();
  if (_saveContentTable) _saveContentTable->sizeToFit();
}

void VarnelSaveViewController::viewWillAppear(Animation) {
  _screen->setFrame(_host.userInterface.applicationFrame());
}

void VarnelSaveViewController::savePressed() {
  const auto description = _saveDescription ? _saveDescription->text() : std::nullopt;
  const Value contents = snapshotContents(_timeStamp, _saveHistory, description);
  const FileWriting writing = writeSnapshot(_host.files, _host.clock, contents);
  _host.saveControl.snapshotWasWritten(writing);
  if (!writing.isDone())
    _host.userInterface.showAlert({"File Error", "Unable to write file to disk", "Close"});
  _host.saveControl.closeSaveViewLater();
}

void VarnelSaveViewController::cancelPressed() { _host.saveControl.closeSaveViewLater(); }

void VarnelSaveViewController::backgroundTouched() {
  if (_saveDescription) _saveDescription->resignFirstResponder();
}

bool VarnelSaveViewController::textFieldShouldReturn(TextField& field) {
  field.resignFirstResponder();
  return true;
}

std::size_t VarnelSaveViewController::numberOfSectionsInTableView(TableView&) { return 1; }

std::size_t VarnelSaveViewController::tableView_numberOfRowsInSection(TableView&, std::size_t) {
  const Array* entries = _saveHistory.array();
  return entries ? entries->size() : 0;
}

std::unique_ptr<TableCell> VarnelSaveViewController::tableView_cellForRowAtIndexPath(TableView& table,
                                                                                     const IndexPath& path) {
  auto cell = table.dequeueReusableCell(cellIdentifier);
  if (!cell) cell = std::make_unique<TableCell>(table.makeCellView(CellStyle::Default), cellIdentifier);
  cell->cellView().setText(descriptionOf(_saveHistory.array()->at(path.row)));
  cell->cellView().setTextFont(Font::named("Helvetica", cellFontSize));
  // All entries are saved; the user cannot choose.
  cell->cellView().setAccessory(CellAccessory::Checkmark);
  return cell;
}

void VarnelSaveViewController::tableView_didSelectRowAtIndexPath(TableView&,
                                                                 const std::optional<IndexPath>&) {
  if (_saveDescription) _saveDescription->resignFirstResponder();
}

}  // namespace varnel

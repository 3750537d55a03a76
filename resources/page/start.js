// Beginning.

if (table && form) {
  startReview();
  startGroups();
  startTable();
  startGrouping();
  startKeys();
  startViewer();
  startMap();
  watchRows();
}

# What of the tests does not run on Windows, and why; docs/windows.md has this list too. A case that would not even compile
# there is left out by its source as well.
set(zor_not_on_windows)

# zor_leave_out(PROGRAM REASON [Suite.Case…]): these cases of a test program, or without any the whole of it.
function(zor_leave_out inProgram inReason)
  file(GLOB_RECURSE source ${PROJECT_SOURCE_DIR}/tests/${inProgram}.cpp)
  if(NOT source)
    message(FATAL_ERROR "NotOnWindows.cmake: there is no ${inProgram}.cpp")
  endif()
  file(READ ${PROJECT_SOURCE_DIR}/docs/windows.md paper)
  string(FIND "${paper}" "| `${inProgram}` | ${inReason} |" place)
  if(place EQUAL -1)
    message(SEND_ERROR "docs/windows.md has no line \"| `${inProgram}` | ${inReason} |\"")
  endif()
  if(NOT ARGN)
    set(zor_not_on_windows ${zor_not_on_windows} ${inProgram} PARENT_SCOPE)
    return()
  endif()
  file(READ ${source} text)
  set(filter "${zor_filter_of_${inProgram}}")
  foreach(case IN LISTS ARGN)
    string(REPLACE "." ",[ \n]*" pattern ${case})
    if(NOT text MATCHES "TEST(_[FP])?[(]${pattern}[)]")
      message(FATAL_ERROR "NotOnWindows.cmake: ${inProgram}.cpp has no ${case}")
    endif()
    string(APPEND filter ":${case}:*/${case}/*")
  endforeach()
  string(REGEX REPLACE "^:" "--gtest_filter=-" filter "${filter}")
  set(zor_filter_of_${inProgram} "${filter}" PARENT_SCOPE)
endfunction()

zor_leave_out(AtomicFile_test "links, pipes, owners, permissions and limits of Unix"
  AtomicFileTest.WhatReplacesTheNewFileIsTakenUp AtomicFileTest.PathThatIsNoTextIsWrittenByOneThatIs
  AtomicFileTest.LinkStaysAndItsTargetIsReplaced AtomicFileTest.DanglingLinkIsFollowedToItsTarget
  AtomicFileTest.DanglingLinkIntoNoFolderIsRefused AtomicFileTest.LinkInACircleIsRefusedAndStays
  AtomicFileTest.TemporaryFolderIsNotForWhatALinkLeadsTo AtomicFileTest.DeviceIsWrittenIntoAndStays
  AtomicFileTest.FullDeviceFails AtomicFileTest.PipeGetsAllTheBytesAndStays AtomicFileTest.AbandonedStreamGetsNothing
  AtomicFileTest.FolderThatIsReadOnlyIsRefusedAtOnce AtomicFileTest.FileThatIsReadOnlyIsRefusedAtOnce
  AtomicFileTest.WriteBeyondTheFileSizeLimitLeavesTheOldOne AtomicFileTest.CommitKeepsPermissions
  AtomicFileTest.NewFileHasThePermissionsThatTheMaskLeaves AtomicFileTest.UnfinishedFileIsReadByNobodyElse
  AtomicFileTest.CommitKeepsOwnerAndGroup AtomicFileTest.FileOfAnotherOwnerStaysTheirs
  AtomicFileTest.FileOfAnotherOwnerIsWholeAgainWhenItCannotBeOverwritten
  AtomicFileTest.CommitPassesOnNoRightsOfAnotherOwnersProgram AtomicFileTest.CommitKeepsExtendedAttributes
  AtomicFileTest.CommitKeepsAccessControlList)
zor_leave_out(ReadWholeFile_test "pipes, sockets, links, permissions and files of Unix"
  ReadWholeFile.PipeIsRefusedWithoutWaiting ReadWholeFile.PipeIsReadWhereStreamsAreAllowed
  ReadWholeFile.DeviceIsRefusedOrReadUpToTheLimit ReadWholeFile.SocketIsRefused
  ReadWholeFile.LinkIsFollowedAndACircleRefused ReadWholeFile.UnreadableFileIsRefused
  ReadWholeFile.FileThatTheSystemMakesUpIsReadToItsEnd)
zor_leave_out(ZORFile_test "links, devices, permissions and limits of Unix"
  ZORFileAccess.ForbiddenFileIsRefused ZORFWrite.FullDiskIsReported ZORFWrite.PartThatFittedIsReported
  ZORFCopy.OntoALinkChangesTheFileThatItLeadsTo ZORFCopy.FailureLeavesTheOldTargetWhole
  ZORFCopy.DeviceIsWrittenIntoNotReplaced ZORFCopy.OldTargetKeepsItsPermissions
  ZORFCopy.OntoADanglingLinkMakesTheFileThatItLeadsTo ZORFCopy.NewTargetHasThePermissionsOfTheSource)
zor_leave_out(TerminationSignals_test "a process of Windows is not ended by a signal")
zor_leave_out(ZORLyraXMLServicesFiles_test "a full device of Unix"
  FederatorDocument.OnAFullDiskStillSucceeds TextDump.OnAFullDiskGivesThePlatformsCode
  TreeDump.OnAFullDiskGivesThePlatformsCode)
zor_leave_out(ZORSettingRepository_test "a user's own settings are in another folder of Unix"
  ZORSettingRepository.HomeHoldsTheUserDirectoryByDefault)
zor_leave_out(BadInput_test "permissions, pipes and limits of Unix"
  BadInput.UnreadableFileIsRefused BadInput.PipeWithoutWriterIsRefusedAtOnce BadInput.DeviceIsRefused
  BadInput.DocumentBeyondTheMemoryIsRefused)
zor_leave_out(Federate_test "links and devices of Unix"
  LinksCheck.ReasonOfWhatIsNoFileIsNamed)
zor_leave_out(Merge_test "a shell, devices, links and permissions of Unix"
  Outputs.FailedWriteLeavesTheOldFileAndNothingElse Outputs.FullDeviceIsReported
  Outputs.DirectoryThatCannotBeWrittenIsReported Outputs.LinkIsFollowedAndPermissionsAreKept
  Outputs.NewFileHasTheUsualPermissions Outputs.PathOfBytesThatAreNoTextWorks)
zor_leave_out(Report_test "validated and shown by programs of Unix"
  ReportOfSample.FollowsItsDocumentType ReportOfSample.ShowsEachInterferenceAsARowOfAPage
  Report.NumbersRunOverAllResultSetsOnThePage Report.WhatReportsDoNotHoldIsLeftOut
  Report.ControlCharactersNeverReachTheFile)
zor_leave_out(ReviewVerbs_test "validated by programs of Unix"
  GateVerb.ReportsAreValid)
zor_leave_out(Exchange_test "other programs that read what is written, by a shell"
  ConvertToXlsx.IsOpenedByAnotherSpreadsheet ConvertToBcf.IsReadByAReaderThatNobodyHereWrote)
if(NOT ZOR_WITH_PAGES)
  zor_leave_out(ReviewVerbs_test "pages and pictures are not built"
    DiffVerb.PageShowsWhatBecameOfEach)
  zor_leave_out(Exchange_test "pages and pictures are not built"
    ConvertToBcf.WritesWhatTheOfficialSchemasAllow ConvertToXlsx.HasThumbnailsOfAModelOrOfAPage)
endif()
zor_leave_out(RunLyra_test "a shell, devices and terminals of Unix"
  Streams.PipeOnStandardInputIsReadForADash Streams.ReaderThatLeavesEndsTheCommandQuietly Streams.FullDiskIsReported
  Streams.FullDiskIsReportedForAShortAnswerToo Streams.ClosedStandardOutputIsReported
  Terminal.TableIsCutToTheColumnsAndItsHeaderIsBold Terminal.NoColorKeepsTheHeaderPlain
  Terminal.CsvOfADocumentCannotDriveIt)

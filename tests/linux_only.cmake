# Tests that hold on Linux alone, each group with the reason. On Windows every other test of the same sources runs.
set(linux_only
  # Folders and files that Windows doesn't have, or that Wine doesn't show: pipes, links that lead nowhere or in a
  # circle, permission bits, devices such as /dev/full, names that no text in UTF-16 can bear or that hold a backslash
  # or a wildcard, two names that differ in letter case only, folders that are removed while a process is in them.
  BinaryFile.AFileCreatedThroughADanglingLinkIsWhereTheLinkLeads
  BinaryFile.AFullDeviceRefusesTheWrite
  BinaryFile.APipeThatNobodyReadsIsNotWaitedForByAWriter
  BinaryFile.CreateMakesAFileForItsOwnerAlone
  BinaryFile.OnlyRegularFilesAreOpenedForReading
  CopyDirectoryTree.ADanglingLinkStopsTheCopy
  CopyDirectoryTree.APipeStopsTheCopyAtOnce
  CopyDirectoryTree.EveryNativeNameIsCopied
  CopyDirectoryTree.NamesThatDifferInCaseBecomeOne
  CopyFileTo.OnlyRegularFilesAreCopied
  CopyFileTo.TheCopyBelongsToItsOwnerAlone
  FileFinder.ABackslashInANameIsAUnitOfItsOwn
  FileFinder.AWildcardInAFolderIsAnOrdinarySign
  FileFinder.FindsLinksWhereverTheyLead
  FileFinder.ListsAFolderOfManyNamesInOrder
  FileFinder.NamesThatDifferInCaseAreOrderedByTheirUnits
  FileFinder.NativeNamesSurviveTheRoundTrip
  FindResourceFilesIn.LinkToAFileIsAFile
  FindResourceFilesIn.LoopOfLinksThatCannotBeIdentifiedEndsAtTheLimitOfTheSystem
  FindResourceFilesIn.OddNamesAndLinksAreFoundAsTheDefinitionSays
  FindResourceFilesIn.WalkEndsWherePathsBecomeTooLong
  GetCurrentDirectoryPath.OfARemovedFolderIsEmpty
  Include.OfWhatIsNoFileIsReported
  IsDirectory.AnythingElseIsNot
  IsExistingFile.WhatIsNoFolderIsAFile
  LoadResourceFile.NamesMayHoldAnyBytes
  LoadResourceFile.ThatCannotBeOpenedLeavesTheTreeAlone
  TargetScan.FileThatCannotBeOpenedLeavesNoTrace
  Tool.ResourceFileThatCannotBeOpenedIsPassedOver
  TextStream.AFullDiskIsNoticedAtOneByte
  TextStream.APipeThatNobodyReadsIsNotWaitedForByAWriter
  TextStream.NarrowPathsLeadToEveryNativeName
  TextStream.OnlyRegularFilesAreOpenedForReading
  TextStream.OpeningForWritingKeepsTheFilesOwnPermissions

  # Paths: on Linux there is one drive, native paths are taken as arguments and from the host, and the working folder
  # may be longer than the 261 bytes that Windows is asked for.
  ExampleProcess.ArgumentMayBeANativePath
  FPGAResTreeOf.HostRuntimeSaysWhereTheTargetsAre
  HostPathTest.TextIsGivenInTheFormOfTheSystem
  HostPathTest.TextMayBeAskedForAgain
  HostSpecialDirectory.EachNumberHasItsCode
  HostSpecialDirectory.IsAskedForByWayOfAPath
  HostProcess.RuntimeMayNameAnotherFolderByANativePath
  HostSpecialDirectory.TextOfTheHostMayBeNative
  Tool.TakesANativeAbsoluteArgument
  Tool.TakesANativeRelativeArgument
  GetCurrentDirectoryPath.IsInTheSystemsForm
  GetCurrentDirectoryPath.MayBeLongerThan260Units
  GetCurrentDirectoryPath.OfTheRootIsTheDrive
  PathFromArgument.*

  # A call inside a module reaches the module's own function on Windows, whatever the host exports.
  RuntimeExports.EachSetterCallsItsHookWithWhatWasSet

  # Exports as the linker of Linux lists them; Exports.AreTheListAndNothingElse has those of Windows.
  Tool.ExportsOneFunction

  # The main module answers for the C library, too.
  HostFunctionTable.RowIsBoundAnewWhenAnotherModuleAnswers

  # The child of a death test begins anew there, with a folder of its own that the parent can't look into.
  DeviceMenusDeathTest.TargetsBeforeTheTrapAreServedAndThoseBehindItAreNot

  # The memory that crosses the boundary is the system's own there: it can't be made to fail, nor does it trap.
  BoundaryFailureTest.GetProperty
  BoundaryString.FreeingWhatIsNoStringTraps
  BoundaryString.IsNullWithoutMemory
  BoundaryTaskMemory.AFailedReallocLeavesTheBlock

  # Wine asks its server about each name of a path and each file, one by one: these take minutes.
  CopyDirectoryTree.CopiesTwoThousandNestedFoldersOnASmallStack
  FindResourceFilesIn.DeepFoldersTakeNoStack
  Include.NestsTwoHundredAndFiftySixLevelsDeep

  # Paths of more than 4,095 bytes, which the system below Wine doesn't take, and a count of open descriptors.
  WalkOutOfMemory.NeverThrowsKeepsWhatWasFoundAndLeavesNothingOpen
  WalkOutOfMemory.TheTestForNewerFilesNeverThrows

  # The order and the equality of texts that are not of printable ASCII alone: the system's there, with the
  # differences that docs/platforms.md lists. Letters in full width are the commonest of them.
  Compare.FullWidthFormsEqualTheirAscii
  Compare.LetterCaseOutsideAsciiDoesNotCount
  Compare.OrdersAsciiBlankPunctuationDigitsLetters
  Compare.OrdersAsciiTheSameWithACharacterOutsideAsciiBehind
  Compare.OtherControlCharactersDoNotCount
  Compare.ScriptsFollowLatin
  ElementNodes.UnitsThatDoNotCountLeaveAWordTrue
  ElementNodes.WordsThatAreTrue
  ElementValues.WordForSpaceIsComparedByTheLanguage
  EntryList.FullWidthKeyIsTheSameKey
  EntryList.LongOrderedListFindsAsciiKeysByWideOnesAndTheOtherWayRound
  EntryList.OrderedListDoesWhatAVectorDoes
  EntryList.PlainAndOtherKeysMixInASortedList
  EntryList.SortedListDoesWhatAMapDoes
  FileFinder.OrdersOtherAlphabetsByTheirUpperCaseToo
  LocalizeText.ChoosesATextAndKeepsTheList
  MakeRelativeNodePath.ComponentsOutsideAsciiCompareByTheLanguage
  OpenElementParameters.NamesOutsideAsciiAreComparedByTheLanguage
  OpenElementParameters.UnitsThatDoNotCountMakeNoDifference
  Paths.FirstNameMayBeginWithAnyUnit
  Paths.NamesAreBlindToCase
  ResTreeNode.FullWidthKeyIsTakenByItsPlainSpelling
  XmlValue.WordIsBlindToCaseAndWidth

  # Bytes that are no UTF-8, and units that are no text, in the default code page: Windows puts its default character
  # in their place, Linux keeps them. For ASCII, Windows has letters without accents in the place of those with.
  AnsiToWide.DefaultCodePageBringsEverySequenceOfThreeBytesBack
  AnsiToWide.DefaultCodePageKeepsBytesThatAreNoUtf8
  HostStringTest.WidenedByTheDefaultCodePage
  ParseErrors.HalvesOfPairsAreNotWellFormed
  ParseErrorsOfFiles.BytesThatAreNotUtf8StandAsThemselvesInTheContext
  ParseErrorsOfFiles.ContextMayBeginInsideACharacter
  ParseErrorsOfFiles.ContextOfUtf16IsItsBytesUpToTheFirstNul
  ParseErrorsOfFiles.PartialCharacterAtTheEnd
  TextExports.NarrowTextBecomesUnitsOfTwoBytes
  TextExports.NarrowTextBecomesUtf8OfAtMostThreeBytesEach
  TextExports.UnitsOfTwoBytesBecomeNarrowText
  TextExports.Utf8BecomesNarrowText
  TreeExports.BytesThatAreNoUtf8SurviveInBothDirections
  TreeExports.LoneSurrogateBecomesAQuestionMark
  TreeQuery.PathAndOptionsReachTheTreeInOneForm
  WideToAnsi.DefaultCodePageGivesBytesBack
  WideToAnsi.DefaultCodePageHasAQuestionMarkForOtherLoneSurrogates
  WideToAnsi.UsAsciiHasAQuestionMarkForEachOtherUnit

  # Text mode: Linux has no translation. TextStream_windowsTest.cpp tests that of Windows.
  TextStream.AFailedReadIsShort
  TextStream.AFileOfOneBlockEndsWithAnEmptyOne
  TextStream.AReadThatTheSystemCutsShortGoesOn
  TextStream.NothingIsTranslatedOnReading
  TextStream.ReadsBlocksAndIsShortOnlyAtTheEnd
  TextStream.WritesAllOfTheText

  # The system's own texts for its errors, which Wine words otherwise, and its own record of the last one, which any
  # call may change.
  SystemError.MessageEndsInStopAndLineBreak
  WinError.CopyKeepsEverything
  WinError.HasTheMessageWithoutStopAndLineBreak
  WinError.HasTheSystemsTexts
  WinError.TakesTheNumberOfItsOwnThread)

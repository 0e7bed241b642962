// The exception family: one row per class, OMB_EXCEPTION(id, template).
// Each row declares the class OmbX<id>; "$1".."$3" in the template are
// replaced by the constructor's arguments. Include this file only with
// OMB_EXCEPTION and OMB_EXCEPTION_WITH_CODE (a class that also takes an
// operating-system error code) defined.
OMB_EXCEPTION(Abort, "Execution aborted!")
OMB_EXCEPTION(AlternativesHaveDifferentKnownDatums,
              "Alternatives $1 and $2 do not use the same knownDatum in FallbackedDatumShift $3.")
OMB_EXCEPTION(AreaBoundsEpsgCrsCodeNotFound,
              "No area of use was found for the EPSG coordinate reference system code $1.")
OMB_EXCEPTION(AreaBoundsEpsgDatumCodeNotFound, "No area of use was found for the EPSG datum code $1.")
OMB_EXCEPTION(Argument, "Invalid argument in $1.")
OMB_EXCEPTION(AtomsIllegalAtom, "Illegal atom")
OMB_EXCEPTION(AxisAbbreviationEpsgCrsCodeNotFound,
              "No axis abbreviations were found for the EPSG coordinate reference system code $1.")
OMB_EXCEPTION(
    BadProjectionParameters,
    "centralLongitude must be in the interval [-180,180] and centralLatitude must be in the interval [-90,90].")
OMB_EXCEPTION(BlockPoolError, "Block pool error: $1")
OMB_EXCEPTION(BothCommaAndDotInDegMinSecComponent,
              "$3. The string \"$1\", representing a $2 component, contains both a dot and a comma.")
OMB_EXCEPTION(OmbravelEngineNotInitialized, "Ombravel.Engine.Runtime.Initialize not called")
OMB_EXCEPTION(ColorRampLegendItemNeedsColorRamp, "The color ramp legend item $1 has no color ramp.")
OMB_EXCEPTION(ColorRampLegendItemNeedsVisualizer, "The color ramp legend item $1 has no visualizer.")
OMB_EXCEPTION(CrsIdError,
              "The id of Crs $1 cannot be extracted, because the authorityCode was $2 but should have been in the "
              "range epsg:1024 to epsg:32767.")
OMB_EXCEPTION(CrsNullValue, "Value \"$1\" is null in $2, and authorityCode is not given.")
OMB_EXCEPTION(CrsNullValueVariant,
              "In Crs $3, value \"$1\" is null but value \"$2\" is not, and automatic extraction from authorityCode "
              "requires both to be null.")
OMB_EXCEPTION(CrsNullValues,
              "Values \"$1\" and \"$2\" are both null in $3, and automatic extraction from authorityCode failed.")
OMB_EXCEPTION(DataSetSetIllegalCrs, "The Crs of data set $1 can not be set to $2: $3")
OMB_EXCEPTION(DecimalSeparatorInDegreesComponent,
              "$3. The string \"$1\", representing a degrees component, contains a decimal $2, but should be an "
              "integer since there is also a minutes component.")
OMB_EXCEPTION(DecimalSeparatorInMinutesComponent,
              "$3. The string \"$1\", representing a minutes component, contains a decimal $2, but should be an "
              "integer since there is also a seconds component.")
OMB_EXCEPTION(DifferentNumberOfGCP,
              "Length of geoPoints and imagePoints lists does not match. Failed to construct \t\t\t  projection $1.")
OMB_EXCEPTION(DirectXLoadError,
              "Unable to create drawable, could not load DirectX drivers. Please check your DirectX installation.")
OMB_EXCEPTION(EpsgCrsCodeNotFound, "The EPSG coordinate reference system code $1 was not found in the catalogue.")
OMB_EXCEPTION(EpsgCrsCodeOutOfRange,
              "The EPSG coordinate reference system code $1 is out of range; it should be between 1024 and 32767.")
OMB_EXCEPTION(EsriCodeFailed, "The ESRI coordinate reference system code $1 could not be converted: $2")
OMB_EXCEPTION(ExpressionParseError, "Error parsing expression '$1', position $2: $3")
OMB_EXCEPTION(ExternalDrawableRequired,
              "View $1: ExternalUpdate() can only be called for a view with an ExternalDrawable.")
OMB_EXCEPTION(FailedToCalculateRelativePath, "Failed to calculate the path of \"$1\" relative to \"$2\".")
OMB_EXCEPTION(FailedToConnectRasters, "Failed to connect the rasters $1 and $2: $3")
OMB_EXCEPTION(FallbackedDatumShiftFailed,
              "Cannot transform Lon = $1, Lat = $2 using FallbackedDatumShift $3, because no alternative succeeds.")
OMB_EXCEPTION(FeatureArchiveWriteError, "Failed to write feature archive \"$1\": $2")
OMB_EXCEPTION(FeatureInvalidGeometry, "An an attempt was made to use an unsupported geometry type.")
OMB_EXCEPTION(FontParseError, "Failed to parse the font \"$1\": $2")
OMB_EXCEPTION(GDALException, "GDAL error in $1: $2")
OMB_EXCEPTION(GDALFailedToReadReferenceSystem, "GDAL failed to read the reference system of \"$1\": $2")
OMB_EXCEPTION(GDALFailedToReadReferenceSystemfromTABFile,
              "GDAL failed to read the reference system from the TAB file \"$1\": $2")
OMB_EXCEPTION(GenericException, "$1")
OMB_EXCEPTION(GeodeticDatumIdError,
              "The id of GeodeticDatum $1 cannot be extracted, because the authorityCode was \" $2 \" but should have "
              "been in the range \"epsg:1024\" to \"epsg:32767\".")
OMB_EXCEPTION(GreatCircleApproxRouteNotImplemented,
              "Please adjust the GreatCircleNodeErrorMax instead, because $1.Route() with lineType = GreatCircleApprox "
              "is not implemented")
OMB_EXCEPTION(HashGeneratorError, "Hash generator error: $1")
OMB_EXCEPTION(IOException, "$1")
OMB_EXCEPTION(IllegalArgument, "Illegal argument: $1")
OMB_EXCEPTION(IllegalDegree, "Illegal degree $1 in $2.")
OMB_EXCEPTION(IllegalPresentationObjectDrawable, "The presentation object $1 can not be drawn on the drawable $2.")
OMB_EXCEPTION(IllegalValue, "Value \"$1\" is illegal in $2")
OMB_EXCEPTION(ImageLoadError, "Failed to load the image \"$1\": $2")
OMB_EXCEPTION(ImageSaveError, "Failed to save the image \"$1\": $2")
OMB_EXCEPTION(ImageTypeUnknown, "The type of the image \"$1\" is unknown.")
OMB_EXCEPTION(IncomleteStudioFile,
              "File is a temporary Ombravel Studio file, and does not contain a complete configuration. It can only be "
              "opened by Ombravel Studio.")
OMB_EXCEPTION(IncompatibleMeshes, "The meshes $1 and $2 are incompatible: $3")
OMB_EXCEPTION(IncompleteDatum, "The geodetic datum $1 is incomplete: $2 is missing.")
OMB_EXCEPTION(InconsistentKeyTypes,
              "All keys in the key/value table for a keyed attribute variable must have the same type")
OMB_EXCEPTION(IndexFileNameError, "Name and IndexFileNameQualifier must be specified to use dataset file index.")
OMB_EXCEPTION(IndexOutOfBounds, "Indexing in OmbPoint is out of bounds!")
OMB_EXCEPTION(IndexingError, "Dataset $1: Exception occured on worker thread while indexing data files: $2")
OMB_EXCEPTION(InternalError, "An internal error occured. $1. Please report this error to " OECORE_SUPPORT_ADDRESS ".")
OMB_EXCEPTION(InvalidCoordinateReferenceSystem,
              "The feature does not use the same coordinate reference system as the MemoryDataSet.")
OMB_EXCEPTION(InvalidDatabasePath, "The database path \"$1\" is invalid: $2")
OMB_EXCEPTION(InvalidOperation, "$1")
OMB_EXCEPTION(LoadIndexFile, "Failed to load dataset index file $1. Reason: $2")
OMB_EXCEPTION(LoadIndexInternal, "Internal error while loading the index file \"$1\": $2")
OMB_EXCEPTION(LoadLayerSetError, "Failed to load the layer set \"$1\": $2")
OMB_EXCEPTION(MapApplierFailed, "The map applier failed: $1")
OMB_EXCEPTION(MatrixSizeIllegal, "Illegal matrix size $1 x $2.")
OMB_EXCEPTION(MatrixSizeMismatch, "The matrix sizes $1 and $2 do not match in $3.")
OMB_EXCEPTION(MatrixSizeNotSquare, "The matrix of size $1 is not square in $2.")
OMB_EXCEPTION(MemoryBlockTooLarge, "The memory block is too large and cannot be allocated.")
OMB_EXCEPTION(MemoryDataSetFeatureOutside, "The feature is outside the bounds of the MemoryDataSet $1.")
OMB_EXCEPTION(MinusInDegMinSecComponent,
              "$3. The string \"$1\", representing a $2 component, contains a minus, but should be an non-negative "
              "integer since there is also a hemisphere character.")
OMB_EXCEPTION(ModelLoadError, "Failed to load the model \"$1\": $2")
OMB_EXCEPTION(ModelSaveError, "Failed to save the model \"$1\": $2")
OMB_EXCEPTION(ModelTypeUnknown, "The type of the model \"$1\" is unknown.")
OMB_EXCEPTION(MultiFileDataSetError,
              "Dataset $1: no valid data files found during indexing; check path and fileName properties")
OMB_EXCEPTION(NoAlternativesInFallbackedDatumShift,
              "No alternatives given for FallbackedDatumShift $1; needs at least two.")
OMB_EXCEPTION(NoDatumShiftForNad27,
              "Cannot construct the OGC coordinate system Crs:27 (NAD27 with Long before Lat) because no datum shift "
              "for NAD27 was given, and Ombravel does not know any generally useful datum shift. (You would get a "
              "datum shift for Contiguous U.S. if you had used DatumShiftChoice = Lenient.)")
OMB_EXCEPTION(NoDefaultValue, "Attribute variable has no default value")
OMB_EXCEPTION(NoDigitsInDegMinSecComponent, "$3. Empty string as $1 component, should be 1 to $2 digits.")
OMB_EXCEPTION(NoFilesFoundByGridFileDatumShift,
              "In GridFileDatumShift $1, no files in the folder $2 matched the given fileName $3")
OMB_EXCEPTION(
    NoIntPartInDegMinSecComponent,
    "$3. The string \"$1\", representing a $2 component, must have one or two digits before the decimal separator.")
OMB_EXCEPTION(NonDigitInDegMinSecComponent, "$3. The string \"$1\", representing a $2 component, contains a non-digit.")
OMB_EXCEPTION(NonDigitInDegMinSecComponentFrac,
              "$3. The string \"$1\", representing a $2 component, contains a non-digit in its fractional part.")
OMB_EXCEPTION(NonInvertibleTransform, "The transform $1 can not be inverted.")
OMB_EXCEPTION(NotEnoughData, "Not enough data in $1: $2")
OMB_EXCEPTION(NotEnoughGCP, "There are not enough control points to establish a polynomial of degree $1")
OMB_EXCEPTION(NotImplemented, "$1 is not yet implemented.")
OMB_EXCEPTION(NotSupported, "$1 is not supported.")
OMB_EXCEPTION(NullValue, "Value \"$1\" is null in $2.")
OMB_EXCEPTION(NumericMethodFailed, "The numeric method $1 failed to converge in $2.")
OMB_EXCEPTION(ObjectNotClonable, "Objects of type $1 can not be cloned.")
OMB_EXCEPTION(OnlyOneAlternativeInFallbackedDatumShift,
              "Only one alternative given for FallbackedDatumShift $1; needs at least two.")
OMB_EXCEPTION(OperatorIllegalInputType, "The operator $1 can not take input of type $2.")
OMB_EXCEPTION(OperatorInputMissing, "Input to operator $1 is missing.")
OMB_EXCEPTION(OrdinaryLayerCacheError, "Cache error in layer $1: $2")
OMB_EXCEPTION(PointOutsideGridFileDatumShift,
              "Can't transform Lon = $1, Lat = $2 using GridFileDatumShift $3, because the point is not covered by the "
              "grid files.")
OMB_EXCEPTION(PolarStereographicTooManyArgumentsSpecified,
              "in $1, at least one of scaleFactor and standardParallel must have its default value or be unspecified.")
OMB_EXCEPTION(ProfilerNotRunning, "This profiler instance is not running.")
OMB_EXCEPTION(ProfilerRunning, "A profiler instance is already running.")
OMB_EXCEPTION(ProjUnsupported, "The PROJ definition \"$1\" is not supported: $2")
OMB_EXCEPTION(ProjectionError, "Projection error in $1, $2")
OMB_EXCEPTION(ProjectionFromFailure, "Can't project from $1.")
OMB_EXCEPTION(ProjectionFromFailureEx, "Failed to unproject the point ($1) with projection $2: $3")
OMB_EXCEPTION(ProjectionToFailure, "Can't project to $1.")
OMB_EXCEPTION(ProjectionToFailureEx, "Failed to project the point ($1) with projection $2: $3")
OMB_EXCEPTION(PropertyFrozen, "The property \"$1\" can not be changed after the object has been initialized.")
OMB_EXCEPTION(PropertyReadOnly, "The property \"$1\" is read-only in this class.")
OMB_EXCEPTION(RSTreeFileFormat, "invalid file format, height expected to be positive")
OMB_EXCEPTION(RangeError, "Value \"$1\" is out of range in $2, should be $3.")
OMB_EXCEPTION(RasterGeometryFloatRasterUnsupported, "The raster geometry $1 does not support floating-point rasters.")
OMB_EXCEPTION(RasterGeometryMultiBandRasterUnsupported,
              "The raster geometry $1 does not support rasters with several bands.")
OMB_EXCEPTION(RasterGeometryNoMemory, "Out of memory while allocating raster geometry $1 of $2 bytes.")
OMB_EXCEPTION(RasterGeometryUnsupportedBandParameters,
              "The raster geometry $1 does not support the band parameters $2.")
OMB_EXCEPTION(RasterGeometryZeroSize, "The raster geometry $1 has zero size.")
OMB_EXCEPTION(RasterMergeDifferentBitDepth, "The rasters $1 and $2 can not be merged: their bit depths differ.")
OMB_EXCEPTION(RasterMergeIncompatibleFormat, "The rasters $1 and $2 can not be merged: their formats are incompatible.")
OMB_EXCEPTION(RasterMergeOpDifferentCrs, "The rasters $1 and $2 can not be merged: their Crs differ.")
OMB_EXCEPTION(RasterMergeOpUnsupportedOperation, "The raster merge operation $1 is not supported.")
OMB_EXCEPTION(RasterNoColorTable, "The raster $1 has no color table.")
OMB_EXCEPTION(RasterTooLarge, "The raster $1 is too large: $2")
OMB_EXCEPTION(RasterUnsupportedBitDepth, "The bit depth $1 of raster $2 is not supported.")
OMB_EXCEPTION(RasterValueNotFound, "The value $1 was not found in raster $2.")
OMB_EXCEPTION(RasterZeroSize, "The raster $1 has zero size.")
OMB_EXCEPTION(ReadOnly, "The $1 is read-only.")
OMB_EXCEPTION(ReadOpNoDataSet, "The read operator $1 has no data set.")
OMB_EXCEPTION(RendererLoadError, "Unable to create drawable with renderer '$1'.")
OMB_EXCEPTION(ResourceException, "Failed to load resource with path: $1 filename: $2")
OMB_EXCEPTION(S52VisualizerNotConfigured, "The S-52 visualizer $1 is not configured.")
OMB_EXCEPTION(SaveIndexFile, "Failed to save dataset index file $1. Reason: $2")
OMB_EXCEPTION(SaveIndexInternal, "Internal error while saving the index file \"$1\": $2")
OMB_EXCEPTION(ScaleAttributeNotFound, "The scale attribute \"$1\" was not found in $2.")
OMB_EXCEPTION(SerializationUnknownKeyType,
              "Invalid key type found during serialization of a keyed attribute variable ($1)")
OMB_EXCEPTION(SharingViolation, "The $1 is owned by another object.")
OMB_EXCEPTION(SkyBoxError, "Sky box error: $1")
OMB_EXCEPTION(SpaceHomeNotFound, "Unable to locate Ombravel Engine libraries")
OMB_EXCEPTION(SpyCantOpenFile, "Can not open the spy file \"$1\": $2")
OMB_EXCEPTION(StereographicNumericMethodFailed,
              "The numeric method of the stereographic projection $1 failed to converge.")
OMB_EXCEPTION(StreamError, "Stream error in $1: $2")
OMB_EXCEPTION(StringConversionFailed, "Failed to convert string from $1 to $2.")
OMB_EXCEPTION(StringIndexOutOfRange, "String index was out of range.")
OMB_EXCEPTION(StringTooLong, "The given string exceeds the length limit.")
OMB_EXCEPTION(SvgError, "SVG error in \"$1\": $2")
OMB_EXCEPTION(SvgParseError, "Failed to parse the SVG document \"$1\": $2")
OMB_EXCEPTION(TextVisualizerUnsupportedAlignment, "The text visualizer $1 does not support the alignment $2.")
OMB_EXCEPTION(TileLayerBackgroundThread, "The background thread of tile layer $1 failed: $2")
OMB_EXCEPTION(TileLayerIllegalLayer, "The layer $1 can not be used in tile layer $2.")
OMB_EXCEPTION(TiledDataSetDiffConnected, "The tiled data set $1 is connected to a different data set: $2")
OMB_EXCEPTION(TooLongFileNameInGridFileDatumShift,
              "Can't transform coordinates using GridFileDatumShift $1, because a filename, including the path, was "
              "longer than 126 characters, namely $2")
OMB_EXCEPTION(TooManyDigitsInDegMinSecComponent1to2, "$3. Too long string $1 as $2 component, should be 1 to 2 digits.")
OMB_EXCEPTION(TooManyDigitsInDegMinSecComponent1to3, "$3. Too long string $1 as $2 component, should be 1 to 3 digits.")
OMB_EXCEPTION(TooManySeparatorsInDegMinSecComponent,
              "$3. The string \"$1\", representing a $2 component, contains too many decimal separators.")
OMB_EXCEPTION(TooNarrowRaster, "The raster $1 is too narrow: $2")
OMB_EXCEPTION(UnconnectedDatums,
              "Can't transform coordinates from GeodeticDatum $1 to GeodeticDatum $2, since there is no chain of "
              "DatumShifts connecting them.")
OMB_EXCEPTION(UndefinedValueWrongType, "The undefined value $1 does not hold a value of type $2.")
OMB_EXCEPTION(UnknownDatum, "Unknown geodetic datum \"$1\".")
OMB_EXCEPTION(UnknownPlugin, "Unknown plugin '$1'")
OMB_EXCEPTION(UnknownRasterFormat, "Unknown raster format \"$1\".")
OMB_EXCEPTION(UnknownRenderer, "Unable to create drawable, unknown renderer '$1'")
OMB_EXCEPTION(
    UnrecognizedAuthority,
    "Cannot construct Crs $1:$2, because the authority $1 is not recognized (only EPSG, CRS and ESRI are supported).")
OMB_EXCEPTION(UnsupportedAuthority, "Unsupported authority $1; only EPSG and CRS are supported as authorities in $2.")
OMB_EXCEPTION(UnsupportedCrsType, "The coordinate reference system type $1 is not supported in $2.")
OMB_EXCEPTION(UnsupportedDatumShiftCode, "The datum shift code $1 is not supported.")
OMB_EXCEPTION(UnsupportedEpsgExplicitDegreeRepresentation,
              "The EPSG degree representation $1 (unit code $2) is not supported.")
OMB_EXCEPTION(UnsupportedProjection, "Failed to write Ombravel CRS instance as Well-Known Text.")
OMB_EXCEPTION(UnsupportedProjectionType, "Projection type $1 is not supported by Ombravel")
OMB_EXCEPTION_WITH_CODE(WindowFunctionError, "Window function $1 failed in $2. Windows error code was $3.")
OMB_EXCEPTION(WorldFileError, "Failed to read the world file \"$1\": $2")
OMB_EXCEPTION(XmlAbstractClass, "Cannot create instance of abstract class $1")
OMB_EXCEPTION(XmlParserError, "$1")
OMB_EXCEPTION(XmlRequiredValueMissing, "RequiredValueMissing")
OMB_EXCEPTION(XmlTypeConversionFailed, "Type conversion failed")
OMB_EXCEPTION(MgrsFormatOldSchemeWithInappropriateEllipsoid,
              "Crs.FormatMgrs(). The geodetic datum was $1 with ellipsoid $2, but the lettering scheme was MgrsOld, "
              "which may be used only if the ellipsoid is Bessel 1841, Bessel Namibia, Clarke 1866 or Clarke 1880.")
OMB_EXCEPTION(MgrsParseOldSchemeWithInappropriateEllipsoid,
              "Crs.ParseMgrs(). The geodetic datum was $1 with ellipsoid $2, but the lettering scheme was MgrsOld, "
              "which may be used only if the ellipsoid is Bessel 1841, Bessel Namibia, Clarke 1866 or Clarke 1880.")
OMB_EXCEPTION(MgrsEmptyString, "Crs.ParseMgrs(). The MGRS reference was an empty string.")
OMB_EXCEPTION(MgrsTooShort, "Crs.ParseMgrs(). The MGRS reference \"$1\" was too short.")
OMB_EXCEPTION(MgrsIllegalZone, "Crs.ParseMgrs(). Illegal zone $1 in MGRS reference \"$2\"; must be 1 to 60.")
OMB_EXCEPTION(MgrsIncomplete100kmSquareId,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the grid zone designator \"$2\" should be followed by either "
              "nothing or a two-letter id for a 100 km square.")
OMB_EXCEPTION(MgrsIllegalFirstCharacter,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the first character must be either a digit (for UTM), or an "
              "uppercase A, B, Y or Z (for UPS).")
OMB_EXCEPTION(MgrsIllegalSecondCharacter,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", since the first character was a digit, the second character "
              "must be either a digit (for a two-digit UTM zone) or else an uppercase latitude band letter C - X "
              "except I and O (for a one-digit UTM zone).")
OMB_EXCEPTION(
    MgrsIllegalLatitudeBandLetterUtm,
    "Crs.ParseMgrs(). In MGRS reference \"$1\", the latitude band letter was \"$2\", but must be in the range C to X "
    "(except I and O) since the string started with a UTM zone number. (A, B, Y, Z are reserved for UPS.)")
OMB_EXCEPTION(MgrsIllegalLatitudeBandLetterUps,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the latitude band letter was \"$2\", but since there is no "
              "UTM zone number, the letter must be A or B for UPS south, or Y or Z for UPS north.")
OMB_EXCEPTION(MgrsIllegalColumnLetter,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the column letter was \"$2\", but must be a capital letter A "
              "- Z (except I and O).")
OMB_EXCEPTION(MgrsIllegalUtmColumnLetter0,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the column letter was \"$2\", but the UTM zone was $3, which "
              "uses only the column letters S,T,U,V,W,X,Y,Z.")
OMB_EXCEPTION(MgrsIllegalUtmColumnLetter1,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the column letter was \"$2\", but the UTM zone was $3, which "
              "uses only the column letters A,B,C,D,E,F,G,H.")
OMB_EXCEPTION(MgrsIllegalUtmColumnLetter2,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the column letter was \"$2\", but the UTM zone was $3, which "
              "uses only the column letters J,K,L,M,N,P,Q,R.")
OMB_EXCEPTION(MgrsIllegalRowLetter,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the row letter was \"$2\", but must be a capital letter A - "
              "Z (except I and O).")
OMB_EXCEPTION(MgrsIllegalUtmRowLetter,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the row letter was \"$2\", but UTM zone $3 was specified, "
              "and MGRS for UTM uses only the row letters A to V excluding I and O.")
OMB_EXCEPTION(MgrsIllegalUtmSquareIdNew,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the 100 km square id was \"$2\", but the UTM grid zone was "
              "$3, which does not contain such a square in the MgrsNew (AA) lettering scheme. Perhaps you should use "
              "the MgrsOld (AL) scheme and/or a different datum.")
OMB_EXCEPTION(MgrsIllegalUtmSquareIdOld,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the 100 km square id was \"$2\", but the UTM grid zone was "
              "$3, which does not contain such a square in the MgrsOld (AL) lettering scheme. Perhaps you should use "
              "the MgrsNew (AA) scheme and/or a different datum.")
OMB_EXCEPTION(MgrsIllegalColumnLetterInUpsA,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the column letter was \"$2\", but the UPS grid zone was A, "
              "which uses only the column letters J,K,L,P,Q,R,S,T,U,X,Y,Z.")
OMB_EXCEPTION(MgrsIllegalColumnLetterInUpsB,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the column letter was \"$2\", but the UPS grid zone was B, "
              "which uses only the column letters A,B,C,F,G,H,J,K,L,P,Q,R.")
OMB_EXCEPTION(MgrsIllegalColumnLetterInUpsY,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the column letter was \"$2\", but the UPS grid zone was Y, "
              "which uses only the column letters R,S,T,U,X,Y,Z.")
OMB_EXCEPTION(MgrsIllegalColumnLetterInUpsZ,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the column letter was \"$2\", but the UPS grid zone was Z, "
              "which uses only the column letters A,B,C,F,G,H,J.")
OMB_EXCEPTION(MgrsIllegalRowLetterInUpsSouth,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the row letter was \"$2\", but the UPS grid zone was $3, "
              "which uses only the row letters A to Z excluding I and O.")
OMB_EXCEPTION(MgrsIllegalRowLetterInUpsNorth,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the row letter was \"$2\", but the UPS grid zone was $3, "
              "which uses only the row letters A to P excluding I and O.")
OMB_EXCEPTION(MgrsNonDigitInNumericalLocation,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the $2th character was \"$3\", but should have been a digit "
              "(or space or tab).")
OMB_EXCEPTION(MgrsTooManySeparatedDigitGroups,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the numeric location \"$2\" consists of too many separated "
              "digit groups.")
OMB_EXCEPTION(MgrsLocalEastingAndNorthingOfUnequalLength,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the local easting \"$2\" and the local northing \"$3\" are "
              "separated by whitespace, but they do not have the same number of digits.")
OMB_EXCEPTION(MgrsWrongNumberOfDigitsInNumericalLocation,
              "Crs.ParseMgrs(). In MGRS reference \"$1\", the numerical location \"$2\" has $3 digits, but should have "
              "been 0, 2, 4, 6, 8 or 10 in MGRS (or possibly 12, 14 or 16 in USNG.)")
OMB_EXCEPTION(MgrsFormattingPointTooFarFromUserSelectedZone,
              "Crs.FormatMgrs(). Failed to format $1 as MGRS with user-selected UTM zone $2: the point is more than "
              "400 km from the zone's central meridian $3.")
OMB_EXCEPTION(MgrsFormattingPointTooFarNorthOfUserSelectedZone,
              "Crs.FormatMgrs(). Failed to format $1 as MGRS with user-selected UTM zone $2: the max latitude for UTM "
              "is cirka $3 (UTM northing = 9500 km). Use UPS North instead (zone = 90).")
OMB_EXCEPTION(MgrsFormattingPointTooFarSouthOfUserSelectedZone,
              "Crs.FormatMgrs(). Failed to format $1 as MGRS with user-selected UTM zone $2: the min latitude for UTM "
              "is cirka $3 (UTM northing = 1000 km). Use UPS South instead (zone = -90).")
OMB_EXCEPTION(MgrsFormattingPointTooFarFromUserSelectedUpsNorth,
              "Crs.FormatMgrs(). Failed to format $1 as MGRS with user-selected zone 90 meaning UPS North: the UPS "
              "coordinates are $2, but both must be in the range 1300000 to 2700000 m.")
OMB_EXCEPTION(MgrsFormattingPointTooFarFromUserSelectedUpsSouth,
              "Crs.FormatMgrs(). Failed to format $1 as MGRS with user-selected zone -90 meaning UPS South: the UPS "
              "coordinates are $2, but both must be in the range 800000 to 3200000 m.")

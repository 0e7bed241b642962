# omb answers --help, --version and info, and rejects unknown commands.
function(expect args rc pattern)
  execute_process(COMMAND ${CMAKE_COMMAND} -E env OMBRAVEL_ENGINE_MODULE_PATH=${MODULE_DIR} ${OMB} ${args}
                  RESULT_VARIABLE got OUTPUT_VARIABLE out ERROR_VARIABLE err)
  if(NOT got EQUAL rc)
    message(FATAL_ERROR "omb ${args}: exit ${got}, expected ${rc}\n${out}${err}")
  endif()
  if(NOT "${out}${err}" MATCHES "${pattern}")
    message(FATAL_ERROR "omb ${args}: output does not match '${pattern}':\n${out}${err}")
  endif()
endfunction()

expect("--help" 0 "Usage: omb")
expect("--version" 0 "omb 5\\.4\\.0\\.3")
expect("info" 0 "ChildObjectEnumerator : EngineObjectEnumerator")
expect("frobnicate" 2 "unknown command 'frobnicate'")

# The library's log goes where --log-file says, at the level asked.
set(log_dir ${CMAKE_CURRENT_BINARY_DIR}/omb-cli-log)
file(REMOVE_RECURSE ${log_dir})
expect("--log-file;${log_dir}/omb.log;--log-level;info;info" 0 "OECore 5\\.4\\.0\\.3")
file(READ ${log_dir}/omb.log log)
if(NOT log MATCHES "\\] INFO - Initialization complete")
  message(FATAL_ERROR "log file lacks the start-up lines:\n${log}")
endif()
if(NOT log MATCHES "\\] INFO - Shutdown complete")
  message(FATAL_ERROR "log file lacks the shutdown line:\n${log}")
endif()
expect("--log-level;loud;info" 1 "Illegal argument: --log-level loud")
expect("--log-file;/proc/omb/x.log;info" 1 "Invalid log file")
expect("--log-file" 2 "--log-file needs a value")

# Configurations: listing, parameters, resaving and errors with positions.
set(px_dir ${CMAKE_CURRENT_BINARY_DIR}/omb-cli-px)
file(REMOVE_RECURSE ${px_dir})
file(WRITE ${px_dir}/demo.px "<Configuration Namespace='Demo'>
  <TestPluginObject Name='P' Public='true' Value='{ConfigurationParameter Key=value, DefaultValue=1}'/>
  <TestPluginObject Name='Q' Public='true' Value='2'/>
</Configuration>
")
expect("info;${px_dir}/demo.px" 0 "Demo.P  TestPluginObject\n  Demo.Q  TestPluginObject\n2 public objects")
expect("resave;${px_dir}/demo.px;${px_dir}/copy.px;--param;value=7" 0 "")
file(READ ${px_dir}/copy.px copy)
if(NOT copy MATCHES "Name=\"P\" Value=\"7\" Public=\"true\"")
  message(FATAL_ERROR "resaved file lacks the parameter's value:\n${copy}")
endif()
expect("info;${px_dir}/copy.px" 0 "copy.P  TestPluginObject")
file(WRITE ${px_dir}/broken.px "<Configuration Namespace='Demo'>\n  <TestPluginObject Value='many'/>\n</Configuration>\n")
expect("info;${px_dir}/broken.px" 1 "broken.px: Failed to convert 'many' to type int. Row 2, Column 3.")
expect("info;${px_dir}/missing.px" 1 "Failed to open file: ")
expect("resave;${px_dir}/demo.px" 2 "resave takes 2 file names")

# Expressions against attributes given as literals.
expect("expr;class = 2 and not bridge;class=2;bridge=false" 0 "^true \\(bool\\)")
expect("expr;substr(name, 5);name=\"Main Road\"" 0 "\"Road\" \\(String\\)")
expect("expr;depth * 2;depth=-1.5" 0 "-3 \\(double\\)")
expect("expr;missing + 1" 0 "null")
expect("expr;class = = 2" 1 "Unexpected token\n  class = = 2\n          \\^")
expect("expr;a;a=harbour" 2 "'a=harbour' is not NAME=VALUE with a literal value")

# The bundled demo loads.
expect("info;${DEMO}" 0 "Harbour.OSGB36  GeodeticDatum\n4 public objects")

# Datum changes between a datum of the demo and the predefined WGS 84.
expect("datum;${DEMO};OSGB36;Datums.Wgs84;-2,53,100;1.5,51.2" 0
       "^-2\\.00144882[0-9] 53\\.00030801[0-9] 149\\.847[0-9]\n1\\.49822296[0-9] 51\\.20057303[0-9] 43\\.447[0-9]\n$")
expect("datum;${DEMO};Datums.Wgs84;OSGB36;-2.001448828,53.000308016,149.8475" 0 "^-2\\.00000000[0-9] 53\\.00000000[0-9] 100\\.000")
expect("datum;${DEMO};OSGB36;Nowhere;1,2" 1 "no geodetic datum named 'Nowhere'")
expect("datum;${DEMO};OSGB36;Datums.Wgs84;1,x" 2 "'1,x' is not LON,LAT or LON,LAT,H")
expect("datum;${DEMO};OSGB36" 2 "datum takes FILE.px FROM TO")

# Projections of the demo, predefined ones and UTM zones, both ways; the
# first point is the Ordnance Survey's worked example.
expect("project;${DEMO};BritishNationalGrid;OSGB36;1.717921583,52.657570306" 0 "^651409\\.90[0-9]+ 313177\\.27[0-9]+")
expect("unproject;${DEMO};BritishNationalGrid;OSGB36;651409.903,313177.270" 0 "^1\\.7179215[0-9]+ 52\\.6575703[0-9]+")
expect("project;${DEMO};Utm33S;Datums.Wgs84;15,0" 0 "^500000\\.0000 10000000\\.0000")
expect("project;${DEMO};Projections.mercator1SP_web;Datums.Wgs84;180,0" 0 "^20037508\\.3428 0\\.0000")
expect("project;${DEMO};Utm61N;Datums.Wgs84;1,2" 1 "no projection named 'Utm61N'")
expect("project;${DEMO};BritishNationalGrid;OSGB36;1" 2 "'1' is not LON,LAT or LON,LAT,H")
expect("unproject;${DEMO};BritishNationalGrid" 2 "unproject takes FILE.px PROJECTION DATUM and at least one X,Y")

# Coordinate systems by code, URN or predefined name; points as arguments or
# lines on standard input.
expect("transform;--from;epsg:27700;--to;epsg:4326;651409.903;313177.270" 0 "^1\\.71605[0-9]+ 52\\.65797[0-9]+ ")
expect("transform;--from;crs:84;--to;Crs.Wgs84Utm32N;10;55;100" 0 "^563967\\.42[0-9]+ 6095248\\.708[0-9]+ 100\\.0000")
expect("transform;--from;urn:ogc:def:crs:EPSG::3857;--to;epsg:4326;10018754.171394622;0" 0 "^90\\.000000000 0\\.000000000")
expect("transform;--from;epsg:1999;--to;epsg:4326;1;2" 1 "should be between 2000 and 5999")
expect("transform;--from;epsg:4326;1;2" 2 "transform takes --from CRS --to CRS")
expect("crs;epsg:2154" 0 "name: RGF93 v1 / Lambert-93\ncode: epsg:2154\nprojection: LCC_EPSG_2154 \\(LambertConformalConicProjection\\)")
expect("crs;Crs.Wgs84MercatorWeb" 0 "PROJCS\\[\"WGS 84 / Pseudo-Mercator\"")

@echo off
rem on-windows [BIN]: runs the Windows test programs in BIN (build\windows\bin) on Windows itself, one after the other, in
rem a console with administrator's rights. The exit status is 1 when one fails or is missing.
rem
rem Bring the whole checkout with its build. The programs know their sources by a path of the building system, as Wine
rem shows it on drive Z:, so this script makes that drive where there is none. They change this computer's registry,
rem ProgramData and Program Files, and clean up after themselves: use a computer that may break.
setlocal EnableExtensions EnableDelayedExpansion
set BIN=%~1
if "%BIN%"=="" set BIN=build\windows\bin
if not exist "%BIN%\tests.txt" (
    echo on-windows: there is no %BIN%\tests.txt: build the preset windows and bring its folder bin 1>&2
    exit /b 2
)
set SOURCES=
for /f "usebackq delims=" %%L in ("%BIN%\tests.txt") do if not defined SOURCES set SOURCES=%%L
call :map_sources
if errorlevel 1 exit /b 2

set /a PASSED=0
set /a FAILED=0
for /f "usebackq skip=1 delims=" %%T in ("%BIN%\tests.txt") do call :run %%T
echo Not run: tests that are scripts of the building system (parity, shipping, wine_run^).
echo %PASSED% passed, %FAILED% failed
if %FAILED% gtr 0 exit /b 1
exit /b 0

:run
if not exist "%BIN%\%1.exe" (
    echo MISSING %1
    set /a FAILED+=1
    exit /b
)
"%BIN%\%1.exe" --gtest_brief=1 >"%TEMP%\%1.log" 2>&1
if errorlevel 1 (
    echo FAILED  %1
    type "%TEMP%\%1.log"
    set /a FAILED+=1
) else (
    echo passed  %1
    set /a PASSED+=1
)
exit /b

rem Z: with the sources under the path that the programs know.
:map_sources
if exist "Z:%SOURCES%\tests\on-windows.cmd" exit /b 0
if exist Z:\ (
    echo on-windows: drive Z: is in use, and holds no %SOURCES% 1>&2
    exit /b 1
)
set MIRROR=%TEMP%\hv-drive-z
for %%P in ("%MIRROR%%SOURCES:/=\%") do (
    if not exist "%%~dpP" mkdir "%%~dpP"
    if not exist "%%~fP" mklink /J "%%~fP" "%~dp0.." >nul
)
subst Z: "%MIRROR%"
exit /b 0

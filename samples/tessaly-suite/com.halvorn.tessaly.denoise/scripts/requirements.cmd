echo Tessaly Denoise profiles need 5 MB in ProgramData

# Recordings, their store, the importers and the parameter files.
set(FPNAVI_STORE_SOURCES
        Error.cpp
        Files.cpp
        FngImport.cpp
        FngIndex.cpp
        GestureChecksum.cpp
        Keys.cpp
        ParamFile.cpp
        ParamTable.cpp
        RawImport.cpp
        Redact.cpp
        Sqlite.cpp
        StoreCheck.cpp
        StoreCreate.cpp
        StoreRead.cpp
        StoreSchema.cpp
        StoreWrite.cpp)
